#include "platform/jtag/cable/bitbang/BitbangCable.h"

#include <stdexcept>
#include <string_view>
#include <utility>

#include "platform/jtag/cable/Qor_CableFactories.h"
#include "platform/jtag/cable/wire/ChainProbe.h"

namespace QorRT {
namespace {

constexpr char ask = 'R', quit = 'Q';

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

std::unique_ptr<Qor_Cable> openBitbangCable(const std::string& rest) {
  WireUrl url = parseWireUrl("rbb", rest);
  if (url.endpoint.host.empty()) throw std::logic_error("the cable URL \"rbb:" + rest + "\" names no server");
  if (!url.config.empty())
    throw std::logic_error("the cable URL \"rbb:" + rest +
                           "\" has the option \"config\", which needs openocd:");
  return std::make_unique<BitbangCable>(std::move(url));
}

BitbangCable::BitbangCable(WireUrl url) : url_(std::move(url)) {
  open();
}

BitbangCable::~BitbangCable() {
  try {
    if (stream_) stream_->exchange(std::string(1, quit), 0);
  } catch (const std::exception&) {  // the server has gone first
  }
}

void BitbangCable::disconnect() noexcept {
  stream_.reset();
}

std::vector<WireDevice> BitbangCable::connect() {
  stream_ = std::make_unique<TcpStream>(url_.endpoint, url_.timeout);
  TckSequence idcodes;
  idcodes.reset();
  idcodes.scanDr(idcodeProbe(), true);
  std::vector<Qor_Device> found = idcodesIn(packed(send(idcodes)));
  TckSequence irs;
  irs.scanIr(irProbe(), true);
  const std::size_t irBits = readIrLengths(found, packed(send(irs)));
  std::vector<WireDevice> devices = describedDevices(found, url_.board);
  requireIrBits(devices, irBits);
  return devices;
}

void BitbangCable::exchange(std::vector<Qor_Scan>& scans) {
  TckSequence sequence;
  for (const Qor_Scan& scan : scans) append(sequence, scan);
  const std::string answers = send(sequence);
  std::string_view left = answers;
  for (Qor_Scan& scan : scans) {
    if (!scan.capture) continue;
    const std::size_t count = scan.bitCount + devices().size() - 1;
    scan.in = chainDrCapture(scan.device, packed(left.substr(0, count)), scan.bitCount);
    left.remove_prefix(count);
  }
}

void BitbangCable::append(TckSequence& sequence, const Qor_Scan& scan) const {
  switch (scan.kind) {
    case Qor_Scan::Kind::ir:
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
std::string BitbangCable::send(const TckSequence& sequence) {
  std::string answers =
      stream_->exchange(charactersOf(sequence), sequence.captureCount() + 1, timeOf(sequence.tcks().size()));
  const std::size_t odd = answers.find_first_not_of("01");
  if (odd != answers.npos) {
    throw std::runtime_error(url_.endpoint.text() + " answered with the byte " +
                             std::to_string(static_cast<unsigned char>(answers[odd])) +
                             " where 0 or 1 was due");
  }
  answers.pop_back();
  return answers;
}

}  // namespace QorRT
