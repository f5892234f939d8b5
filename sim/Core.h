// A core as its hub sees it.
#pragma once

#include <utility>

#include "sim/Bits.h"

namespace qorsim {

/// A command to a core. A host that repeats a command keeps its tag.
struct Command {
  unsigned code = 0;
  unsigned tag = 0;
};

/// What a core makes of a command.
enum class Reply {
  unknown,      ///< it has no such code
  refused,      ///< not now: nothing is done
  answered,     ///< there is nothing to begin
  begun,        ///< begin() is called
  takesPayload  ///< begin() is called if the payload arrives undamaged
};

/// A core of any type: it delivers its status word. Kinds of cores add codes of their own.
class Core {
 public:
  explicit Core(Bits statusWord) : statusWord_(std::move(statusWord)) {}
  virtual ~Core() = default;

  Core(const Core&) = delete;
  Core& operator=(const Core&) = delete;

  /// What comes of the command. Changes nothing.
  virtual Reply reply(const Command& command) const;

  /// How many bits a payload has.
  virtual std::size_t payloadBits() const { return 0; }

  /// Begins what reply() has agreed to.
  virtual void begin(const Command&, const Bits& /*payload*/) {}

  /// Whether the answer to this code waits for the design clock.
  virtual bool waits(unsigned /*code*/) const { return false; }

  /// Whether the answer to this code may report activity that an earlier one reported.
  virtual bool repeats(unsigned /*code*/) const { return false; }

  /// The data of an answer, least significant bit first.
  virtual Bits data(unsigned code) const;

  /// The last bit of an answer to this code has left.
  virtual void delivered(unsigned /*code*/) {}

  /// One design clock.
  virtual void clock() {}

 private:
  Bits statusWord_;
};

}  // namespace qorsim
