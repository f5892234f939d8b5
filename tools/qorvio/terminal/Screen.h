// What is on a screen, and what to write for something else to be there.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace qor::tool {

/// Lines of text one part after another. The parts must outlive it.
using Parts = std::vector<const std::vector<std::string>*>;

/// A body of any number of lines, seen through a window that can be scrolled, and a foot that is always seen.
class Screen {
 public:
  static constexpr std::size_t none = static_cast<std::size_t>(-1);

  /// What to write to a terminal with so many rows: the lines that differ from those that are there, each addressed by
  /// its row, and everything when the number of rows has changed. When the body has more lines than there is room for,
  /// a last line says how many are not shown. The pinned line of the body is always seen: when it is outside the window, above
  /// the foot.
  std::string update(std::size_t rows, const Parts& body, std::vector<std::string> foot,
                     std::size_t pinned = none);

  /// From the next update on the window is so many lines or windows further down, as far as the body goes.
  /// @{
  void scroll(std::ptrdiff_t lines);
  void scrollPages(std::ptrdiff_t pages) { scroll(pages * static_cast<std::ptrdiff_t>(window_)); }
  /// @}

  /// From the next update on the line of the body is in the window.
  void reveal(std::size_t line) { revealed_ = line; }

  /// What is on the terminal is not known any more: the next update writes everything.
  void forget() { rows_ = 0; }

  /// The lines that are there.
  const std::vector<std::string>& shown() const { return shown_; }

 private:
  void place(std::size_t rows, std::size_t count, std::size_t feet);
  void bringIntoWindow(std::size_t line);
  bool isInWindow(std::size_t line) const { return line >= top_ && line - top_ < window_; }

  std::vector<std::string> shown_;
  std::size_t rows_ = 0;
  std::size_t top_ = 0;  // the first line in the window
  std::size_t revealed_ = none;
  std::size_t window_ = 1;  // how many lines of the body are seen
};

}  // namespace qor::tool
