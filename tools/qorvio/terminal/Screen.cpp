#include "tools/qorvio/terminal/Screen.h"

#include <algorithm>
#include <utility>

namespace qor::tool {
namespace {

std::size_t countOf(const Parts& parts) {
  std::size_t count = 0;
  for (const std::vector<std::string>* part : parts) count += part->size();
  return count;
}

std::vector<std::string> linesOf(const Parts& parts, std::size_t first, std::size_t count) {
  std::vector<std::string> lines;
  for (const std::vector<std::string>* part : parts) {
    for (std::size_t i = first; i < part->size() && lines.size() < count; ++i) lines.push_back((*part)[i]);
    first -= std::min(first, part->size());
  }
  return lines;
}

std::string notice(std::size_t above, std::size_t below) {
  return std::to_string(above + below) + " lines not shown, " + std::to_string(above) + " above and " +
         std::to_string(below) + " below: arrows, PgUp, PgDn scroll";
}

}  // namespace

std::string Screen::update(std::size_t rows, const Parts& body, std::vector<std::string> foot,
                           std::size_t pinned) {
  const std::size_t count = countOf(body);
  place(rows, count, foot.size());
  bringIntoWindow(std::exchange(revealed_, none));
  if (pinned < count && !isInWindow(pinned)) {
    foot.insert(foot.begin(), linesOf(body, pinned, 1).front());
    place(rows, count, foot.size());
  }
  if (window_ < count) foot.push_back(notice(top_, count - top_ - window_));
  std::vector<std::string> lines = linesOf(body, top_, window_);
  lines.insert(lines.end(), foot.begin(), foot.end());
  lines.resize(std::min(lines.size(), rows));

  std::string text;
  if (rows != rows_) {
    text = "\033[2J";
    shown_.clear();
    rows_ = rows;
  }
  shown_.resize(std::max(lines.size(), shown_.size()));
  lines.resize(shown_.size());
  for (std::size_t i = 0; i < lines.size(); ++i)
    // Erased first: after a line that fills the width, the cursor is still on its last character.
    if (lines[i] != shown_[i]) text += "\033[" + std::to_string(i + 1) + ";1H\033[K" + lines[i];
  shown_ = std::move(lines);
  return text;
}

// How much of the body is seen, with so many lines below it and one that says what is not.
void Screen::place(std::size_t rows, std::size_t count, std::size_t feet) {
  window_ = count;
  if (count + feet > rows) window_ = rows > feet + 2 ? rows - feet - 1 : 1;
  top_ = std::min(top_, count - std::min(count, window_));
}

void Screen::bringIntoWindow(std::size_t line) {
  if (line == none) return;
  if (line < top_) top_ = line;
  if (line >= top_ + window_) top_ = line - window_ + 1;
}

void Screen::scroll(std::ptrdiff_t lines) {
  const auto up = static_cast<std::size_t>(std::max<std::ptrdiff_t>(0, -lines));
  top_ += static_cast<std::size_t>(std::max<std::ptrdiff_t>(0, lines));
  top_ -= std::min(top_, up);
}

}  // namespace qor::tool
