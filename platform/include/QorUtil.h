/// @file
/// libQorUtil: byte buffers, and conversions between numbers, bytes and texts.
///
/// Conventions
///
///  1. A buffer is a little-endian bit array: bit i is bit (i mod 8) of byte i / 8.
///  2. A hexadecimal text is such an array read as one number: most significant digit first, upper case,
///     leading zeros kept. Reading accepts both cases.
///  3. A digit string ('0'/'1') of length D is a binary number: digit k is bit D-1-k.
///  4. A reverse digit string is the opposite: character i is bit i.
///  5. Nothing here keeps state; any thread may call anything. Failures are logic_error, and leave buffers as
///     they were and no half-made text: an output string is empty then, or as it was. Using an output again
///     that is large enough allocates nothing.
#pragma once

#include <string>
#include <vector>

#include "QorExport.h"

namespace QorRT {

/// Bytes of a fixed count, or a zero-terminated text held in them.
class QOR_API Qor_ByteBuffer {
 public:
  /// No bytes.
  Qor_ByteBuffer() = default;

  /// `size` bytes, all zero. The two further numbers are hints for buffers that grow; these never do, and
  /// take no notice of them.
  Qor_ByteBuffer(unsigned size, unsigned initialHint, unsigned growthHint);

  /// The number of bytes; of a text, its terminating zero included.
  unsigned getSize() const { return static_cast<unsigned>(bytes_.size()); }

  /// The bytes; null only for a buffer without any. Valid until the buffer is assigned to or destroyed.
  /// @{
  unsigned char* uPtr() { return bytes_.data(); }
  const unsigned char* uPtr() const { return bytes_.data(); }
  /// @}

  /// The same bytes as characters.
  /// @{
  char* ptr() { return reinterpret_cast<char*>(bytes_.data()); }
  const char* ptr() const { return reinterpret_cast<const char*>(bytes_.data()); }
  /// @}

  /// Byte `index`, which must be below getSize().
  /// @{
  unsigned char& operator[](unsigned index) { return bytes_[index]; }
  unsigned char operator[](unsigned index) const { return bytes_[index]; }
  /// @}

  /// The unsigned value of the `length` bits (1 to 32) from bit `offset` on. Throws when they do not all lie
  /// in the buffer.
  unsigned getBits(unsigned offset, unsigned length) const;

  /// Replaces `out` by the zero-terminated hexadecimal text of bytes `firstByte` to the end: two digits a
  /// byte. `out` may be this buffer. Throws when `firstByte` is above getSize().
  void bin2HexString(unsigned firstByte, Qor_ByteBuffer& out) const;

  /// A new buffer, which the caller deletes, with the zero-terminated hexadecimal text of the `count` bits
  /// from bit `first` on: exactly ceil(count / 4) digits. Throws when the bits do not all lie in the buffer.
  Qor_ByteBuffer* bin2HexString(unsigned first, unsigned count) const;

  /// Of a buffer that holds a hexadecimal text: a new buffer, which the caller deletes, of (last - first + 1)
  /// / 2 bytes (rounded up) with the number that digits `first` to `last` spell, least significant byte
  /// first. Throws when `last` is below `first`, or a digit is missing or not hexadecimal.
  Qor_ByteBuffer* hex2Bin(unsigned first, unsigned last) const;

 private:
  std::vector<unsigned char> bytes_;
};

/// Conversions. Those with an output string replace its content and return it.
class QOR_API Qor_NumberUtil {
 public:
  /// Plain decimal, whatever the locale.
  static std::string& uInt2DecStr(unsigned value, std::string& out);

  /// `bitWidth` / 4 digits, zero-padded on the left; `bitWidth` is 4 to 32 and a multiple of 4. Throws when
  /// the value is wider: a shortened address would reach another device.
  static std::string& uInt2HexStr(unsigned value, unsigned bitWidth, std::string& out);

  /// The hexadecimal text, ceil(length / 4) digits, of a digit string; a length that is no multiple of 4 is
  /// padded on the left. Throws on a character other than '0' and '1'. `digits` and `out` must be different
  /// strings.
  static std::string& binStr2HexStr(const std::string& digits, std::string& out);

  /// The low `digitCount` bits of a zero-terminated hexadecimal text as a digit string, zero-extended on the
  /// left. Throws on a character that is not a hexadecimal digit, wherever it stands.
  static std::string& hexStr2BinStr(const char* hex, unsigned digitCount, std::string& out);

  /// The first `bitCount` bits as a reverse digit string. `bytes` holds ceil(bitCount / 8) bytes and may be
  /// null when `bitCount` is 0.
  static std::string& bin2ReverseBinStr(const unsigned char* bytes, unsigned bitCount, std::string& out);

  /// Sets bit i of `bytes` where character i is '1' and clears it where it is any other. `bytes` holds
  /// ceil(length / 8) bytes; bits at and above the length stay as they are.
  static void reverseBinStr2Bin(const std::string& digits, unsigned char* bytes);
};

}  // namespace QorRT
