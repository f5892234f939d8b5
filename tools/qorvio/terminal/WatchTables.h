// The two tables of watch: inputs that change by themselves, outputs that keys drive.
#pragma once

#include <string>
#include <vector>

#include "board/Board.h"
#include "tools/qorvio/InputWatch.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {

class InputTable {
 public:
  explicit InputTable(const InputWatch& watch);

  /// To be called once a frame: keeps what each input was, for the last column.
  void keep(const InputWatch& watch);

  /// Whether the last column shows the latest frames, the newest at its end: a level from ▁ (all bits 0) to █ each.
  /// @{
  bool showsHistory() const { return showsHistory_; }
  void showHistory(bool isShown);
  /// @}

  /// Formats the rows of the inputs that changed, which it takes; with the history, all.
  const std::vector<std::string>& lines(InputWatch& watch, std::size_t width);

 private:
  void format(const InputWatch& watch, std::size_t i);

  std::size_t inputs_;
  Table table_;
  std::vector<std::string> levels_;  // a digit a frame, 0 to 7
  bool showsHistory_ = false, isOtherwise_ = false;
};

/// Outputs with the values that they were last given, one row chosen: a row each, and one for each bit of those that are
/// not too wide.
class OutputTable {
 public:
  /// The board must outlive it.
  explicit OutputTable(Board& board);

  const std::vector<std::string>& lines(std::size_t width) { return table_.lines(width); }

  /// Chooses the next one, or the one before; the first and last ones stay.
  void chooseNext() { choose(chosen_ + 1); }
  void chooseBefore() { choose(chosen_ - 1); }

  /// Chooses the one of that name, if there is one.
  void choose(const std::string& name);

  /// Its name; empty when there are no outputs.
  std::string chosen() const { return outputs_.empty() ? "" : outputs_[chosen_].name; }

  /// In which of the lines the chosen one is.
  std::size_t chosenLine() const { return chosen_ + 1; }

  /// Writes to the chosen one. Throws Failure, or WrongUse where it cannot be done.
  /// @{
  void toggleChosen();
  void pulseChosen();
  /// A value as write takes it, or several with commas between, a pulse train.
  void giveChosen(const std::string& text);
  /// @}

 private:
  static constexpr unsigned widestWithBits = 32;

  void addRows(const SignalTable& signals, const Signal& output);
  void choose(std::size_t index);
  void format(std::size_t index);
  void write(const Assignment& assignment);

  Board& board_;
  std::vector<Signal> outputs_;
  std::size_t chosen_ = 0;
  Table table_;
};

}  // namespace qor::tool
