#include "tools/qorvio/Number.h"

#include <charconv>

namespace qor::tool {

CLI::Validator wholeNumber(std::uint64_t least, std::uint64_t most) {
  const auto check = [least, most](const std::string& text) {
    std::uint64_t number = 0;
    const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    const bool isGood =
        error == std::errc() && rest == text.data() + text.size() && number >= least && number <= most;
    return isGood ? "" : "is " + std::to_string(least) + " to " + std::to_string(most) + ", not " + text;
  };
  CLI::Validator validator(check, "");
  return validator;
}

}  // namespace qor::tool
