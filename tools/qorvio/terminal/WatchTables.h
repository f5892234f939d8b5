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

  /// Formats the rows of the inputs that changed, which it takes.
  const std::vector<std::string>& lines(InputWatch& watch, std::size_t width);

 private:
  Table table_;
};

/// Outputs bit by bit, one of them chosen, with the values that they were last given.
class OutputTable {
 public:
  /// The board must outlive it.
  explicit OutputTable(Board& board);

  const std::vector<std::string>& lines(std::size_t width) { return table_.lines(width); }

  /// Chooses the next one, or the one before; the first and last ones stay.
  void chooseNext() { choose(chosen_ + 1); }
  void chooseBefore() { choose(chosen_ - 1); }

  /// In which of the lines the chosen one is.
  std::size_t chosenLine() const { return chosen_ + 1; }

  /// Writes to the chosen one. Throws Failure, or WrongUse where it plays no pulses.
  /// @{
  void toggleChosen();
  void pulseChosen();
  /// @}

 private:
  void addBits(const SignalTable& signals, const Signal& output);
  void choose(std::size_t index);
  void format(std::size_t index);
  void write(const Assignment& assignment);

  Board& board_;
  std::vector<Signal> outputs_;
  std::size_t chosen_ = 0;
  Table table_;
};

}  // namespace qor::tool
