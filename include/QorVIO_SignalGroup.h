/// @file
/// A named, ordered list of bits of one port: a bus, or a single signal.
///
/// Conventions
///
///  1. Entry i of the positions is the port bit that carries bit i of the value; the width n is the number of
///     entries.
///  2. A value takes B = (n + 7) / 8 bytes; its bit i is bit (i mod 8) of byte i / 8. Bits above n - 1 are
///     ignored in values written and not set in values read. A sequence of values is consecutive blocks of B
///     bytes.
///  3. A group works on its core's port image. Nothing here talks to the core: a write or read of the image
///     does.
///  4. Failures are logic_error, or bad_alloc where something is copied, and leave image and buffers as they
///     were.
#pragma once

#include <string>
#include <vector>

#include "QorCore.h"
#include "QorVIO_Export.h"

namespace QorRT {

class QorVIO_Command;

/// Final, because it has no virtual destructor: whoever deletes one deletes all of it.
/// One named group of a core; see the conventions above.
class QORVIO_API QorVIO_SignalGroup final : public Qor_SignalGroup {
 public:
  /// `command` is the port image of the core; it is not owned and outlives the group. `type` is one of the
  /// four SIGNAL_TYPE_VIO constants, `positions` lie within its port. `keyName` is the name under which the
  /// group is filed.
  QorVIO_SignalGroup(QorVIO_Command* command, unsigned int type, std::vector<unsigned int>& positions,
                     const std::string& name, const std::string& keyName);
  /// A copy works on the same port image as its source. Assigning is wholly done, or throws bad_alloc with
  /// the target as it was; a group that is filed in a table is never assigned to.
  /// @{
  QorVIO_SignalGroup(const QorVIO_SignalGroup& other);
  QorVIO_SignalGroup& operator=(const QorVIO_SignalGroup& other);
  /// @}
  ~QorVIO_SignalGroup();

  /// The width in bits.
  unsigned int size() const;

  /// The name under which the group is filed. Its characters stay where they are until the group is assigned
  /// to or destroyed.
  const std::string& getKeyName() const { return keyName; }

  /// The port image that the group works on.
  QorVIO_Command* getCommand() const { return command; }

  /// For groups of outputs. Stages `count` values (in, `size` bytes in all) and marks the group's bits for
  /// the next write. A synchronous output takes up to 16 values as steps of a pulse train and holds the last
  /// one in the steps that remain; one value (`count` 0 or 1) fills all steps. An asynchronous output takes
  /// the first value. Throws for a null `value` or too few bytes, before anything is staged; nothing here
  /// allocates.
  void setValues(const unsigned char* value, unsigned int size, unsigned int count);

  /// For groups of inputs. Adds (by OR) what the last read brought: the value and the activity flags, each
  /// into its buffer (out, `size` bytes, zero-filled by the caller). A null buffer is skipped; those of the
  /// two sync kinds are left alone for an asynchronous input. Throws when `size` is below B.
  void getValues(unsigned char* value, unsigned char* activityUp, unsigned char* activityDown,
                 unsigned char* syncActivityUp, unsigned char* syncActivityDown, unsigned int size) const;

  /// The type without the flag that says "group".
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
