// What the fuzz targets share. Each is one function over any bytes that compares the library with a slow and
// obvious model of what it promises.
#pragma once

#include <string>
#include <string_view>
#include <vector>

/// The target of this program.
void fuzz(std::string_view input);

/// Prints `what` and aborts, unless it holds.
void require(bool holds, const std::string& what);
void requireEqual(const std::string& seen, const std::string& wanted);

std::vector<std::string> split(std::string_view text, char separator);

/// The value of a hexadecimal digit, or -1.
int digitValue(char c);

/// At least `count` digits, upper case.
std::string hexText(unsigned value, int count);

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
