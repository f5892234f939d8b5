#include "board/session/LoggingCable.h"

#include <cstdio>
#include <exception>
#include <sstream>

#include "board/model/Value.h"

namespace qor {
namespace {

using QorRT::Qor_Scan;

// The end of a long number is where frames begin.
std::string digits(const Bytes& bits, std::size_t bitCount) {
  constexpr std::size_t longest = 64;
  const std::string text = hexText(bits, static_cast<unsigned>(bitCount));
  return text.size() <= longest ? text : "..." + text.substr(text.size() - longest);
}

std::string textOf(const Qor_Scan& scan, bool isDone) {
  const std::string device = std::to_string(scan.device);
  switch (scan.kind) {
    case Qor_Scan::Kind::ir:
      return "IR device " + device + " USER" + std::to_string(scan.userChain);
    case Qor_Scan::Kind::idle:
      return "idle " + std::to_string(scan.cycles);
    case Qor_Scan::Kind::dr:
      break;
  }
  const std::string in = scan.capture && isDone ? ", in " + digits(scan.in, scan.bitCount) : "";
  return "DR device " + device + ", " + std::to_string(scan.bitCount) + " bits, out " +
         digits(scan.out, scan.bitCount) + in;
}

std::string textOf(const std::vector<Qor_Scan>& scans, bool isDone) {
  std::string text;
  for (const Qor_Scan& scan : scans) text += "; " + textOf(scan, isDone);
  return text;
}

}  // namespace

LoggingCable::LoggingCable(std::unique_ptr<QorRT::Qor_Cable> cable, LogFunction log)
    : LoggingCable(dynamic_cast<QorRT::Qor_ServerLog*>(cable.get()), std::move(cable), std::move(log)) {}

LoggingCable::LoggingCable(QorRT::Qor_ServerLog* server, std::unique_ptr<QorRT::Qor_Cable> cable,
                           LogFunction log)
    : CountingCable(std::move(cable), traffic_), log_(std::move(log)), server_(server) {
  logRemarks();
}

std::string LoggingCable::secondsSince(Clock::time_point begin) const {
  char text[40];
  std::snprintf(text, sizeof text, "%.6f", std::chrono::duration<double>(Clock::now() - begin).count());
  return text;
}

void LoggingCable::run(std::vector<Qor_Scan>& scans) {
  const std::string at = secondsSince(begin_);
  const Clock::time_point begin = Clock::now();
  const auto lineOf = [&](const std::string& how) {
    return at + " s, took " + secondsSince(begin) + " s" + how;
  };
  try {
    CountingCable::run(scans);
  } catch (const std::exception& error) {
    log_(lineOf(", FAILED: " + std::string(error.what())) + textOf(scans, false));
    logRemarks();
    throw;
  }
  log_(lineOf(textOf(scans, true)));
  logRemarks();
}

void LoggingCable::logRemarks() {
  if (server_ == nullptr) return;
  std::istringstream remarks(server_->takeRemarks());
  for (std::string line; std::getline(remarks, line);) log_("server: " + line);
}

}  // namespace qor
