#pragma once

#include <stdexcept>
#include <string>

/// What the call throws: "logic: TEXT" for a logic_error, "runtime: TEXT" for a runtime_error, else
/// "nothing".
template <typename Call>
std::string thrownBy(Call call) {
  try {
    call();
  } catch (const std::logic_error& e) {
    return std::string("logic: ") + e.what();
  } catch (const std::runtime_error& e) {
    return std::string("runtime: ") + e.what();
  }
  return "nothing";
}
