/// @file
/// The wires of a JTAG connector, as somebody who moves each of them by hand sees them.
#pragma once

#include "Qor_Cable.h"

namespace qorsim {

/// A board at the end of its wires, used by one thread at a time.
class QOR_API Pins {
 public:
  Pins() = default;
  Pins(const Pins&) = delete;
  Pins& operator=(const Pins&) = delete;
  virtual ~Pins();

  /// Sets the three inputs. The board looks at TMS and TDI when TCK rises.
  virtual void write(bool tck, bool tms, bool tdi) = 0;

  /// TDO, which changes when TCK falls.
  virtual bool tdo() = 0;

  /// TRST: as long as it is asserted, the board's TAPs stay in Test-Logic-Reset.
  virtual void setTrst(bool asserted) = 0;

  /// A light that clients may have on while they run their queue. Boards without one ignore it.
  virtual void setLight(bool /*on*/) {}
};

}  // namespace qorsim
