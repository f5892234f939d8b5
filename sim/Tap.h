// The registers of one device on the chain: captured, shifted bit by bit, and updated.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <memory>

#include "sim/ShiftRegister.h"
#include "sim/UserRegister.h"

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
  Tap(std::uint32_t idcode, unsigned irLength, Lateness lateness = {});

  /// The hub behind a user chain, which appears when it is first asked for. A user register without a hub
  /// delivers zeros.
  Hub& hub(unsigned userChain);

  /// Test-Logic-Reset: the instruction of a new TAP.
  void reset();

  /// A TCK in each of these states.
  /// @{
  void captureIr();
  void captureDr();
  void shift(bool in);
  void updateIr();
  /// @}

  /// A whole scan in Shift-DR or Shift-IR from capture on: replaces what TDI brings by what goes out of TDO, and
  /// calls `passTck` after each TCK that leaves time to the design clock.
  void shift(Bits& stream, const std::function<void()>& passTck);

  /// A TCK in any other state.
  void settle();

  /// The bit at TDO.
  bool out() const { return selected_ != nullptr ? selected_->out() : register_.out(); }

  /// Whether a hub is between TDI and TDO.
  bool isSelected() const { return selected_ != nullptr; }

  /// Whether the selected hub leaves time to the design clock in the next TCK of Shift-DR.
  bool leavesTime() const { return selected_ != nullptr && selected_->hub.leavesTime(); }

  /// One design clock of every core.
  void clock();

 private:
  bool isUserOpcode() const;
  ShiftRegister captured() const;

  std::uint32_t idcode_;
  unsigned irLength_;
  Lateness lateness_;
  std::uint32_t instruction_ = 0;
  std::array<std::unique_ptr<UserRegister>, userChainCount> userRegisters_;

  // What the last capture has put between TDI and TDO: a user register, or when that is null the other.
  UserRegister* selected_ = nullptr;
  ShiftRegister register_{{}};
};

}  // namespace qorsim
