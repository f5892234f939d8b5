// The registers of one device on the chain: captured, shifted bit by bit or as a whole scan, and updated.
#pragma once

#include <array>
#include <cstdint>
#include <memory>

#include "sim/Hub.h"
#include "sim/ShiftRegister.h"

namespace qorsim {

/// Instructions: 1 selects IDCODE, n + 1 selects USERn (n = 1 to 4), and all ones, like any other, BYPASS. A
/// new TAP has IDCODE selected, or BYPASS when it has none.
class Tap {
 public:
  static constexpr unsigned userChainCount = 4;
  static constexpr unsigned shortestIr = 4;  // bits: room for six instructions
  static constexpr unsigned longestIr = 32;

  static constexpr std::uint32_t userOpcode(unsigned userChain) { return userChain + 1; }

  /// `idcode` is 0 for a device without one.
  Tap(std::uint32_t idcode, unsigned irLength);

  /// The hub behind a user chain, which appears when it is first asked for.
  Hub& hub(unsigned userChain);

  /// Test-Logic-Reset: the instruction of a new TAP.
  void reset();

  /// Capture, and update after it. In between, each shift is a TCK that moves the register on by one bit, out()
  /// the one that then stands at TDO.
  /// @{
  void captureIr();
  void captureDr();
  bool out() const { return register_.out(); }
  void shift(bool in) { register_.shift(in); }
  void updateIr();
  void updateDr();
  /// @}

  /// Whole scans from capture to update: replace what TDI brings by what goes out of TDO, as many bits.
  void scanIr(Bits& stream);
  void scanDr(Bits& stream);

  /// One design clock of every core.
  void clock();

 private:
  bool userSelected() const;
  Hub* selectedHub() const;

  std::uint32_t idcode_;
  unsigned irLength_;
  std::uint32_t instruction_ = 0;
  std::array<std::unique_ptr<Hub>, userChainCount> hubs_;
  ShiftRegister register_ = ShiftRegister::passing({0});
};

}  // namespace qorsim
