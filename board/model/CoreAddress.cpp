#include "board/model/CoreAddress.h"

#include <array>
#include <charconv>

#include "board/model/Errors.h"

namespace qor {

std::string refText(QOR_CORE_REF ref) {
  return std::to_string(ref.device_index) + "." + std::to_string(ref.user_chain_number) + "." +
         std::to_string(ref.core_index);
}

QOR_CORE_REF parseRef(const std::string& text) {
  std::array<unsigned, 3> parts{};
  const char* next = text.data();
  const char* const end = next + text.size();
  bool good = true;
  for (std::size_t i = 0; i < parts.size(); ++i) {
    if (i != 0) good = good && next != end && *next++ == '.';
    const auto [rest, error] = std::from_chars(next, end, parts[i]);
    good = good && error == std::errc();
    next = rest;
  }
  if (!good || next != end) throw WrongUse("not a core address DEVICE.CHAIN.INDEX: " + text);
  return {parts[0], parts[1], parts[2]};
}

}  // namespace qor
