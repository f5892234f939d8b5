/// @file
/// A named, ordered list of bits of one port: a bus, or a single signal.
///
/// Conventions
///
///  1. Entry i of the positions is the port bit of bit i of the value; the width n is the number of entries.
///  2. A value is B = (n + 7) / 8 bytes; its bit i is bit (i mod 8) of byte i / 8. Bits above n - 1 are
///     ignored in values written and not set in values read. A sequence of values is consecutive blocks of B
///     bytes.
///  3. A group changes or reads its core's port image only. A write or read of the image transfers it.
///  4. Failures are logic_error, or bad_alloc where something is copied. They leave image and buffers as they
///     were.
#pragma once

#include <string>
#include <vector>

#include "QorCore.h"
#include "QorVIO_Export.h"

namespace QorRT {

class QorVIO_Command;

/// One named group of a core. Final, because it has no virtual destructor.
class QORVIO_API QorVIO_SignalGroup final : public Qor_SignalGroup {
 public:
  /// `command` is the port image of the core; the group does not own it, and it must live longer than the
  /// group. `type` is one of the four SIGNAL_TYPE_VIO constants. `positions` (in) are bits of its port.
  /// `keyName` is the name under which the core's table contains the group.
  QorVIO_SignalGroup(QorVIO_Command* command, unsigned int type, std::vector<unsigned int>& positions,
                     const std::string& name, const std::string& keyName);
  /// A copy uses the same port image as its source. If an assignment throws (bad_alloc), the target is as it
  /// was. A group that is in a table must not be assigned to.
  /// @{
  QorVIO_SignalGroup(const QorVIO_SignalGroup& other);
  QorVIO_SignalGroup& operator=(const QorVIO_SignalGroup& other);
  /// @}
  ~QorVIO_SignalGroup();

  /// The width in bits.
  unsigned int size() const;

  /// The name under which the core's table contains the group. Its characters stay where they are until the
  /// group is assigned to or destroyed.
  const std::string& getKeyName() const { return keyName; }

  /// The port image of the group's core.
  QorVIO_Command* getCommand() const { return command; }

  /// For groups of outputs. Stages `count` values (in, `size` bytes in all) and marks the group's bits for
  /// the next write. For a synchronous output up to 16 values are the steps of a pulse train, and the last
  /// value is repeated in the remaining steps; a single value (`count` 0 or 1) is used for all steps. For
  /// an asynchronous output the first value is used. Throws for a null `value` or too few bytes, before
  /// anything is staged. Allocates nothing.
  void setValues(const unsigned char* value, unsigned int size, unsigned int count);

  /// For groups of inputs. Adds (by OR) value and activity flags of the last read to the buffers (out, `size`
  /// bytes each, zero-filled by the caller). A null buffer is skipped. For an asynchronous input the two sync
  /// buffers are not changed. Throws if `size` is below B.
  void getValues(unsigned char* value, unsigned char* activityUp, unsigned char* activityDown,
                 unsigned char* syncActivityUp, unsigned char* syncActivityDown, unsigned int size) const;

  /// The type without the flag SIGNAL_TYPE_GROUP.
  unsigned int getPortType() const { return getType() & ~SIGNAL_TYPE_GROUP; }

  /// The bytes of one value, B.
  unsigned int byteCount() const { return size() / 8 + (size() % 8 != 0 ? 1 : 0); }

 private:
  void requireBytes(unsigned int size, unsigned long long needed) const;
  void stageSequence(const unsigned char* value, unsigned int count);
  void stageHeld(const unsigned char* value);
  void stageAsync(const unsigned char* value);

  std::string keyName;
  QorVIO_Command* command;
};

}  // namespace QorRT
