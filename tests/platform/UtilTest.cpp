#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>

#include "QorUtil.h"
#include "tests/platform/ThrownBy.h"
#include "tests/platform/WireBits.h"

namespace {

using QorRT::Qor_ByteBuffer;
using QorRT::Qor_NumberUtil;

Qor_ByteBuffer bufferOf(const std::vector<unsigned char>& bytes) {
  Qor_ByteBuffer buffer(static_cast<unsigned>(bytes.size()), 10, 10);
  std::copy(bytes.begin(), bytes.end(), buffer.uPtr());
  return buffer;
}

Qor_ByteBuffer textOf(const std::string& text) {
  return bufferOf(std::vector<unsigned char>(text.c_str(), text.c_str() + text.size() + 1));
}

TEST(NumberUtil, ConvertsDigitStringsOfEveryLength) {
  for (unsigned length = 0; length < 140; ++length) {
    const Bits digits = noise(length, 5);
    std::string out = "before";
    EXPECT_EQ(Qor_NumberUtil::binStr2HexStr(digits, out), hexOf(Bits(digits.rbegin(), digits.rend())));
    for (const unsigned count : {0U, 1U, 3U, 8U, length, length + 1, length + 9}) {
      std::string low = Bits(count, '0') + digits;
      low.erase(0, low.size() - count);
      std::string back;
      EXPECT_EQ(Qor_NumberUtil::hexStr2BinStr(out.c_str(), count, back), low) << out;
    }
    const Bits bits = noise(length, 9);
    std::vector<unsigned char> bytes = bytesOf(bits);
    EXPECT_EQ(Qor_NumberUtil::bin2ReverseBinStr(bytes.data(), length, out), bits);
    Bits others = bits;
    std::replace(others.begin(), others.end(), '0', length % 2 != 0 ? '\xB1' : '3');
    for (const unsigned before : {0x00U, 0xFFU}) {
      std::vector<unsigned char> set(bytes.size() + 1, static_cast<unsigned char>(before));
      Qor_NumberUtil::reverseBinStr2Bin(others, set.data());
      EXPECT_EQ(set, bytesOf(bits + bitsOf(before * 0x101, set.size() * 8 - length)));
    }
  }
  std::string out = "before";
  EXPECT_EQ(Qor_NumberUtil::bin2ReverseBinStr(nullptr, 0, out), "");
}

TEST(NumberUtil, WritesNumbersOrRefusesWhatItCannotConvert) {
  const std::string notHex = "logic: the text has a character that is not a hexadecimal digit";
  std::string out = "before";
  const auto hexOfNumber = [&](unsigned value, unsigned width) {
    return resultOf([&] { return Qor_NumberUtil::uInt2HexStr(value, width, out); });
  };
  EXPECT_EQ(hexOfNumber(256, 8), "logic: 256 is wider than 8 bits");
  EXPECT_EQ(hexOfNumber(0, 6), "logic: a width of 6 bits is not 4 to 32 in steps of 4");
  EXPECT_EQ(hexOfNumber(0, 36), "logic: a width of 36 bits is not 4 to 32 in steps of 4");
  EXPECT_EQ(out, "before");
  EXPECT_EQ(hexOfNumber(0, 8), "00");
  EXPECT_EQ(hexOfNumber(0x1ABCDEF, 32), "01ABCDEF");
  EXPECT_EQ(Qor_NumberUtil::uInt2DecStr(4294967295, out), "4294967295");
  for (std::size_t at = 0; at < 19; ++at) {
    for (const char wrong : {'2', ' ', '/', '\0', '\xB0'}) {
      Bits digits = noise(19);
      digits[at] = wrong;
      EXPECT_EQ(thrownBy([&] { Qor_NumberUtil::binStr2HexStr(digits, out); }),
                "logic: character " + std::to_string(at) + " of the digit string is not a binary digit");
    }
    for (const char wrong : {'G', 'g', '/', ':', '@', '`', ' ', '\xC1'}) {
      std::string hex(19, 'A');
      hex[at] = wrong;
      EXPECT_EQ(thrownBy([&] { Qor_NumberUtil::hexStr2BinStr(hex.c_str(), 30, out); }), notHex);
      EXPECT_EQ(thrownBy([&] { delete textOf(hex).hex2Bin(0, 18); }), notHex);
    }
  }
  EXPECT_EQ(out, "");
}

TEST(ByteBuffer, TakesBitsOutAnywhere) {
  const Bits bits = noise(96);
  const Qor_ByteBuffer buffer = bufferOf(bytesOf(bits));
  for (unsigned first = 0; first <= 96; ++first) {
    for (unsigned count = 0; first + count <= 96; ++count) {
      const std::unique_ptr<Qor_ByteBuffer> text(buffer.bin2HexString(first, count));
      EXPECT_EQ(std::string(text->ptr()), hexOf(bits.substr(first, count)));
      EXPECT_EQ(text->getSize(), (count + 3) / 4 + 1);
      if (count < 1 || count > 32) continue;
      EXPECT_EQ(bitsOf(buffer.getBits(first, count), count), bits.substr(first, count));
    }
  }
}

TEST(ByteBuffer, TurnsIntoHexadecimalTextAndBack) {
  Qor_ByteBuffer buffer = bufferOf({0x12, 0xCB, 0xA0}), out = textOf("before");
  buffer.bin2HexString(1, out);
  EXPECT_STREQ(out.ptr(), "A0CB");
  buffer.bin2HexString(3, out);
  EXPECT_STREQ(out.ptr(), "");
  buffer.bin2HexString(0, buffer);
  EXPECT_STREQ(buffer.ptr(), "A0CB12");
  const auto bytes = [](const char* text, unsigned first, unsigned last) {
    const std::unique_ptr<Qor_ByteBuffer> number(textOf(text).hex2Bin(first, last));
    return std::vector<unsigned char>(number->uPtr(), number->uPtr() + number->getSize());
  };
  EXPECT_EQ(bytes("fA0cB12", 0, 6), std::vector<unsigned char>({0x12, 0xCB, 0xA0, 0x0F}));
  EXPECT_EQ(bytes("A0CB12", 1, 3), std::vector<unsigned char>({0xCB, 0x00}));
}

TEST(ByteBuffer, RefusesWhatDoesNotLieInIt) {
  const Qor_ByteBuffer two = bufferOf({0x31, 0x31}), none;
  Qor_ByteBuffer out = textOf("before");
  const auto field = [&](unsigned first, unsigned count) {
    return thrownBy([&] { two.getBits(first, count); });
  };
  const auto digits = [&](unsigned first, unsigned last) {
    return thrownBy([&] { delete two.hex2Bin(first, last); });
  };
  EXPECT_EQ(field(9, 8), "logic: 8 bits from bit 9 on do not lie in a buffer of 2 bytes");
  EXPECT_EQ(field(4294967295, 32), "logic: 32 bits from bit 4294967295 on do not lie in a buffer of 2 bytes");
  EXPECT_EQ(field(0, 0), "logic: a field of 0 bits is not 1 to 32 bits long");
  EXPECT_EQ(field(0, 33), "logic: a field of 33 bits is not 1 to 32 bits long");
  EXPECT_EQ(thrownBy([&] { two.bin2HexString(3, out); }),
            "logic: byte 3 does not lie in a buffer of 2 bytes");
  EXPECT_STREQ(out.ptr(), "before");
  EXPECT_EQ(thrownBy([&] { delete none.bin2HexString(0U, 1U); }),
            "logic: 1 bits from bit 0 on do not lie in a buffer of 0 bytes");
  EXPECT_EQ(digits(1, 0), "logic: digits 1 to 0 do not lie in a text of 2 bytes");
  EXPECT_EQ(digits(0, 2), "logic: digits 0 to 2 do not lie in a text of 2 bytes");
}

}  // namespace
