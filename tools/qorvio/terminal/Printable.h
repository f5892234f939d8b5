// Text of files, servers and boards, made harmless for a terminal.
#pragma once

#include <string>
#include <string_view>

namespace qor::tool {

/// The text with control characters, and bytes that are not UTF-8, written as \x1B and so on. Line ends and tabs stay.
std::string printable(std::string_view text);

/// "1 core", "2 cores".
std::string counted(std::size_t count, const std::string& what);

/// How many columns a terminal gives to printable text: two for a wide character, none for one that combines.
std::size_t columnsOf(std::string_view text);

/// At most so many columns of printable text. What is too long is cut in its middle, where a … is put;
/// …≠0… in hexadecimal or binary digits of which no other than 0 would be left to see.
std::string shortened(const std::string& text, std::size_t columns);

}  // namespace qor::tool
