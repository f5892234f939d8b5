/// @file
/// A cable that writes down what goes through another one.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "Qor_ServerLog.h"
#include "board/Export.h"
#include "board/session/CountingCable.h"

namespace qor {

/// Takes lines, without their ends.
using LogFunction = std::function<void(const std::string& line)>;

/// A line for each exchange: when it began, in seconds since the cable was opened, how long it took, and its scans with
/// their bits as hexadecimal numbers, most significant digit first; and one for each remark of the cable's server.
class QORBOARD_API LoggingCable : public CountingCable {
 public:
  LoggingCable(std::unique_ptr<QorRT::Qor_Cable> cable, LogFunction log);

 private:
  using Clock = std::chrono::steady_clock;

  LoggingCable(QorRT::Qor_ServerLog* server, std::unique_ptr<QorRT::Qor_Cable> cable, LogFunction log);
  void run(std::vector<QorRT::Qor_Scan>& scans) override;
  void logRemarks();
  std::string secondsSince(Clock::time_point begin) const;

  Traffic traffic_;
  LogFunction log_;
  QorRT::Qor_ServerLog* const server_;  // null without one
  const Clock::time_point begin_ = Clock::now();
};

}  // namespace qor
