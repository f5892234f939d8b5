#include "tools/qorvio/terminal/Table.h"

#include <algorithm>
#include <cstdlib>
#include <numeric>

#include "os/StandardStreams.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

constexpr std::size_t gap = 2, narrowest = 7;

const char* escapeOf(Color color) {
  switch (color) {
    case Color::dim:
      return "\033[2m";
    case Color::green:
      return "\033[32m";
    case Color::red:
      return "\033[31m";
    case Color::yellow:
      return "\033[33m";
    case Color::bold:
      return "\033[1m";
    case Color::plain:
      break;
  }
  return "";
}

std::size_t total(const std::vector<std::size_t>& widths) {
  return std::accumulate(widths.begin(), widths.end(), gap * (widths.size() - 1));
}

}  // namespace

std::string colored(Color color, const std::string& text) {
  static const bool isWanted = os::isTerminal(os::Stream::output) && std::getenv("NO_COLOR") == nullptr;
  return isWanted && color != Color::plain ? escapeOf(color) + text + "\033[0m" : text;
}

void Table::add(std::vector<Cell> row) {
  rows_.emplace_back();
  lines_.emplace_back();
  set(rows_.size() - 1, std::move(row));
}

void Table::set(std::size_t index, std::vector<Cell> row) {
  widths_.resize(std::max(widths_.size(), row.size()));
  for (std::size_t i = 0; i < row.size(); ++i) {
    row[i].text = printable(row[i].text);
    const std::size_t width = columnsOf(row[i].text);
    isRefit_ = isRefit_ || width > widths_[i];
    widths_[i] = std::max(widths_[i], width);
  }
  rows_[index] = std::move(row);
  stale_.push_back(index);
}

const std::vector<std::string>& Table::lines(std::size_t width) {
  if (isRefit_ || width != width_) {
    fit(width);
    for (std::size_t i = 0; i < rows_.size(); ++i) lines_[i] = laidOut(rows_[i]);
  } else {
    for (std::size_t i : stale_) lines_[i] = laidOut(rows_[i]);
  }
  stale_.clear();
  return lines_;
}

// Takes from the widest column until all fit, or until none can give more; then from the right whole columns.
void Table::fit(std::size_t width) {
  fitted_ = widths_;
  while (!fitted_.empty() && total(fitted_) > width) {
    const auto widest = std::max_element(fitted_.begin(), fitted_.end());
    const std::size_t excess = total(fitted_) - width;
    if (*widest > narrowest) {
      *widest = std::max(narrowest, *widest - std::min(excess, *widest));
    } else {
      fitted_.pop_back();
    }
  }
  width_ = width;
  isRefit_ = false;
}

std::string Table::text() {
  std::string text;
  for (const std::string& line : lines()) text += line + '\n';
  return text;
}

std::string Table::laidOut(const std::vector<Cell>& row) const {
  std::string line;
  std::size_t pending = 0;  // blanks, if anything follows
  for (std::size_t i = 0; i < std::min(row.size(), fitted_.size()); ++i) {
    const std::string text = shortened(row[i].text, fitted_[i]);
    if (!text.empty()) line.append(std::exchange(pending, 0), ' ') += colored(row[i].color, text);
    pending += fitted_[i] - columnsOf(text) + gap;
  }
  return line;
}

}  // namespace qor::tool
