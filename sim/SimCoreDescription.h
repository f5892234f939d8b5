/// @file
/// What a simulated core is, in the words of its status word.
#pragma once

#include <memory>
#include <optional>

#include "SimDesign.h"

namespace qorsim {

/// The cg version, which status words contain from core version 10.0 on.
struct CgVersion {
  unsigned major;       ///< 4 bits
  unsigned minor;       ///< 8 bits
  unsigned minorAlpha;  ///< 8 bits
};

/// One core, with the values that it has when nothing else is said.
struct CoreDescription {
  /// The type of VIO cores.
  static constexpr unsigned vioType = 9;

  /// The head of the status word.
  /// @{
  unsigned type = vioType;
  unsigned manufacturer = 0x51;
  unsigned major = 10;
  unsigned minor = 0;
  unsigned revision = 0;
  std::optional<CgVersion> cg;  ///< 1.0.0 when there is none
  /// @}

  /// Port widths in bits, and the design, which is idle() when there is none: of a VIO core only.
  /// @{
  unsigned asyncIn = 0;
  unsigned syncIn = 0;
  unsigned asyncOut = 0;
  unsigned syncOut = 0;
  std::shared_ptr<Design> design;
  /// @}

  /// Whether it is a VIO core.
  bool isVio() const { return type == vioType; }
};

}  // namespace qorsim
