// Aligned columns for people, and colour where a terminal shows it.
#pragma once

#include <string>
#include <vector>

namespace tool {

/// Rows of cells; the first is the head. Columns are as wide as their widest cell, two blanks between, no blanks at the
/// end of a line. Cells may hold UTF-8.
class Table {
 public:
  explicit Table(std::vector<std::string> head) { add(std::move(head)); }
  void add(std::vector<std::string> row) { rows_.push_back(std::move(row)); }
  std::string text() const;

 private:
  std::vector<std::vector<std::string>> rows_;
};

/// How many columns a terminal gives the text: one a UTF-8 character, none for an escape sequence.
std::size_t columns(const std::string& text);

enum class Ink { plain, dim, green, red, yellow, bold };

/// The text in that colour when stdout is a terminal and NO_COLOR is not set, else as it is.
std::string inked(Ink ink, const std::string& text);

}  // namespace tool
