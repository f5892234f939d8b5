#include "platform/core/Qor_CommandText.h"

#include <algorithm>
#include <memory>
#include <stdexcept>
#include <string>

#include "QorUtil.h"

namespace QorRT {
namespace {

constexpr unsigned dataCode = 1, writeCode = 2, recordsCode = 3, flagsCode = 4;
constexpr std::size_t checkBits = 16, shortLineBits = 4, writeExtraBits = 1;

/// What four ports of 65535 bits take: no core asks for more, and no text makes the host allocate more.
constexpr std::size_t mostPayloadBits = 19 * 65535, mostRecordBits = 10 * 65535;

/// Takes a line apart, field by field.
class LineReader {
 public:
  LineReader(std::string_view line, unsigned number) : rest_(line), number_(number) {}

  /// The next field, up to a blank, as a number of exactly `digitCount` hexadecimal digits.
  unsigned number(const char* name, std::size_t digitCount) {
    name_ = name;
    field_ = rest_.substr(0, rest_.find(' '));
    rest_.remove_prefix(std::min(field_.size() + 1, rest_.size()));
    unsigned value = 0;
    for (const char c : field_) value = value << 4 | digit(c);
    require(field_.size() == digitCount);
    return value;
  }

  /// Everything that is left, blanks and all.
  std::string_view data() {
    name_ = "data";
    return field_ = rest_;
  }

  /// Refuses the field that was read last, unless the condition is true.
  void require(bool condition) const {
    if (!condition) refuse();
  }

  [[noreturn]] void refuse() const {
    constexpr std::size_t longest = 40;
    const std::string shown = std::string(field_.substr(0, longest)) + (field_.size() > longest ? "..." : "");
    throw std::logic_error("command text line " + std::to_string(number_) + ", " + name_ + ": " + shown);
  }

 private:
  unsigned digit(char c) const {
    if (c >= '0' && c <= '9') return static_cast<unsigned>(c - '0');
    if (c >= 'A' && c <= 'F') return static_cast<unsigned>(c - 'A') + 10;
    if (c >= 'a' && c <= 'f') return static_cast<unsigned>(c - 'a') + 10;
    refuse();
  }

  std::string_view rest_;
  std::string_view field_;
  const char* name_ = "";
  unsigned number_;
};

/// Hands out the lines of a text.
class TextReader {
 public:
  explicit TextReader(std::string_view text) : rest_(text) {}

  bool atEnd() const { return ended_; }

  /// After the last line, empty ones.
  LineReader next() {
    const std::size_t end = rest_.find('\n');
    const std::string_view line = rest_.substr(0, end);
    ended_ = end == rest_.npos;
    rest_.remove_prefix(ended_ ? rest_.size() : end + 1);
    return {line, ++lineNumber_};
  }

 private:
  std::string_view rest_;
  unsigned lineNumber_ = 0;
  bool ended_ = false;
};

QOR_CORE_REF readAddress(LineReader& line) {
  const unsigned device = line.number("device index", 2);
  const unsigned chain = line.number("user chain number", 1);
  return {device, chain, line.number("core index", 1)};
}

void requireAddress(LineReader& line, const QOR_CORE_REF& coreRef) {
  line.require(line.number("device index", 2) == coreRef.device_index);
  line.require(line.number("user chain number", 1) == coreRef.user_chain_number);
  line.require(line.number("core index", 1) == coreRef.core_index);
}

void requireSecondLine(LineReader line, const QOR_CORE_REF& coreRef, unsigned code, bool capture) {
  requireAddress(line, coreRef);
  line.require(line.number("code", 2) == code);
  line.require(line.number("capture flag", 1) == (capture ? 1 : 0));
  line.require(line.number("bit count", 8) == shortLineBits);
  line.require(line.data() == "0");
}

/// The number in the field as bytes, least significant first; refused when it has other characters.
std::vector<unsigned char> readNumber(const LineReader& line, std::string_view digits) {
  Qor_ByteBuffer text(static_cast<unsigned>(digits.size()), 0, 0);
  std::copy(digits.begin(), digits.end(), text.uPtr());
  try {
    const std::unique_ptr<Qor_ByteBuffer> number(text.hex2Bin(0, text.getSize() - 1));
    return {number->uPtr(), number->uPtr() + number->getSize()};
  } catch (const std::logic_error&) {
    line.refuse();
  }
}

bool fitsBits(const std::vector<unsigned char>& number, std::size_t bitCount) {
  const std::size_t whole = bitCount / 8;
  if (number.size() <= whole) return true;
  const auto above = number.begin() + static_cast<std::ptrdiff_t>(whole) + 1;
  return number[whole] >> bitCount % 8 == 0 &&
         std::all_of(above, number.end(), [](unsigned char byte) { return byte == 0; });
}

/// The payload without the extra bit on top of it, which must be 0.
std::vector<unsigned char> readPayload(LineReader& line, std::size_t payloadBits) {
  const std::string_view digits = line.data();
  line.require(!digits.empty() && digits.size() <= (payloadBits + writeExtraBits + 3) / 4);
  std::vector<unsigned char> payload = readNumber(line, digits);
  line.require(fitsBits(payload, payloadBits));
  payload.resize((payloadBits + 7) / 8);
  return payload;
}

Qor_PortCommand readCommand(TextReader& text) {
  LineReader line = text.next();
  Qor_PortCommand command{readAddress(line), false, 0, {}};
  const unsigned code = line.number("code", 2);
  line.require(code == dataCode || code == recordsCode);
  command.isRead = code == recordsCode;
  line.require(line.number("capture flag", 1) == (command.isRead ? 1 : 0));
  const std::size_t extraBits = command.isRead ? checkBits : writeExtraBits;
  const std::size_t lineBits = line.number("bit count", 8);
  line.require(lineBits >= extraBits);
  command.bitCount = lineBits - extraBits;
  line.require(command.bitCount <= (command.isRead ? mostRecordBits : mostPayloadBits));
  if (command.isRead) {
    line.require(line.data() == "0");
  } else {
    command.payload = readPayload(line, command.bitCount);
  }
  requireSecondLine(text.next(), command.coreRef, command.isRead ? flagsCode : writeCode, command.isRead);
  return command;
}

}  // namespace

std::size_t Qor_PortCommand::resultBytes() const {
  return isRead ? (bitCount + checkBits + 7) / 8 + 1 : 0;
}

std::vector<Qor_PortCommand> parseCommandText(std::string_view text) {
  std::vector<Qor_PortCommand> commands;
  for (TextReader reader(text); !reader.atEnd();) commands.push_back(readCommand(reader));
  return commands;
}

}  // namespace QorRT
