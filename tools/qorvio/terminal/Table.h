// Aligned columns for people, and colour where a terminal shows it.
#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

namespace qor::tool {

enum class Color { plain, dim, green, red, yellow, bold };

/// The text in that colour when stdout is a terminal and NO_COLOR is not set, else as it is.
std::string colored(Color color, const std::string& text);

struct Cell {
  Cell(std::string its, Color in = Color::plain) : text(std::move(its)), color(in) {}
  Cell(const char* its) : text(its) {}

  std::string text;
  Color color = Color::plain;
};

/// Rows of cells; the first is the head. Columns are as wide as their widest cell so far, two blanks between, no blanks
/// at the end of a line. What a terminal would take for commands is shown as it is written.
class Table {
 public:
  explicit Table(std::vector<Cell> head) { add(std::move(head)); }
  void add(std::vector<Cell> row);

  /// Puts a row in the place of another; the head is row 0.
  void set(std::size_t index, std::vector<Cell> row);

  /// A line for each row, at most so wide: the widest columns are cut in the middle of their cells, and columns for which
  /// there is no room at all are left out. Lays out the rows that were set since the call before, and all when a column or
  /// the width has changed.
  const std::vector<std::string>& lines(std::size_t width = unlimited);

  /// The lines, each with its end.
  std::string text();

 private:
  static constexpr std::size_t unlimited = static_cast<std::size_t>(-1);

  void fit(std::size_t width);
  std::string laidOut(const std::vector<Cell>& row) const;

  std::vector<std::vector<Cell>> rows_;
  std::vector<std::size_t> widths_;
  std::vector<std::size_t> fitted_;  // the widths with which the lines are laid out
  std::vector<std::string> lines_;
  std::vector<std::size_t> stale_;
  std::size_t width_ = unlimited;
  bool isRefit_ = false;
};

}  // namespace qor::tool
