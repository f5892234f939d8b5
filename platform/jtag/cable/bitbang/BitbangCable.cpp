#include "platform/jtag/cable/bitbang/BitbangCable.h"

#include <stdexcept>
#include <string_view>
#include <utility>

#include "platform/jtag/cable/Qor_CableFactories.h"
#include "platform/jtag/cable/wire/ChainProbe.h"
#include "platform/jtag/cable/wire/Stream.h"

namespace QorRT {
namespace {

constexpr char ask = 'R', quit = 'Q', releaseResets = 'r';

// '0' to '7': TCK, TMS and TDI as the bits of a number.
char pins(bool tck, unsigned char each) {
  return static_cast<char>('0' + (tck ? 4 : 0) + (each & (TckSequence::tms | TckSequence::tdi)));
}

// TDO is asked for before the rising edge of TCK, where a TAP samples TDI too.
std::string charactersOf(const TckSequence& sequence) {
  std::string text;
  text.reserve(2 * sequence.tcks().size() + sequence.captureCount() + 2);
  for (const unsigned char each : sequence.tcks()) {
    text += pins(false, each);
    if ((each & TckSequence::capture) != 0) text += ask;
    text += pins(true, each);
  }
  text += pins(false, TckSequence::tdi);
  text += ask;
  return text;
}

std::vector<unsigned char> packed(std::string_view answers) {
  std::vector<unsigned char> bits((answers.size() + 7) / 8);
  for (std::size_t i = 0; i < answers.size(); ++i)
    bits[i / 8] = static_cast<unsigned char>(bits[i / 8] | (answers[i] - '0') << i % 8);
  return bits;
}

}  // namespace

std::unique_ptr<Qor_Cable> openBitbangCable(const std::string& rest, StopFunction stop) {
  WireUrl url = parseWireUrl("rbb", rest, {"board", "timeout"});
  if (url.endpoint.host.empty()) throw std::logic_error("the cable URL \"rbb:" + rest + "\" names no server");
  return std::make_unique<BitbangCable>(std::move(url), std::move(stop));
}

BitbangCable::BitbangCable(WireUrl url, StopFunction stop) : WireCable(std::move(url), std::move(stop)) {
  open();
}

BitbangCable::~BitbangCable() {
  try {
    if (stream_) stream_->exchange(std::string(1, quit), 0, leaveTime());
  } catch (const std::exception&) {  // the server has gone first
  }
}

void BitbangCable::disconnect() noexcept {
  stream_.reset();
}

// The client before may have left a reset asserted.
std::vector<WireDevice> BitbangCable::connect() {
  TckSequence idcodes, irs;
  idcodes.reset();
  idcodes.scanDr(idcodeProbe(), true);
  irs.scanIr(irProbe(), true);
  const Deadline deadline = deadlineOf(idcodes.tcks().size() + irs.tcks().size());
  stream_ = std::make_unique<Stream>(url().endpoint, deadline, stop());
  std::vector<Qor_Device> found =
      idcodesIn(packed(send(releaseResets + charactersOf(idcodes), idcodes.captureCount(), deadline)));
  const std::vector<unsigned char> irCapture = packed(send(charactersOf(irs), irs.captureCount(), deadline));
  readIrLengths(found, irCapture);
  std::vector<WireDevice> devices = describedDevices(found, board());
  requireIrs(devices, irCapture);
  return devices;
}

void BitbangCable::exchange(std::vector<Qor_Scan>& scans, const Deadline& deadline) {
  TckSequence sequence;
  for (const Qor_Scan& scan : scans) append(sequence, scan);
  const std::string answers = send(charactersOf(sequence), sequence.captureCount(), deadline);
  std::string_view left = answers;
  for (Qor_Scan& scan : scans) {
    if (!scan.capture) continue;
    const std::size_t count = scan.bitCount + devices().size() - 1;
    scan.in = chainDrCapture(scan.device, packed(left.substr(0, count)), scan.bitCount);
    left.remove_prefix(count);
  }
}

void BitbangCable::append(TckSequence& sequence, const Qor_Scan& scan) {
  switch (scan.kind) {
    case Qor_Scan::Kind::ir:
      if (isSelected(scan)) return;
      return sequence.scanIr(
          chainIrScan(devices(), scan.device, wireDevices()[scan.device].userOpcodes[scan.userChain - 1]));
    case Qor_Scan::Kind::dr:
      return sequence.scanDr(chainDrScan(devices().size(), scan.device, scan.out, scan.bitCount),
                             scan.capture);
    case Qor_Scan::Kind::idle:
      return sequence.idle(scan.cycles);
  }
}

// The answers to the captures, without the one that says that all has run.
std::string BitbangCable::send(const std::string& text, std::size_t captureCount, const Deadline& deadline) {
  std::string answers = stream_->exchange(text, captureCount + 1, deadline);
  const std::size_t odd = answers.find_first_not_of("01");
  if (odd != answers.npos) {
    throw std::runtime_error(url().endpoint.text() + " answered with the byte " +
                             std::to_string(static_cast<unsigned char>(answers[odd])) +
                             " where 0 or 1 was due");
  }
  answers.pop_back();
  return answers;
}

}  // namespace QorRT
