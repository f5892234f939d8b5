#include "platform/jtag/cable/openocd/OpenOcdText.h"

#include <algorithm>
#include <charconv>
#include <regex>
#include <sstream>
#include <stdexcept>

namespace QorRT {
namespace {

// The server's time for a field grows with the square of its length.
constexpr std::size_t fieldBits = 256;

constexpr std::string_view digitsOf = "0123456789abcdef", blanks = " \n\r\t";
constexpr std::string_view captureCharacters = "0123456789abcdefABCDEF \n\r\t";
constexpr std::size_t mostErrorBytes = 4096;

std::size_t bytesFor(std::size_t bitCount) {
  return (bitCount + 7) / 8;
}

unsigned number(const std::string& text, int base) {
  const std::size_t skip = base == 16 && text.rfind("0x", 0) == 0 ? 2 : 0;
  unsigned value = 0;
  const char* const end = text.data() + text.size();
  const auto [rest, error] = std::from_chars(text.data() + skip, end, value, base);
  if (error != std::errc() || rest != end)
    throw std::runtime_error("the server's table of its scan chain has \"" + text +
                             "\" where a number is due");
  return value;
}

std::vector<std::string> wordsOf(const std::string& line) {
  std::istringstream stream(line);
  std::vector<std::string> words;
  for (std::string word; stream >> word;) words.push_back(word);
  return words;
}

// Number, name, enabled, IDCODE, expected, IR length, IR capture, IR mask.
constexpr std::size_t rowWords = 8;

bool isRow(const std::vector<std::string>& words) {
  return words.size() == rowWords && (words[2] == "Y" || words[2] == "N");
}

// "0x0a5f1093", or "0x*a5f1093" when the version does not matter; 0 means any.
ExpectedIdcode expectedOf(const std::string& text) {
  const bool anyVersion = text.rfind("0x*", 0) == 0;
  const unsigned idcode = number(anyVersion ? "0x0" + text.substr(3) : text, 16);
  const unsigned mask = anyVersion ? 0x0FFFFFFF : 0xFFFFFFFF;
  return {idcode, idcode == 0 ? 0 : mask};
}

OpenOcdTap tapOf(const std::vector<std::string>& row) {
  return {row[1], number(row[3], 16), {expectedOf(row[4])}, number(row[5], 10)};
}

std::string namesOf(const std::vector<OpenOcdTap>& taps) {
  std::string names;
  for (const OpenOcdTap& tap : taps) names.append(names.empty() ? "" : ", ").append(tap.name);
  return names;
}

std::string anyOf(const std::vector<ExpectedIdcode>& expected) {
  std::string text;
  for (const ExpectedIdcode& each : expected) {
    const std::string digits = idcodeText(each.idcode);
    text += text.empty() ? "" : " or ";
    text += each.mask == 0xFFFFFFFF ? digits : "*" + digits.substr(1);
  }
  return text;
}

bool isExpected(const OpenOcdTap& tap) {
  return std::any_of(tap.expected.begin(), tap.expected.end(), [&](const ExpectedIdcode& each) {
    return ((tap.idcode ^ each.idcode) & each.mask) == 0;
  });
}

// The server names what it finds after the TAPs of its configuration "auto0.tap" and so on.
bool isUnnamed(const OpenOcdTap& tap) {
  return tap.expected.front().mask == 0 && std::regex_match(tap.name, std::regex(R"(auto\d+\.tap)"));
}

void requireAnswer(const OpenOcdTap& tap) {
  if (!isExpected(tap))
    throw std::runtime_error("the TAP " + tap.name + " has the IDCODE " + idcodeText(tap.idcode) + ", not " +
                             anyOf(tap.expected));
  if (isUnnamed(tap)) {
    throw std::runtime_error(
        "the chain has a device that the server's configuration does not name: " + tap.name + ", IDCODE " +
        idcodeText(tap.idcode) + ", an IR of " + std::to_string(tap.irLength) + " bits by its capture");
  }
}

void requirePlace(const std::vector<OpenOcdTap>& taps, std::size_t place, const std::string& name) {
  if (name.empty() || (place < taps.size() && taps[place].name == name)) return;
  const bool elsewhere =
      std::any_of(taps.begin(), taps.end(), [&](const OpenOcdTap& tap) { return tap.name == name; });
  throw std::runtime_error("the server has the TAPs " + namesOf(taps) + ", the one nearest to TDO first; " +
                           (elsewhere ? "the board file has another order: " : "the board file names ") +
                           name + " as device " + std::to_string(place));
}

// A field of up to fieldBits bits, from a byte boundary on: "12 0x123".
void appendField(std::string& text, const unsigned char* bits, std::size_t bitCount) {
  text.append(" ").append(std::to_string(bitCount)).append(" 0x");
  for (std::size_t i = bytesFor(bitCount); i-- > 0;) {
    text += digitsOf[bits[i] >> 4];
    text += digitsOf[bits[i] & 15];
  }
}

std::string drScan(const std::string& tap, const Qor_Scan& scan) {
  std::string command = "drscan " + tap;
  for (std::size_t done = 0; done < scan.bitCount; done += fieldBits)
    appendField(command, scan.out.data() + done / 8, std::min(fieldBits, scan.bitCount - done));
  return command;
}

std::string irScan(const OpenOcdTap& tap, std::uint64_t opcode) {
  const std::uint64_t all = tap.irLength >= 64 ? ~std::uint64_t{0} : (std::uint64_t{1} << tap.irLength) - 1;
  return "irscan " + tap.name + " " + std::to_string(opcode & all);
}

unsigned digitValue(char digit) {
  if (digit >= '0' && digit <= '9') return static_cast<unsigned>(digit - '0');
  if (digit >= 'a' && digit <= 'f') return static_cast<unsigned>(digit - 'a' + 10);
  if (digit >= 'A' && digit <= 'F') return static_cast<unsigned>(digit - 'A' + 10);
  return 16;
}

[[noreturn]] void failAt(std::string_view word, std::size_t bitCount) {
  throw std::runtime_error("the server answered \"" + std::string(word.substr(0, 80)) + "\" where " +
                           std::to_string(bitCount) + " bits were due");
}

// What the server says of a failure, which may be nothing.
std::string detail(const std::string& said) {
  const std::size_t first = said.find_first_not_of(blanks);
  return ": " + (first == said.npos ? "has it lost its adapter?" : said.substr(first, 200));
}

// Digits to the end of a byte or no further than the bits go; no bit above them is set.
void readField(std::string_view word, unsigned char* bits, std::size_t bitCount) {
  if (word.size() != (bitCount + 3) / 4 && word.size() != 2 * bytesFor(bitCount)) failAt(word, bitCount);
  for (std::size_t i = 0; i < word.size(); ++i) {
    const unsigned value = digitValue(word[word.size() - 1 - i]);
    const unsigned room = 4 * i + 4 <= bitCount ? 16 : 4 * i < bitCount ? 1u << (bitCount - 4 * i) : 1;
    if (value >= room) failAt(word, bitCount);
    bits[i / 2] = static_cast<unsigned char>(bits[i / 2] | value << i % 2 * 4);
  }
}

}  // namespace

std::vector<OpenOcdTap> tapsIn(const std::string& table) {
  std::vector<OpenOcdTap> taps;
  bool enabled = false;
  std::istringstream lines(table);
  for (std::string line; std::getline(lines, line);) {
    const std::vector<std::string> words = wordsOf(line);
    if (isRow(words)) {
      enabled = words[2] == "Y";
      if (enabled) taps.push_back(tapOf(words));
    } else if (words.size() == 1 && words[0].rfind("0x", 0) == 0 && enabled) {
      taps.back().expected.push_back(expectedOf(words[0]));  // one more that will do
    }
  }
  if (taps.empty()) throw std::runtime_error("the server has no TAP on its scan chain");
  return taps;
}

void requireTaps(const std::vector<OpenOcdTap>& taps, const std::vector<DeviceEntry>& board) {
  for (const OpenOcdTap& tap : taps) requireAnswer(tap);
  for (std::size_t i = 0; i < board.size(); ++i) requirePlace(taps, i, board[i].tap);
}

std::string stepCommand(const std::vector<OpenOcdTap>& taps, const std::vector<WireDevice>& devices,
                        const Qor_Scan& scan) {
  switch (scan.kind) {
    case Qor_Scan::Kind::ir:
      return irScan(taps[scan.device], devices[scan.device].userOpcodes[scan.userChain - 1]);
    case Qor_Scan::Kind::dr:
      return drScan(taps[scan.device].name, scan);
    case Qor_Scan::Kind::idle:
      break;
  }
  return "runtest " + std::to_string(scan.cycles);
}

// The server keeps the level itself, for all its clients.
std::string muteLog() {
  return "if {![info exists ::qor_log_level]} {set ::qor_log_level [lindex [debug_level] 1]}\ndebug_level -3";
}

std::string restoreLogLevel() {
  return "if {[info exists ::qor_log_level]} {debug_level $::qor_log_level; unset ::qor_log_level}";
}

// The result of a script is that of its last command: mostly nothing else captures, and no variable is needed.
std::string batchOf(const std::vector<OpenOcdStep>& steps) {
  std::string script;
  std::size_t captures = 0;
  for (const OpenOcdStep& step : steps) captures += step.capturedBits > 0 ? 1 : 0;
  const bool lastAlone = captures == 1 && steps.back().capturedBits > 0;
  for (const OpenOcdStep& step : steps) {
    const bool kept = step.capturedBits > 0 && !lastAlone;
    script.append(kept ? "append r { } [" : "").append(step.command).append(kept ? "]\n" : "\n");
  }
  return lastAlone ? script : "set r ok\n" + script + "set r";
}

std::size_t mostAnswer(const std::vector<OpenOcdStep>& steps) {
  std::size_t most = mostErrorBytes;
  for (const OpenOcdStep& step : steps) most += step.capturedBits / 4 + step.capturedBits / fieldBits + 8;
  return most;
}

CaptureReader::CaptureReader(std::string answer) : answer_(std::move(answer)) {
  if (word() != "ok") place_ = 0;
  const std::string said = answer_.substr(place_);
  const bool captured = said.find_first_not_of(captureCharacters) == said.npos;
  if (!captured || answer_.empty())
    throw std::runtime_error("the server could not run the scans" + detail(said));
}

std::vector<unsigned char> CaptureReader::next(std::size_t bitCount) {
  std::vector<unsigned char> bits(bytesFor(bitCount));
  for (std::size_t done = 0; done < bitCount; done += fieldBits)
    readField(word(), bits.data() + done / 8, std::min(fieldBits, bitCount - done));
  return bits;
}

void CaptureReader::finish() {
  if (const std::string_view more = word(); !more.empty())
    throw std::runtime_error("the server answered more than it was asked: \"" +
                             std::string(more.substr(0, 80)) + "\"");
}

// Empty at the end.
std::string_view CaptureReader::word() {
  const std::size_t first = std::min(answer_.find_first_not_of(blanks, place_), answer_.size());
  place_ = std::min(answer_.find_first_of(blanks, first), answer_.size());
  return std::string_view(answer_).substr(first, place_ - first);
}

}  // namespace QorRT
