// One VIO core that has been set up: whole reads without allocation, writes by signal in one exchange.
#pragma once

#include <string>
#include <vector>

#include "board/model/Signal.h"
#include "board/model/Value.h"
#include "board/session/Link.h"
#include "board/session/OutputMemory.h"

namespace qor {

/// Images of both input ports and of their activity flags since the read before.
struct Sample {
  Bytes asyncIn, asyncUp, asyncDown;
  Bytes syncIn, syncUp, syncDown, syncSyncUp, syncSyncDown;

  const Bytes& values(Port port) const { return port == Port::asyncIn ? asyncIn : syncIn; }
  const Bytes& up(Port port) const { return port == Port::asyncIn ? asyncUp : syncUp; }
  const Bytes& down(Port port) const { return port == Port::asyncIn ? asyncDown : syncDown; }
};

/// A value for an output: of its width, or for a pulse train 16 values, step 0 first.
struct Assignment {
  Signal signal;
  std::vector<Bytes> steps;  ///< one, or 16 for a pulse train
};

class CoreSession {
 public:
  /// Sets the core up. `memory` names what to remember of its outputs; empty to remember nothing.
  CoreSession(Link& link, QOR_CORE_REF ref, const std::string& memory);

  QOR_CORE_REF ref() const { return ref_; }
  const QORVIO_CORE_INFO& info() const { return info_; }
  Link& link() { return link_; }

  /// A sample with room for the core's ports.
  Sample emptySample() const;

  /// Reads all inputs in one exchange. Allocates nothing. Throws Failure, with `sample` as it was.
  void read(Sample& sample);

  /// Writes all of them in one exchange, later ones winning where they overlap. Throws Failure.
  void write(const std::vector<Assignment>& assignments);

  /// The value that an output signal was last given, as far as this tool knows; 0 bits where it does not.
  Bytes lastWritten(const Signal& signal) const;

  /// Keeps what the outputs were given now, not only at the end: for commands that are at work for long.
  void rememberOutputs() { memory_.save(); }

 private:
  Link& link_;
  QOR_CORE_REF ref_;
  QORVIO_CORE_INFO info_{};
  OutputMemory memory_;
};

/// 1 for one step, 0 otherwise: `width` steps from step `at` on. Throws WrongUse when they do not fit 16 steps with a
/// last step of 0, or when the signal is not one synchronous output bit.
Assignment pulse(const Signal& signal, unsigned at, unsigned width);
/// The opposite of what the one-bit output was last given.
Assignment toggle(const CoreSession& core, const Signal& signal);
/// One value.
Assignment level(const Signal& signal, Bytes value);

}  // namespace qor
