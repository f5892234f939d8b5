#include "Table.h"

#include <unistd.h>
#include <algorithm>
#include <cstdlib>

namespace tool {
namespace {

bool isContinuation(char byte) {
  return (static_cast<unsigned char>(byte) & 0xC0) == 0x80;
}

const char* escapeOf(Ink ink) {
  switch (ink) {
    case Ink::dim:
      return "\033[2m";
    case Ink::green:
      return "\033[32m";
    case Ink::red:
      return "\033[31m";
    case Ink::yellow:
      return "\033[33m";
    case Ink::bold:
      return "\033[1m";
    case Ink::plain:
      break;
  }
  return "";
}

}  // namespace

std::size_t columns(const std::string& text) {
  std::size_t count = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] == '\033') {
      i = std::min(text.find('m', i), text.size());
    } else if (!isContinuation(text[i])) {
      ++count;
    }
  }
  return count;
}

std::string Table::text() const {
  std::vector<std::size_t> widths;
  for (const auto& row : rows_) {
    widths.resize(std::max(widths.size(), row.size()));
    for (std::size_t i = 0; i < row.size(); ++i) widths[i] = std::max(widths[i], columns(row[i]));
  }
  std::string text;
  for (const auto& row : rows_) {
    std::string line;
    for (std::size_t i = 0; i < row.size(); ++i)
      line += row[i] + std::string(widths[i] - columns(row[i]) + 2, ' ');
    line.erase(line.find_last_not_of(' ') + 1);
    text += line + '\n';
  }
  return text;
}

std::string inked(Ink ink, const std::string& text) {
  static const bool coloured = isatty(STDOUT_FILENO) != 0 && std::getenv("NO_COLOR") == nullptr;
  return coloured && ink != Ink::plain ? escapeOf(ink) + text + "\033[0m" : text;
}

}  // namespace tool
