// What the fuzz targets share. Each is one function over any bytes that checks properties of the library.
#pragma once

#include <exception>
#include <string>
#include <string_view>
#include <vector>

/// The target of this program.
void fuzz(std::string_view input);

/// Prints `what` and aborts, unless the condition is true.
void require(bool condition, const std::string& what);

/// The text, in which a line "~N TEXT" is N times TEXT, without an end of line: for large inputs, of 256 kB at most.
std::string grown(std::string_view text);

std::vector<std::string> split(std::string_view text, char separator);

/// What the call throws, or an empty text.
template <typename Call>
std::string thrownBy(Call call) {
  try {
    call();
  } catch (const std::exception& e) {
    return e.what();
  }
  return "";
}
