#include <algorithm>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <string>

#include "QorUtil.h"
#include "platform/util/Qor_DigitTables.h"

namespace QorRT {
namespace {

void requireBits(std::uint64_t first, std::uint64_t count, std::uint64_t size) {
  if (first + count <= size * 8) return;
  throw std::logic_error(std::to_string(count) + " bits from bit " + std::to_string(first) +
                         " on do not lie in a buffer of " + std::to_string(size) + " bytes");
}

/// Bits `first` to `first` + 7; those beyond the end of the buffer are unspecified.
unsigned byteAtBit(const unsigned char* bytes, std::size_t lastByte, std::size_t first) {
  const std::size_t index = first / 8;
  const unsigned next = bytes[std::min(index + 1, lastByte)];
  return (next << 8 | bytes[index]) >> first % 8 & 0xFF;
}

void putPair(char* text, unsigned byte) {
  std::memcpy(text, &hexPairs[byte], 2);
}

}  // namespace

Qor_ByteBuffer::Qor_ByteBuffer(unsigned size, unsigned, unsigned) : bytes_(size) {}

unsigned Qor_ByteBuffer::getBits(unsigned offset, unsigned length) const {
  if (length < 1 || length > 32) {
    throw std::logic_error("a field of " + std::to_string(length) + " bits is not 1 to 32 bits long");
  }
  requireBits(offset, length, bytes_.size());
  std::uint64_t word = 0;
  for (std::size_t i = (std::size_t{offset} + length - 1) / 8 + 1; i-- > offset / 8;)
    word = word << 8 | bytes_[i];
  return static_cast<unsigned>(word >> offset % 8 & ((std::uint64_t{1} << length) - 1));
}

void Qor_ByteBuffer::bin2HexString(unsigned firstByte, Qor_ByteBuffer& out) const {
  if (firstByte > bytes_.size()) {
    throw std::logic_error("byte " + std::to_string(firstByte) + " does not lie in a buffer of " +
                           std::to_string(bytes_.size()) + " bytes");
  }
  if (&out == this) {
    const Qor_ByteBuffer bytes = *this;
    return bytes.bin2HexString(firstByte, out);
  }
  out.bytes_.resize(2 * (bytes_.size() - firstByte) + 1);
  char* digits = out.ptr();
  const unsigned char* const first = bytes_.data() + firstByte;
  for (const unsigned char* byte = bytes_.data() + bytes_.size(); byte != first; digits += 2)
    putPair(digits, *--byte);
  *digits = '\0';
}

Qor_ByteBuffer* Qor_ByteBuffer::bin2HexString(unsigned first, unsigned count) const {
  requireBits(first, count, bytes_.size());
  auto text = std::make_unique<Qor_ByteBuffer>();
  text->bytes_.resize((std::size_t{count} + 3) / 4 + 1);
  char* digits = text->ptr();
  std::size_t whole = count / 8;
  if (const unsigned rest = count % 8; rest != 0) {
    const unsigned byte = byteAtBit(bytes_.data(), bytes_.size() - 1, first + whole * 8) & ((1U << rest) - 1);
    if (rest > 4) *digits++ = hexPairs[byte].high;
    *digits++ = hexPairs[byte].low;
  }
  for (; whole-- > 0; digits += 2)
    putPair(digits, byteAtBit(bytes_.data(), bytes_.size() - 1, first + whole * 8));
  return text.release();
}

Qor_ByteBuffer* Qor_ByteBuffer::hex2Bin(unsigned first, unsigned last) const {
  if (last < first || last >= bytes_.size()) {
    throw std::logic_error("digits " + std::to_string(first) + " to " + std::to_string(last) +
                           " do not lie in a text of " + std::to_string(bytes_.size()) + " bytes");
  }
  const std::size_t count = std::size_t{last} - first + 1;
  auto number = std::make_unique<Qor_ByteBuffer>();
  number->bytes_.resize((count + 1) / 2);
  const unsigned char* end = bytes_.data() + last + 1;
  unsigned char* byte = number->uPtr();
  unsigned seen = 0;  // notHex alone has the bits above the low four
  for (std::size_t i = 0; i < count / 2; ++i) {
    end -= 2;
    const unsigned high = hexValues[end[0]], low = hexValues[end[1]];
    seen |= high | low;
    *byte++ = static_cast<unsigned char>(high << 4 | low);
  }
  if (count % 2 != 0) seen |= * byte = hexValues[*--end];
  if (seen > 15) throw std::logic_error("the text has a character that is not a hexadecimal digit");
  return number.release();
}

}  // namespace QorRT
