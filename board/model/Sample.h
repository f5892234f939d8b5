/// @file
/// The inputs of one core, as one read delivers them.
#pragma once

#include "QorVIO_Records.h"
#include "board/Export.h"
#include "board/model/Bits.h"
#include "board/model/Signal.h"

namespace qor {

/// Images of both input ports and of their activity flags.
struct Sample {
  Bytes asyncIn, asyncUp, asyncDown;
  Bytes syncIn, syncUp, syncDown, syncSyncUp, syncSyncDown;

  const Bytes& values(Port port) const { return port == Port::asyncIn ? asyncIn : syncIn; }
  const Bytes& up(Port port) const { return port == Port::asyncIn ? asyncUp : syncUp; }
  const Bytes& down(Port port) const { return port == Port::asyncIn ? asyncDown : syncDown; }
};

/// One with room for the core's ports, all zero.
QORBOARD_API Sample emptySample(const QORVIO_CORE_INFO& info);

/// Whether any of the signal's bits is set in an image of its port.
QORBOARD_API bool anyOf(const Signal& signal, const Bytes& portImage);

/// Whether any bit of a signal rose or fell.
struct Activity {
  bool up = false, down = false;
  bool syncUp = false, syncDown = false;  ///< as the design's clock saw it; synchronous inputs only
};

/// Adds the flags of another sample of the same core.
QORBOARD_API void addActivity(Sample& sample, const Sample& more);

/// Clears all flags, or those of one signal.
/// @{
QORBOARD_API void forgetActivity(Sample& sample);
QORBOARD_API void forgetActivity(Sample& sample, const Signal& signal);
/// @}

QORBOARD_API Activity activityOf(const Signal& signal, const Sample& sample);

/// The signal's value, out of an image of its port, into `value`, whose memory is used again.
QORBOARD_API void extract(const Signal& signal, const Bytes& portImage, Bytes& value);

/// The low 64 bits of the signal's value, without any memory.
QORBOARD_API std::uint64_t lowBits(const Signal& signal, const Bytes& portImage);

}  // namespace qor
