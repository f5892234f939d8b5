// The texts that an OpenOCD server's Tcl port takes and gives.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Qor_Cable.h"
#include "platform/jtag/cable/wire/WireDevice.h"

namespace QorRT {

/// An IDCODE that the server's configuration names; bits that the mask leaves out may be anything.
struct ExpectedIdcode {
  unsigned idcode = 0;
  unsigned mask = 0;
};

/// One TAP of the server's chain.
struct OpenOcdTap {
  std::string name;
  unsigned idcode = 0;                   ///< as the server read it when it started; 0 for none
  std::vector<ExpectedIdcode> expected;  ///< one of them will do
  unsigned irLength = 0;                 ///< bits
};

/// The enabled TAPs in the server's table of its scan chain, the one nearest to TDO first. Throws runtime_error
/// for a table that is none.
std::vector<OpenOcdTap> tapsIn(const std::string& table);

/// Throws runtime_error when a TAP answers with an unexpected IDCODE or is not of the configuration, or when the board
/// file names another TAP at its place.
void requireTaps(const std::vector<OpenOcdTap>& taps, const std::vector<DeviceEntry>& board);

/// The command of one step, whose result is what it captures.
std::string stepCommand(const std::vector<OpenOcdTap>& taps, const std::vector<WireDevice>& devices,
                        const Qor_Scan& scan);

/// Silence the server's log, which would get every answer, and give it back the level that it had. Clients may do both
/// in any order: the last one restores the level.
/// @{
std::string muteLog();
std::string restoreLogLevel();
/// @}

struct OpenOcdStep {
  std::string command;
  std::size_t capturedBits;  ///< 0 when its result does not matter
};

/// Steps as one script. Its result is what they capture, after "ok" if more than the last step counts.
std::string batchOf(const std::vector<OpenOcdStep>& steps);

/// The bytes of its longest result, or of what is said of an error.
std::size_t mostAnswer(const std::vector<OpenOcdStep>& steps);

/// The captures in the result of a batch, taken in order. Throws runtime_error for whatever is no such result.
class CaptureReader {
 public:
  explicit CaptureReader(std::string answer);

  /// The next `bitCount` bits, in fields as stepCommand() asks for them.
  std::vector<unsigned char> next(std::size_t bitCount);

  /// Throws when there is more.
  void finish();

 private:
  std::string_view word();

  std::string answer_;
  std::size_t place_ = 0;
};

}  // namespace QorRT
