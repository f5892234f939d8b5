#include "platform/jtag/cable/openocd/OpenOcdCable.h"

#include <algorithm>
#include <random>
#include <stdexcept>
#include <utility>

#include "platform/jtag/cable/Qor_CableFactories.h"

namespace QorRT {
namespace {

constexpr char endOfText = 0x1A;

// A command of several megabytes is never answered.
constexpr std::size_t longestCommand = 1 << 20;

std::size_t tcksOf(const Qor_Scan& scan) {
  return scan.kind == Qor_Scan::Kind::idle ? scan.cycles : scan.bitCount + 32;
}

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

std::unique_ptr<Qor_Cable> openOpenOcdCable(const std::string& rest) {
  WireUrl url = parseWireUrl("openocd", rest);
  if (url.endpoint.host.empty() == url.config.empty())
    throw std::logic_error("the cable URL \"openocd:" + rest +
                           "\" must name a server, HOST:PORT, or a configuration to start one, ?config=FILE");
  return std::make_unique<OpenOcdCable>(std::move(url));
}

OpenOcdCable::OpenOcdCable(WireUrl url)
    : url_(std::move(url)), procedure_("qor_" + std::to_string(std::random_device()())) {
  open();
}

OpenOcdCable::~OpenOcdCable() {
  OpenOcdCable::disconnect();
}

// A server of our own that has failed may have lost its adapter for good: the next one starts afresh. A server of
// somebody else's is left as it was, if it still answers.
void OpenOcdCable::disconnect() noexcept {
  try {
    if (answers_ && !server_) ask("catch {rename " + procedure_ + " {}}\n" + loudCommand());
  } catch (const std::exception&) {  // it has gone first
  }
  answers_ = false;
  stream_.reset();
  server_.reset();
  known_.clear();
}

std::vector<WireDevice> OpenOcdCable::connect() {
  stream_ = reach();
  try {
    ask(silenceCommand());
    taps_ = tapsIn(ask("capture scan_chain"));
  } catch (const std::runtime_error&) {
    if (server_) server_->requireRunning();
    throw;
  }
  requireTaps(taps_, url_.board);
  return describedDevices(headsOf(taps_), url_.board);
}

std::unique_ptr<TcpStream> OpenOcdCable::reach() {
  if (url_.config.empty()) return std::make_unique<TcpStream>(url_.endpoint, url_.timeout);
  server_ = std::make_unique<OpenOcdServer>(url_.config);
  return server_->connect(url_.timeout);
}

void OpenOcdCable::exchange(std::vector<Qor_Scan>& scans) {
  requireOrder(scans);
  std::string commands;
  std::size_t tcks = 0;
  auto first = scans.begin();  // of those whose commands are not sent yet
  for (auto scan = scans.begin(); scan != scans.end(); ++scan) {
    appendStep(commands, taps_, wireDevices(), *scan);
    tcks += tcksOf(*scan);
    if (commands.size() < longestCommand && scan + 1 != scans.end()) continue;
    CaptureReader captures(ask(commandFor(commands), tcks));
    for (; first != scan + 1; ++first)
      if (first->capture) first->in = captures.next(first->bitCount);
    captures.finish();
    commands.clear();
    tcks = 0;
  }
}

// A server parses a procedure once: who polls sends the same queue again and again.
std::string OpenOcdCable::commandFor(const std::string& commands) {
  if (commands == known_) return procedure_;
  known_ = commands;
  return procedureOf(procedure_, commands) + "\n" + procedure_;
}

std::string OpenOcdCable::ask(const std::string& command, std::size_t tcks) {
  answers_ = false;
  std::string answer = stream_->ask(command + endOfText, endOfText, timeOf(tcks));
  answers_ = true;
  return answer;
}

}  // namespace QorRT
