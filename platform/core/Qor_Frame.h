// One transfer as bits: the frame that the host shifts in, and the answer that the hub gives in the same scan. Pure
// functions over packed bits.
//
// Conventions
//  1. Bits are little-endian arrays: bit i is bit (i mod 8) of byte i / 8. Bit 0 is the first on the wire.
//  2. A frame is, from its first bit on: 1, 0, header (24 bits), CRC (32); of a write also payload and CRC (32). Ones
//     follow to the end of the scan.
//  3. An answer begins 1 TCK after the header's CRC, or after that of the payload if the hub takes it: 0, head (8),
//     zeros while the core waits for its design clock, 1, data, CRC (32).
//  4. Head: flags in bits 0-3, the signature A in bits 4-7.
//  5. One CRC-32 runs over header, payload if it is taken, head and data, and is read after each of header, payload
//     and data.
#pragma once

#include <cstddef>
#include <string>

#include "platform/core/Qor_Bits.h"
#include "platform/core/Qor_Crc.h"

namespace QorRT {

namespace Qor_HubCode {
inline constexpr unsigned status = 0x0;
inline constexpr unsigned write = 0x2;
inline constexpr unsigned read = 0x3;
inline constexpr unsigned readAgain = 0x5;  // keeps the activity of the read before
inline constexpr unsigned repeat = 0x8;     // beside one of the three above
}  // namespace Qor_HubCode

/// What a frame asks for.
struct Qor_Request {
  unsigned code;
  unsigned core;
  unsigned tag;
  std::size_t answerBits = 0;
  const Qor_Bytes* payload = nullptr;  // of a write; bits beyond payloadBits are 0
  std::size_t payloadBits = 0;
  unsigned repeat = 0;        // what a repeat's code has beside it; 0: it is asked for again as it is
  bool mayBeRefused = false;  // a refusal is an answer too
};

enum class Qor_Verdict {
  good,
  slow,       // taken, but the design clock has not done it yet
  noHub,      // nothing on TDO that begins as a hub does
  noHead,     // a hub that does not answer this frame
  wrongHead,  // without the signature
  badCrc,
};

/// What came back.
struct Qor_Answer {
  bool isRefused() const { return (head & 4) != 0; }
  bool isNoSuchCore() const { return (head & 2) != 0; }
  bool isOfTwoCores() const { return isRefused() && isNoSuchCore(); }  // nothing else has both
  unsigned flags() const { return head & 0xF; }

  Qor_Verdict verdict;
  unsigned head = 0;
  std::size_t waited = 0;  // zeros between head and data
  Qor_Bytes bits{};        // good: the data, and above them the low 16 bits of the CRC
};

/// A hub's scan as it came back, and how much later than at once its answer starts.
struct Qor_Capture {
  const Qor_Bytes& bits;
  std::size_t bitCount;
  std::size_t late;
};

class Qor_Frame {
 public:
  /// The payload must outlive this.
  explicit Qor_Frame(const Qor_Request& request);

  /// The length of a scan with `room` zeros of room for waiting.
  std::size_t scanBits(std::size_t room) const;

  /// A scan of `bitCount` bits that begins with the frame.
  Qor_Bytes scan(std::size_t bitCount) const;

  /// What the answer says, if it starts where it should.
  Qor_Answer judge(const Qor_Capture& capture) const;

 private:
  Qor_Answer judgeAt(const Qor_Capture& capture, std::size_t headAt, Qor_Crc32 crc) const;

  const Qor_Request request_;
  Qor_Crc32 afterHeader_, afterPayload_;
};

/// Where a hub's first bit, which is 1, is in its scan: 0 to 2; 3 when it does not.
std::size_t findHello(const Qor_Bytes& bits);

/// What is wrong, in words.
std::string failureText(const Qor_Answer& answer, const Qor_Capture& capture, const Qor_Request& request);

}  // namespace QorRT
