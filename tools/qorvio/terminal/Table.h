// Aligned columns for people, and colour where a terminal shows it.
#pragma once

#include <string>
#include <vector>

namespace qor::tool {

/// Rows of cells; the first is the head. Columns are as wide as their widest cell so far, two blanks between, no blanks
/// at the end of a line. Cells may hold UTF-8.
class Table {
 public:
  explicit Table(std::vector<std::string> head) { add(std::move(head)); }
  void add(std::vector<std::string> row);

  /// Puts a row in the place of another; the head is row 0.
  void set(std::size_t index, std::vector<std::string> row);

  /// A line for each row. Lays out the rows that were set since the call before, and all when a column has grown.
  const std::vector<std::string>& lines();

  /// The lines, each with its end.
  std::string text();

 private:
  std::string laidOut(const std::vector<std::string>& row) const;

  std::vector<std::vector<std::string>> rows_;
  std::vector<std::size_t> widths_;
  std::vector<std::string> lines_;
  std::vector<std::size_t> stale_;
  bool hasGrown_ = false;
};

/// How many columns a terminal gives the text: one a UTF-8 character, none for an escape sequence.
std::size_t columns(const std::string& text);

enum class Ink { plain, dim, green, red, yellow, bold };

/// The text in that colour when stdout is a terminal and NO_COLOR is not set, else as it is.
std::string inked(Ink ink, const std::string& text);

}  // namespace qor::tool
