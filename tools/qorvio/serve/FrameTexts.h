// Inputs and outputs as frames have them: what changed, or all of them. Made once for all clients that are in step.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "board/Board.h"
#include "tools/qorvio/serve/Claims.h"

namespace qor::tool {

/// The signals that clients see, in the order of their numbers: those of the file, and of a direction in which the file
/// has none the whole ports.
std::vector<Signal> servedSignals(const SignalTable& table);

class InputTexts {
 public:
  explicit InputTexts(const std::vector<Signal>& signals);

  /// The members of `c` for a delta: inputs whose value is not that of the call before, or that moved.
  std::string changed(const std::vector<Sample>& samples);

  /// For a snapshot.
  std::string all(const std::vector<Sample>& samples) const;

 private:
  struct Input {
    std::size_t number;
    Signal signal;
    Bytes value;  // as `changed` saw it last
  };

  std::vector<Input> inputs_;
  Bytes value_;  // whose memory is used again
};

class OutputTexts {
 public:
  OutputTexts(const std::vector<Signal>& signals, const Board& board, const Claims& claims);

  /// The members of `o` for a delta: what differs from the call before.
  std::string changed();

  /// For a snapshot, as of that call.
  std::string all() const;

 private:
  struct Output {
    std::size_t number;
    Signal signal;
    std::string text;
  };

  std::string textOf(const Output& output) const;

  const Board& board_;
  const Claims& claims_;
  std::vector<Output> outputs_;
};

}  // namespace qor::tool
