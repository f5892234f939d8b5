// What a command found out.
#pragma once

#include <nlohmann/json.hpp>
#include <string>

namespace qor::tool {

/// The same for people and for programs.
struct Report {
  std::string text;             ///< lines, each with its end, printable
  nlohmann::ordered_json json;  ///< texts may be of any bytes
};

/// Prints one of the two to standard output: the text, or JSON on as many lines as it is pleasant to read.
void print(const Report& report, bool asJson);

/// JSON on one line. Bytes that are not UTF-8 become U+FFFD.
std::string jsonLine(const nlohmann::ordered_json& json);

}  // namespace qor::tool
