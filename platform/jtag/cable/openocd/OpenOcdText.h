// The texts that an OpenOCD server's Tcl port takes and gives.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "QorExport.h"
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
QOR_API std::vector<OpenOcdTap> tapsIn(const std::string& table);

/// Throws runtime_error when a TAP answers with an unexpected IDCODE or is not of the configuration, or when the board
/// file names another TAP at its place.
QOR_API void requireTaps(const std::vector<OpenOcdTap>& taps, const std::vector<DeviceEntry>& board);

/// Appends the commands of one step; what its scan returns is appended to the variable `r` if it captures.
QOR_API void appendStep(std::string& commands, const std::vector<OpenOcdTap>& taps,
                        const std::vector<WireDevice>& devices, const Qor_Scan& scan);

/// Silences the server's log, which would hold every answer, and gives it back the level that it had. Clients may
/// do both in any order: the last one to speak leaves it loud.
/// @{
QOR_API std::string silenceCommand();
QOR_API std::string loudCommand();
/// @}

/// Puts commands of appendStep() into a procedure that silences the log and answers "ok" and every capture, or
/// what failed.
QOR_API std::string procedureOf(const std::string& name, const std::string& commands);

/// The captures in the answer of such a procedure, taken in order. Throws runtime_error for whatever is no such answer.
class QOR_API CaptureReader {
 public:
  explicit CaptureReader(std::string answer);

  /// The next `bitCount` bits, in fields as appendStep() asks for them.
  std::vector<unsigned char> next(std::size_t bitCount);

  /// Throws when there is more.
  void finish();

 private:
  std::string_view word();

  std::string answer_;
  std::size_t place_ = 0;
};

}  // namespace QorRT
