#include "platform/core/Qor_Frame.h"

#include <algorithm>
#include <cstdint>

#include "QorUtil.h"
#include "platform/core/Qor_Crc.h"

namespace QorRT {
namespace {

constexpr std::size_t prefixBits = 2, addressBits = 8, crcBits = 16, headBits = 16;

constexpr unsigned rejectedFlag = 1, noSuchCoreFlag = 2, refusedFlag = 4, pendingFlag = 8;
constexpr unsigned flagMask = 0xF, echoMask = 0xFF0, signatureMask = 0xF000, signature = 0xA000;

/// ORs the low 16 bits of `value` into the bits from `at` on, which must be 0.
void putBits(std::vector<unsigned char>& bytes, std::size_t at, unsigned value) {
  std::uint32_t word = std::uint32_t{value} << at % 8;
  for (std::size_t i = at / 8; word != 0; ++i, word >>= 8) bytes[i] |= static_cast<unsigned char>(word);
}

unsigned wordAt(const std::vector<unsigned char>& bytes, std::size_t at) {
  std::uint32_t word = 0;
  for (std::size_t i = (at + 15) / 8 + 1; i-- > at / 8;) word = word << 8 | bytes[i];
  return word >> at % 8 & 0xFFFF;
}

/// Payload, core index, code and CRC.
std::vector<unsigned char> buildMessage(const Qor_Frame& frame, unsigned coreIndex) {
  const std::size_t crcAt = frame.payloadBits + addressBits;
  std::vector<unsigned char> message((crcAt + crcBits + 7) / 8);
  if (frame.payload != nullptr) {
    std::copy_n(frame.payload->begin(), (frame.payloadBits + 7) / 8, message.begin());
  }
  putBits(message, frame.payloadBits, coreIndex | frame.code << 4);
  putBits(message, crcAt, crc16(message.data(), crcAt) ^ (frame.payloadBits & 0xFFFF));
  return message;
}

/// Replaces everything in `bytes` from bit `at` on; `message` reaches to their end.
void placeAt(std::vector<unsigned char>& bytes, std::size_t at, const std::vector<unsigned char>& message) {
  const std::size_t shift = at % 8;
  std::size_t index = at / 8;
  unsigned carry = bytes[index] & ((1U << shift) - 1);
  for (const unsigned char byte : message) {
    carry |= static_cast<unsigned>(byte) << shift;
    bytes[index++] = static_cast<unsigned char>(carry);
    carry >>= 8;
  }
  if (index < bytes.size()) bytes[index] = static_cast<unsigned char>(carry);
}

bool allBits(const std::vector<unsigned char>& bytes, std::size_t bitCount, unsigned char eight) {
  const auto last = bytes.begin() + static_cast<std::ptrdiff_t>(bitCount / 8);
  if (!std::all_of(bytes.begin(), last, [eight](unsigned char byte) { return byte == eight; })) return false;
  return bitCount % 8 == 0 || ((*last ^ eight) & ((1U << bitCount % 8) - 1)) == 0;
}

bool crcHolds(const std::vector<unsigned char>& answer, std::size_t dataBits) {
  const std::size_t crcAt = headBits + dataBits;
  return wordAt(answer, crcAt) == (crc16(answer.data(), crcAt) ^ (dataBits & 0xFFFF));
}

Qor_Verdict judgeSilence(const std::vector<unsigned char>& answer, std::size_t bitCount) {
  if (allBits(answer, bitCount, 0x00)) return Qor_Verdict::allZeros;
  if (allBits(answer, bitCount, 0xFF)) return Qor_Verdict::allOnes;
  return Qor_Verdict::noSignature;
}

/// Of a head that echoes our frame or, of a frame that was not taken, an earlier one.
Qor_Verdict judgeFlags(unsigned flags) {
  if ((flags & rejectedFlag) != 0) return Qor_Verdict::rejected;
  if ((flags & refusedFlag) != 0) return Qor_Verdict::refused;
  if ((flags & noSuchCoreFlag) != 0) return Qor_Verdict::noSuchCore;
  return (flags & pendingFlag) != 0 ? Qor_Verdict::pending : Qor_Verdict::good;
}

std::string headText(const std::vector<unsigned char>& answer) {
  std::string digits;
  return Qor_NumberUtil::uInt2HexStr(answerHead(answer), headBits, digits);
}

}  // namespace

std::size_t frameLength(const Qor_Frame& frame) {
  return prefixBits + frame.payloadBits + addressBits + crcBits;
}

std::size_t answerLength(const Qor_Frame& frame) {
  return headBits + frame.answerBits + crcBits;
}

std::vector<unsigned char> buildScan(const Qor_Frame& frame, unsigned coreIndex, std::size_t scanBits) {
  const std::vector<unsigned char> message = buildMessage(frame, coreIndex);
  const std::size_t messageAt = scanBits - (frameLength(frame) - prefixBits);
  std::vector<unsigned char> scan((scanBits + 7) / 8, 0xFF);
  placeAt(scan, messageAt, message);
  const std::size_t zeroAt = messageAt - 1;
  scan[zeroAt / 8] &= static_cast<unsigned char>(~(1U << zeroAt % 8));
  return scan;
}

unsigned answerHead(const std::vector<unsigned char>& answer) {
  return wordAt(answer, 0);
}

Qor_Verdict judgeAnswer(const std::vector<unsigned char>& answer, const Qor_Frame& frame,
                        unsigned coreIndex) {
  const unsigned head = answerHead(answer);
  if ((head & signatureMask) != signature) return judgeSilence(answer, answerLength(frame));
  const unsigned flags = head & flagMask;
  const bool isEcho = (head & echoMask) == (coreIndex << 8 | frame.code << 4);
  if (!isEcho && (flags & (rejectedFlag | refusedFlag)) == 0) return Qor_Verdict::anotherFrame;
  // Nothing but a frame that was taken by its core has data behind the head.
  const bool hasData = isEcho && (flags & noSuchCoreFlag) == 0;
  return crcHolds(answer, hasData ? frame.answerBits : 0) ? judgeFlags(flags) : Qor_Verdict::badCrc;
}

std::string failureText(Qor_Verdict verdict, const std::vector<unsigned char>& answer,
                        const Qor_Frame& frame) {
  switch (verdict) {
    case Qor_Verdict::rejected:
      return "the frame was rejected";
    case Qor_Verdict::allZeros:
      return "no debug hub answers, TDO is all zeros";
    case Qor_Verdict::allOnes:
      return "no debug hub answers, TDO is all ones";
    case Qor_Verdict::noSignature:
      return "no debug hub answers, TDO is another pattern, head " + headText(answer);
    case Qor_Verdict::badCrc:
      return "the CRC of the answer does not hold over " + std::to_string(frame.answerBits) + " data bits";
    default:
      return "the answer is to another frame, head " + headText(answer);
  }
}

}  // namespace QorRT
