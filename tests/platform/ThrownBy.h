#pragma once

#include <stdexcept>
#include <string>

/// What the call returns or throws: "logic: TEXT" for a logic_error, "runtime: TEXT" for a runtime_error.
template <typename Call>
std::string resultOf(Call call) {
  try {
    return call();
  } catch (const std::logic_error& e) {
    return std::string("logic: ") + e.what();
  } catch (const std::runtime_error& e) {
    return std::string("runtime: ") + e.what();
  }
}

/// What the call throws, or "nothing".
template <typename Call>
std::string thrownBy(Call call) {
  return resultOf([&] {
    call();
    return std::string("nothing");
  });
}
