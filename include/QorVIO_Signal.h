/// @file
/// A one-bit signal for hosts that keep signals of their own. The library itself creates none.
///
/// Conventions
///
///  1. Failures are exceptions. No lock: the host serialises access to an object.
#pragma once

#include <string>

#include "QorCore.h"
#include "QorVIO_Export.h"

namespace QorRT {

/// A signal that starts with the properties "format" (its name followed by ":%b %a'"), "reset_value" and
/// "low_value" ("0") and "high_value" ("1").
class QORVIO_API QorVIO_Signal : public Qor_Signal {
 public:
  /// The arguments are those of Qor_Signal.
  QorVIO_Signal(unsigned int type, unsigned int unit, unsigned int position, const std::string& name);
  /// Copies the properties too. If an assignment throws (bad_alloc), the target is as it was.
  /// @{
  QorVIO_Signal(const QorVIO_Signal& other);
  QorVIO_Signal& operator=(const QorVIO_Signal& other);
  /// @}
  ~QorVIO_Signal();

 private:
  void setDefaultParameters();
};

}  // namespace QorRT
