// libQorUtil once more, bit by bit.
#include "QorUtil.h"

#include <cstdio>

namespace QorRT {
namespace {

constexpr char hexDigits[] = "0123456789ABCDEF";

bool bitOf(const unsigned char* bytes, unsigned bit) {
  return (bytes[bit / 8] >> bit % 8 & 1) != 0;
}

unsigned digitValue(char digit) {
  return static_cast<unsigned>(std::string(hexDigits).find(digit));
}

}  // namespace

Qor_ByteBuffer::Qor_ByteBuffer(unsigned size, unsigned, unsigned) : bytes_(size) {}

unsigned Qor_ByteBuffer::getBits(unsigned offset, unsigned length) const {
  unsigned value = 0;
  while (length-- > 0) value = value << 1 | (bitOf(bytes_.data(), offset + length) ? 1U : 0U);
  return value;
}

Qor_ByteBuffer* Qor_ByteBuffer::bin2HexString(unsigned first, unsigned count) const {
  auto* text = new Qor_ByteBuffer((count + 3) / 4 + 1, 0, 0);
  for (unsigned i = 0; i < count; i += 4)
    text->bytes_[(count - 1 - i) / 4] =
        static_cast<unsigned char>(hexDigits[getBits(first + i, count - i < 4 ? count - i : 4)]);
  return text;
}

void Qor_ByteBuffer::bin2HexString(unsigned firstByte, Qor_ByteBuffer& out) const {
  const Qor_ByteBuffer* text = bin2HexString(8 * firstByte, 8 * (getSize() - firstByte));
  out = *text;
  delete text;
}

Qor_ByteBuffer* Qor_ByteBuffer::hex2Bin(unsigned first, unsigned last) const {
  auto* bytes = new Qor_ByteBuffer((last - first + 2) / 2, 0, 0);
  for (unsigned i = 0; i <= last - first; ++i)
    bytes->bytes_[i / 2] =
        static_cast<unsigned char>(bytes->bytes_[i / 2] | digitValue(ptr()[last - i]) << i % 2 * 4);
  return bytes;
}

std::string& Qor_NumberUtil::uInt2DecStr(unsigned value, std::string& out) {
  return out = std::to_string(value);
}

std::string& Qor_NumberUtil::uInt2HexStr(unsigned value, unsigned bitWidth, std::string& out) {
  char text[9];
  std::snprintf(text, sizeof text, "%0*X", static_cast<int>(bitWidth / 4), value);
  return out = text;
}

std::string& Qor_NumberUtil::binStr2HexStr(const std::string& digits, std::string& out) {
  out.assign((digits.size() + 3) / 4, '0');
  for (std::size_t i = 0; i < digits.size(); ++i) {
    if (digits[digits.size() - 1 - i] != '1') continue;
    char& digit = out[out.size() - 1 - i / 4];
    digit = hexDigits[digitValue(digit) | 1U << i % 4];
  }
  return out;
}

std::string& Qor_NumberUtil::hexStr2BinStr(const char* hex, unsigned digitCount, std::string& out) {
  const std::string text = hex;
  out.assign(digitCount, '0');
  for (unsigned i = 0; i < digitCount && i / 4 < text.size(); ++i)
    if ((digitValue(text[text.size() - 1 - i / 4]) >> i % 4 & 1) != 0) out[digitCount - 1 - i] = '1';
  return out;
}

std::string& Qor_NumberUtil::bin2ReverseBinStr(const unsigned char* bytes, unsigned bitCount,
                                               std::string& out) {
  out.clear();
  for (unsigned i = 0; i < bitCount; ++i) out += bitOf(bytes, i) ? '1' : '0';
  return out;
}

void Qor_NumberUtil::reverseBinStr2Bin(const std::string& digits, unsigned char* bytes) {
  for (std::size_t i = 0; i < digits.size(); ++i) {
    const unsigned bit = 1U << i % 8;
    bytes[i / 8] = static_cast<unsigned char>(digits[i] == '1' ? bytes[i / 8] | bit : bytes[i / 8] & ~bit);
  }
}

}  // namespace QorRT
