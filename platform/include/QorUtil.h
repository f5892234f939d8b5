/// @file
/// libQorUtil: byte buffers, and conversions between numbers, bytes and texts.
///
/// Conventions
///
///  1. A buffer is a little-endian bit array: bit i is bit (i mod 8) of byte i / 8.
///  2. A hexadecimal text is such an array as one number: most significant digit first, upper case, with
///     leading zeros. Lower case is accepted too where a text is read.
///  3. A digit string ('0'/'1') of length D is a binary number: digit k is bit D-1-k.
///  4. A reverse digit string is the opposite: character i is bit i.
///  5. The functions have no state; any thread may call them. Failures are logic_error (bad_alloc if memory
///     runs out). After a failure buffers are as they were, and an output string is empty or as it was. An
///     output that is large enough is used again without an allocation.
#pragma once

#include <string>
#include <vector>

#include "QorExport.h"

namespace QorRT {

/// A fixed number of bytes, or a zero-terminated text in them.
class QOR_API Qor_ByteBuffer {
 public:
  /// No bytes.
  Qor_ByteBuffer() = default;

  /// `size` bytes, all zero. The other two arguments are hints for buffers that grow. These buffers do not
  /// grow, and ignore them.
  Qor_ByteBuffer(unsigned size, unsigned initialHint, unsigned growthHint);

  /// The number of bytes; for a text, with its terminating zero.
  unsigned getSize() const { return static_cast<unsigned>(bytes_.size()); }

  /// The bytes; null only for a buffer of size 0. Valid until the buffer is assigned to or destroyed.
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

  /// The unsigned value of the `length` bits (1 to 32) from bit `offset`. Throws unless all of them are in
  /// the buffer.
  unsigned getBits(unsigned offset, unsigned length) const;

  /// Replaces `out` by the zero-terminated hexadecimal text of the bytes from `firstByte` to the end: two
  /// digits per byte. `out` may be this buffer. Throws if `firstByte` is above getSize().
  void bin2HexString(unsigned firstByte, Qor_ByteBuffer& out) const;

  /// Returns a new buffer, which the caller deletes: the zero-terminated hexadecimal text of the `count` bits
  /// from bit `first`, exactly ceil(count / 4) digits. Throws unless all the bits are in the buffer.
  Qor_ByteBuffer* bin2HexString(unsigned first, unsigned count) const;

  /// For a buffer that is a hexadecimal text. Returns a new buffer, which the caller deletes: the number of
  /// the digits `first` to `last`, least significant byte first, (last - first + 1) / 2 bytes, rounded up.
  /// Throws if `last` is below `first`, or a digit is missing or not hexadecimal.
  Qor_ByteBuffer* hex2Bin(unsigned first, unsigned last) const;

 private:
  std::vector<unsigned char> bytes_;
};

/// Conversions. If there is an output string, its content is replaced, and it is returned.
class QOR_API Qor_NumberUtil {
 public:
  /// Plain decimal, whatever the locale.
  static std::string& uInt2DecStr(unsigned value, std::string& out);

  /// `bitWidth` / 4 hexadecimal digits, zero-padded on the left. `bitWidth` is 4 to 32 and a multiple of 4.
  /// Throws if the value is wider, because a truncated address would be that of another device.
  static std::string& uInt2HexStr(unsigned value, unsigned bitWidth, std::string& out);

  /// The hexadecimal text of a digit string: ceil(length / 4) digits. A length that is not a multiple of 4 is
  /// padded with zeros on the left. Throws for a character other than '0' and '1'. `digits` and `out` must be
  /// different strings.
  static std::string& binStr2HexStr(const std::string& digits, std::string& out);

  /// The low `digitCount` bits of a zero-terminated hexadecimal text as a digit string, zero-extended on the
  /// left. Throws if any character of the text is not a hexadecimal digit.
  static std::string& hexStr2BinStr(const char* hex, unsigned digitCount, std::string& out);

  /// The first `bitCount` bits as a reverse digit string. `bytes` (in) is ceil(bitCount / 8) bytes; it may be
  /// null if `bitCount` is 0.
  static std::string& bin2ReverseBinStr(const unsigned char* bytes, unsigned bitCount, std::string& out);

  /// Sets bit i of `bytes` (in, out; ceil(length / 8) bytes) if character i is '1', else clears it. Bits at
  /// and above the length stay as they are.
  static void reverseBinStr2Bin(const std::string& digits, unsigned char* bytes);
};

}  // namespace QorRT
