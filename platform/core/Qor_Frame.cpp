#include "platform/core/Qor_Frame.h"

#include <algorithm>

#include "QorUtil.h"

namespace QorRT {
namespace {

constexpr std::size_t startBits = 2, headerBits = 24, crcBits = 32, headBits = 8;
constexpr std::size_t frameBits = startBits + headerBits + crcBits;
constexpr std::size_t gapBits = 1;    // the 0 before the head
constexpr std::size_t readyBits = 1;  // the 1 before the data
constexpr std::size_t resultCrcBits = 16;
constexpr unsigned signature = 0xA;

std::uint32_t headerOf(const Qor_Request& request) {
  return request.code | request.core << 4 | request.tag << 8;
}

void addNumber(Qor_Crc32& crc, std::uint32_t value, std::size_t bitCount) {
  const unsigned char bytes[] = {static_cast<unsigned char>(value), static_cast<unsigned char>(value >> 8),
                                 static_cast<unsigned char>(value >> 16)};
  crc.add(bytes, bitCount);
}

/// The bits that the payload takes, with its CRC.
std::size_t payloadPart(const Qor_Request& request) {
  return request.payload == nullptr ? 0 : request.payloadBits + crcBits;
}

bool isAll(const Qor_Bytes& bits, std::size_t bitCount, unsigned char eight) {
  const auto last = bits.begin() + static_cast<std::ptrdiff_t>(bitCount / 8);
  if (!std::all_of(bits.begin(), last, [eight](unsigned char byte) { return byte == eight; })) return false;
  return bitCount % 8 == 0 || ((*last ^ eight) & ((1U << bitCount % 8) - 1)) == 0;
}

std::string hexText(std::uint32_t value, unsigned bits) {
  std::string digits;
  return Qor_NumberUtil::uInt2HexStr(value, bits, digits);
}

std::string silenceText(const Qor_Capture& capture) {
  const std::string text = "no debug hub answers, TDO is ";
  if (isAll(capture.bits, capture.bitCount, 0x00)) return text + "all zeros";
  if (isAll(capture.bits, capture.bitCount, 0xFF)) return text + "all ones";
  return text + "another pattern, its first 32 bits " + hexText(bitsAt(capture.bits, 0, 32), 32);
}

}  // namespace

Qor_Frame::Qor_Frame(const Qor_Request& request) : request_(request) {
  addNumber(afterHeader_, headerOf(request), headerBits);
  afterPayload_ = afterHeader_;
  if (request.payload != nullptr) afterPayload_.add(request.payload->data(), request.payloadBits);
}

std::size_t Qor_Frame::scanBits(std::size_t room) const {
  return frameBits + payloadPart(request_) + gapBits + headBits + room + readyBits + request_.answerBits +
         crcBits;
}

Qor_Bytes Qor_Frame::scan(std::size_t bitCount) const {
  Qor_Bytes bits(byteCount(bitCount), 0xFF);
  putBits(bits, 0, startBits, 1);
  putBits(bits, startBits, headerBits, headerOf(request_));
  putBits(bits, startBits + headerBits, crcBits, afterHeader_.value());
  if (request_.payload != nullptr) {
    placeBytes(bits, frameBits, *request_.payload);
    putBits(bits, frameBits + request_.payloadBits, crcBits, afterPayload_.value());
  }
  return bits;
}

Qor_Answer Qor_Frame::judge(const Qor_Capture& capture) const {
  const std::size_t headAt = capture.late + frameBits + gapBits;
  const bool isPayloadTaken = request_.payload != nullptr && bitsAt(capture.bits, headAt, headBits) == 0;
  return isPayloadTaken ? judgeAt(capture, headAt + payloadPart(request_), afterPayload_)
                        : judgeAt(capture, headAt, afterHeader_);
}

Qor_Answer Qor_Frame::judgeAt(const Qor_Capture& capture, std::size_t headAt, Qor_Crc32 crc) const {
  Qor_Answer answer{Qor_Verdict::noHead, bitsAt(capture.bits, headAt, headBits)};
  if (answer.head >> 4 != signature) {
    if (answer.head != 0) answer.verdict = Qor_Verdict::wrongHead;
    if (findHello(capture.bits) > 2) answer.verdict = Qor_Verdict::noHub;
    return answer;
  }
  const std::size_t readyAt = findOne(capture.bits, headAt + headBits, capture.bitCount);
  const std::size_t dataAt = readyAt + readyBits;
  const std::size_t dataBits = answer.isRefused() || answer.isNoSuchCore() ? 0 : request_.answerBits;
  answer.waited = readyAt - headAt - headBits;
  answer.verdict = Qor_Verdict::slow;
  if (dataAt + dataBits + crcBits > capture.bitCount) return answer;
  answer.bits = copyBits(capture.bits, dataAt, dataBits + resultCrcBits);
  addNumber(crc, answer.head, headBits);
  crc.add(answer.bits.data(), dataBits);
  const bool isRight = bitsAt(capture.bits, dataAt + dataBits, crcBits) == crc.value();
  answer.verdict = isRight ? Qor_Verdict::good : Qor_Verdict::badCrc;
  return answer;
}

std::size_t findHello(const Qor_Bytes& bits) {
  const std::size_t first = findOne(bits, 0, 3);
  const std::size_t end = first + 1 + 32;
  return first < 3 && findOne(bits, first + 1, end) == end ? first
                                                           : 3;  // ones, or an echo of the frame, are no hub
}

std::string failureText(const Qor_Answer& answer, const Qor_Capture& capture, const Qor_Request& request) {
  switch (answer.verdict) {
    case Qor_Verdict::noHub:
      return silenceText(capture);
    case Qor_Verdict::noHead:
      return "the hub did not answer the frame";
    case Qor_Verdict::wrongHead:
      return "the answer begins with " + hexText(answer.head, 8) + ", which is no head";
    default:
      return "the CRC of the answer does not hold over " + std::to_string(request.answerBits) + " data bits";
  }
}

}  // namespace QorRT
