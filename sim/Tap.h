// The registers of one device on the chain: captured, shifted bit by bit, and updated.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "sim/ShiftRegister.h"
#include "sim/UserRegister.h"

namespace qorsim {

/// What TAPs differ in beside IDCODE and the length of the IR.
struct TapOptions {
  std::vector<std::uint32_t> userOpcodes{2, 3, 4,
                                         5};  ///< of USER1 and so on; those that there are not are left out
  Lateness lateness{};
};

/// Instructions: those of the user registers; then 1 selects IDCODE; and all ones, like any other, BYPASS. A new TAP
/// has IDCODE selected, or BYPASS when it has none.
class Tap {
 public:
  static constexpr unsigned userChainCount = 4;
  static constexpr unsigned shortestIr = 4;  // bits: room for six instructions
  static constexpr unsigned longestIr = 32;

  /// `idcode` is 0 for a device without one.
  Tap(std::uint32_t idcode, unsigned irLength, TapOptions options = {});

  /// The instruction that selects a user register, or that of BYPASS when it has no such register.
  std::uint32_t userOpcode(unsigned userChain) const;

  /// The hub of a user chain, which appears when it is first asked for. A user register without a hub
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
  std::size_t selectedUserRegister() const;
  ShiftRegister captured() const;

  std::uint32_t idcode_;
  unsigned irLength_;
  TapOptions options_;
  std::optional<std::uint32_t> instruction_;  // none since the last reset
  std::array<std::unique_ptr<UserRegister>, userChainCount> userRegisters_;

  // What the last capture has put between TDI and TDO: a user register, or when that is null the other.
  UserRegister* selected_ = nullptr;
  ShiftRegister register_{{}};
};

}  // namespace qorsim
