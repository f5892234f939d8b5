/// @file
/// What the server behind a cable says of its own accord.
#pragma once

#include <string>

#include "QorExport.h"

namespace QorRT {

/// Cables with a server of their own are this, too.
class QOR_API Qor_ServerLog {
 public:
  Qor_ServerLog() = default;
  Qor_ServerLog(const Qor_ServerLog&) = delete;
  Qor_ServerLog& operator=(const Qor_ServerLog&) = delete;
  virtual ~Qor_ServerLog();

  /// The warnings and errors that it has logged since the call before, a line each.
  virtual std::string takeRemarks() = 0;
};

}  // namespace QorRT
