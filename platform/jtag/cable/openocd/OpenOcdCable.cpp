#include "platform/jtag/cable/openocd/OpenOcdCable.h"

#include <random>
#include <stdexcept>
#include <utility>

#include "platform/jtag/cable/Qor_CableFactories.h"

namespace QorRT {
namespace {

constexpr char endOfText = 0x1A;

// A command of several megabytes is never answered.
constexpr std::size_t longestCommand = 1 << 20;

constexpr std::size_t mostText = 1 << 16;  // bytes of an answer that is no capture
constexpr Seconds startUp{10};             // for a server that looks for its adapter

// A scan of no device or of another than the last IR scan's would end the server.
void requireOrder(const std::vector<Qor_Scan>& scans) {
  const Qor_Scan* selected = nullptr;
  for (const Qor_Scan& scan : scans) {
    if (scan.kind == Qor_Scan::Kind::ir) selected = &scan;
    if (scan.kind != Qor_Scan::Kind::dr) continue;
    if (selected == nullptr || selected->device != scan.device)
      throw std::logic_error("a DR scan of device " + std::to_string(scan.device) +
                             " is queued before an IR scan of it");
    if (scan.bitCount == 0) throw std::logic_error("a DR scan of no bits is queued");
  }
}

std::vector<Qor_Device> headsOf(const std::vector<OpenOcdTap>& taps) {
  std::vector<Qor_Device> heads;
  heads.reserve(taps.size());
  for (const OpenOcdTap& tap : taps) heads.push_back({tap.idcode, tap.name, tap.irLength});
  return heads;
}

}  // namespace

std::unique_ptr<Qor_Cable> openOpenOcdCable(const std::string& rest, StopFunction stop) {
  const bool ours = rest.empty() || rest.front() == '?';
  WireUrl url = parseWireUrl("openocd", rest,
                             ours ? std::vector<std::string>{"board", "config", "timeout"}
                                  : std::vector<std::string>{"board", "timeout"});
  if (ours && url.config.empty())
    throw std::logic_error("the cable URL \"openocd:" + rest +
                           "\" must name a server, HOST:PORT, or a configuration to start one, ?config=FILE");
  return std::make_unique<OpenOcdCable>(std::move(url), std::move(stop));
}

OpenOcdCable::OpenOcdCable(WireUrl url, StopFunction stop)
    : WireCable(std::move(url), std::move(stop)), muteLog_("qor_" + std::to_string(std::random_device()())) {
  open();
}

OpenOcdCable::~OpenOcdCable() {
  OpenOcdCable::disconnect();
}

// A server of our own that has failed may have lost its adapter for good: the next one starts afresh. A server of
// somebody else's is left as it was, if it still answers.
void OpenOcdCable::disconnect() noexcept {
  try {
    if (answers_ && connection_)
      ask("catch {rename " + muteLog_ + " {}}\n" + restoreLogLevel(), mostText, leaveTime());
  } catch (const std::exception&) {  // it has gone first
  }
  answers_ = false;
  stream_ = nullptr;
  connection_.reset();
  server_.reset();
}

std::vector<WireDevice> OpenOcdCable::connect() {
  if (!url().config.empty()) return startServer();
  const Deadline deadline = deadlineOf(0);
  connection_ = std::make_unique<Stream>(url().endpoint, deadline, stop());
  stream_ = connection_.get();
  ask("proc " + muteLog_ + " {} {" + muteLog() + "}\n" + muteLog_, mostText, deadline);
  return requireChain(deadline);
}

std::vector<WireDevice> OpenOcdCable::startServer() {
  const Deadline deadline(url().timeout + startUp);
  server_ = std::make_unique<OpenOcdServer>(url().config, stop());
  stream_ = &server_->stream();
  try {
    ask("debug_level -3", mostText, deadline);
  } catch (const std::runtime_error& error) {
    server_->explain(error.what());
  }
  return requireChain(deadline);
}

std::vector<WireDevice> OpenOcdCable::requireChain(const Deadline& deadline) {
  taps_ = tapsIn(ask("capture scan_chain", mostText, deadline));
  requireTaps(taps_, board());
  if (server_) server_->requireTrust();
  return describedDevices(headsOf(taps_), board());
}

void OpenOcdCable::exchange(std::vector<Qor_Scan>& scans, const Deadline& deadline) {
  requireOrder(scans);
  std::vector<OpenOcdStep> steps;
  std::size_t size = 0;
  auto first = scans.begin();  // of those whose commands are not sent yet
  for (auto scan = scans.begin(); scan != scans.end(); ++scan) {
    if (!isLeftOut(*scan)) {
      steps.push_back({stepCommand(taps_, wireDevices(), *scan), scan->capture ? scan->bitCount : 0});
      size += steps.back().command.size();
    }
    if (size < longestCommand && scan + 1 != scans.end()) continue;
    runBatch(steps, first, scan + 1, deadline);
    first = scan + 1;
    steps.clear();
    size = 0;
  }
}

// Who has a server alone knows what is selected, and has muted its log for good.
bool OpenOcdCable::isLeftOut(const Qor_Scan& scan) {
  return server_ && scan.kind == Qor_Scan::Kind::ir && isSelected(scan);
}

void OpenOcdCable::runBatch(const std::vector<OpenOcdStep>& steps, Scans first, Scans end,
                            const Deadline& deadline) {
  if (steps.empty()) return;
  const std::string start = server_ ? "" : muteLog_ + "\n";
  CaptureReader captures(ask(start + batchOf(steps), mostAnswer(steps), deadline));
  for (; first != end; ++first)
    if (first->capture) first->in = captures.next(first->bitCount);
  captures.finish();
}

std::string OpenOcdCable::ask(const std::string& command, std::size_t most, const Deadline& deadline) {
  answers_ = false;
  std::string answer = stream_->ask(command + endOfText, endOfText, most, deadline);
  answers_ = true;
  return answer;
}

}  // namespace QorRT
