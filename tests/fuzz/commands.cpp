// Command texts, run on a simulated core whose outputs loop back. Input: the text.
#include "QorCore.h"
#include "QorJtag_Host.h"
#include "Sim.h"
#include "tests/fuzz/Fuzz.h"

namespace {

constexpr unsigned asyncWidth = 3, syncWidth = 2;  // of inputs and outputs alike
constexpr unsigned dataBits = 2 * asyncWidth + 17 * syncWidth, recordBits = 4 * asyncWidth + 6 * syncWidth;

struct Pair {
  bool isRead, isOurs;
  unsigned bits;
  std::string data;
  std::size_t resultBytes() const { return isRead ? (bits + 16 + 7) / 8 + 1 : 0; }
};

bool isHex(const std::string& field, std::size_t length) {
  for (const char c : field)
    if (digitValue(c) < 0) return false;
  return field.size() == length;
}

/// The first `bits` bits of a number, the most significant first.
std::string binary(const std::string& hex, std::size_t bits) {
  std::string digits(bits, '0');
  for (std::size_t i = 0; i < bits && i / 4 < hex.size(); ++i)
    if ((digitValue(hex[hex.size() - 1 - i / 4]) >> i % 4 & 1) != 0) digits[bits - 1 - i] = '1';
  return digits;
}

/// False for a pair of lines that is not of the form.
bool parse(const std::vector<std::string>& first, const std::vector<std::string>& second, Pair& pair) {
  if (first.size() != 7 || second.size() != 7) return false;
  const std::size_t lengths[] = {2, 1, 1, 2, 1, 8};
  unsigned address[2][3] = {};
  for (unsigned i = 0; i < 6; ++i) {
    if (!isHex(first[i], lengths[i]) || !isHex(second[i], lengths[i])) return false;
    if (i >= 3) continue;
    address[0][i] = static_cast<unsigned>(std::stoul(first[i], nullptr, 16));
    address[1][i] = static_cast<unsigned>(std::stoul(second[i], nullptr, 16));
    if (address[0][i] != address[1][i]) return false;
  }
  pair.isOurs = address[0][0] == 0 && address[0][1] == 1 && address[0][2] == 0;
  pair.isRead = first[3] == "03";
  if (second[3] != (pair.isRead ? "04" : "02") || second[4] != (pair.isRead ? "1" : "0")) return false;
  if (second[5] != "00000004" || second[6] != "0") return false;
  const unsigned long count = std::stoul(first[5], nullptr, 16);
  pair.data = first[6];
  if (pair.isRead) {
    pair.bits = static_cast<unsigned>(count - 16);
    return first[4] == "1" && count >= 16 && count <= 10 * 65535 + 16 && pair.data == "0";
  }
  pair.bits = static_cast<unsigned>(count - 1);
  if (first[3] != "01" || first[4] != "0" || count < 1 || count > 19 * 65535 + 1) return false;
  if (!isHex(pair.data, pair.data.size()) || pair.data.empty() || pair.data.size() > (count + 3) / 4)
    return false;
  return binary(pair.data, 4 * pair.data.size()).find('1') >=
         4 * pair.data.size() - std::min<std::size_t>(pair.bits, 4 * pair.data.size());
}

bool parse(std::string_view text, std::vector<Pair>& pairs) {
  const std::vector<std::string> lines = split(text, '\n');
  if (lines.size() % 2 != 0) return false;
  for (std::size_t i = 0; i < lines.size(); i += 2) {
    Pair pair{};
    if (!parse(split(lines[i], ' '), split(lines[i + 1], ' '), pair)) return false;
    pairs.push_back(pair);
  }
  return true;
}

/// What the pins show when all pulse trains have played.
struct Pins {
  std::string async = std::string(asyncWidth, '0'), sync = std::string(syncWidth, '0');

  void write(const std::string& digits) {
    for (unsigned i = 0; i < asyncWidth; ++i)
      if (digits[asyncWidth + 16 * syncWidth + i] == '1') async[i] = digits[i];
    for (unsigned i = 0; i < syncWidth; ++i)
      if (digits[2 * asyncWidth + 16 * syncWidth + i] == '1') sync[i] = digits[asyncWidth + 16 * i + 15];
  }
};

/// The values among the records that begin at byte `at`.
Pins pinsRead(const std::vector<unsigned char>& result, std::size_t at) {
  const auto digit = [&](unsigned k) {
    const unsigned bit = recordBits - 1 - k;
    return static_cast<char>('0' + (result[at + bit / 8] >> bit % 8 & 1));
  };
  Pins pins;
  for (unsigned i = 0; i < asyncWidth; ++i) pins.async[i] = digit(4 * i);
  for (unsigned i = 0; i < syncWidth; ++i) pins.sync[i] = digit(4 * asyncWidth + 6 * i);
  return pins;
}

void checkResult(const std::vector<Pair>& pairs, const std::vector<unsigned char>& result) {
  Pins pins;
  std::size_t at = 0;
  for (const Pair& pair : pairs) {
    if (pair.isRead) {
      const Pins seen = pinsRead(result, at);
      requireEqual(seen.async + ' ' + seen.sync, pins.async + ' ' + pins.sync);
    } else {
      pins.write(binary(pair.data, dataBits));
    }
    at += pair.resultBytes();
  }
}

}  // namespace

void fuzz(std::string_view input) {
  auto core = qorsim::vio().asyncOut(asyncWidth).syncOut(syncWidth).asyncIn(asyncWidth).syncIn(syncWidth);
  auto cable = qorsim::chain()
                   .device()
                   .core(1, 0, core.design(qorsim::loopback()))
                   .core(1, 1, qorsim::otherCore(7))
                   .device()
                   .cable();
  const qorsim::SimCable& board = *cable;
  const unsigned session = QorJtag_session_openCable(std::move(cable));

  std::vector<Pair> pairs;
  const bool isText = parse(input, pairs);
  std::size_t bytes = 0;
  bool works = isText;
  for (const Pair& pair : pairs) {
    bytes += pair.resultBytes();
    works = works && pair.isOurs && pair.bits == (pair.isRead ? recordBits : dataBits);
  }
  std::vector<unsigned char> result(isText ? bytes : 0, 0xEE);
  const std::vector<unsigned char> untouched = result;
  const std::string text(input);
  const std::string wrong = thrownBy([&] {
    QorRT::Qor_CoreComm::commandSequence(session, text, result.data(),
                                         static_cast<unsigned>(8 * result.size()), nullptr);
  });
  require(wrong.empty() == works, wrong + " for " + text);
  require((wrong.rfind("command text line ", 0) == 0) == !isText, wrong);
  if (!isText) require(board.exchanges() == 0, "nothing is sent");
  if (works)
    checkResult(pairs, result);
  else
    require(result == untouched, "the result stays as it was");
  QorJtag_session_close(session);
}
