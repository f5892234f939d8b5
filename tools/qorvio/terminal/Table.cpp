#include "tools/qorvio/terminal/Table.h"

#include <algorithm>
#include <cstdlib>
#include "os/StandardStreams.h"

namespace qor::tool {
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

void Table::add(std::vector<std::string> row) {
  rows_.emplace_back();
  lines_.emplace_back();
  set(rows_.size() - 1, std::move(row));
}

void Table::set(std::size_t index, std::vector<std::string> row) {
  widths_.resize(std::max(widths_.size(), row.size()));
  for (std::size_t i = 0; i < row.size(); ++i) {
    const std::size_t width = columns(row[i]);
    hasGrown_ = hasGrown_ || width > widths_[i];
    widths_[i] = std::max(widths_[i], width);
  }
  rows_[index] = std::move(row);
  stale_.push_back(index);
}

const std::vector<std::string>& Table::lines() {
  if (hasGrown_) {
    for (std::size_t i = 0; i < rows_.size(); ++i) lines_[i] = laidOut(rows_[i]);
  } else {
    for (std::size_t i : stale_) lines_[i] = laidOut(rows_[i]);
  }
  stale_.clear();
  hasGrown_ = false;
  return lines_;
}

std::string Table::text() {
  std::string text;
  for (const std::string& line : lines()) text += line + '\n';
  return text;
}

std::string Table::laidOut(const std::vector<std::string>& row) const {
  std::string line;
  for (std::size_t i = 0; i < row.size(); ++i) {
    line += row[i];
    line.append(widths_[i] - columns(row[i]) + 2, ' ');
  }
  line.erase(line.find_last_not_of(' ') + 1);
  return line;
}

std::string inked(Ink ink, const std::string& text) {
  static const bool coloured = os::isTerminal(os::Stream::output) && std::getenv("NO_COLOR") == nullptr;
  return coloured && ink != Ink::plain ? escapeOf(ink) + text + "\033[0m" : text;
}

}  // namespace qor::tool
