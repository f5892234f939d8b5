// Failures that several members of a core and its groups share.
#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace QorRT {

inline std::logic_error unknownName(std::string_view name) {
  return std::logic_error("Could not find a signal with the name: " + std::string(name));
}

inline std::logic_error tooSmall(std::string_view name) {
  return std::logic_error("The size of the value is not large enough for the signal: " + std::string(name));
}

inline void requireNames(const std::vector<std::string>& names, unsigned count) {
  if (names.size() < count) throw std::logic_error("The list of names is shorter than the count.");
}

}  // namespace QorRT
