// The frames that the host sends to a debug hub, and the answers it gets: pure functions over packed bits.
//
// Conventions
//  1. Bits are little-endian arrays: bit i is bit (i mod 8) of byte i / 8. Bit 0 is the first on the wire.
//  2. A frame is, from its first bit on: 1, 0, payload, core index (4 bits), code (4), CRC (16).
//  3. An answer is: head (16 bits), data, CRC (16). Head: flags in bits 0-3, code in 4-7, core in 8-11, the
//     signature in 12-15. It speaks of the frame before the scan that fetched it.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace QorRT {

namespace Qor_HubCode {
inline constexpr unsigned status = 0x00;
inline constexpr unsigned write = 0x02;
inline constexpr unsigned read = 0x03;
inline constexpr unsigned acknowledge = 0x04;
inline constexpr unsigned readAgain = 0x05;  // keeps the activity of the read before
inline constexpr unsigned nothing = 0x0F;
}  // namespace Qor_HubCode

/// What a frame is to say, and how many data bits the answer to it has.
struct Qor_Frame {
  unsigned code = 0;
  std::size_t answerBits = 0;
  const std::vector<unsigned char>* payload = nullptr;  // bits beyond payloadBits are 0
  std::size_t payloadBits = 0;
};

enum class Qor_Verdict {
  good,
  pending,     // taken, but the design clock has not done it yet
  refused,     // not taken, because an earlier one is pending
  noSuchCore,  // or a code that the core does not know
  rejected,    // did not arrive whole
  allZeros,
  allOnes,
  noSignature,
  anotherFrame,
  badCrc,
};

/// The length of the shortest scan that holds the frame.
std::size_t frameLength(const Qor_Frame& frame);

/// The length of the scan that fetches the answer to the frame.
std::size_t answerLength(const Qor_Frame& frame);

/// A scan of `scanBits` bits, at least frameLength(), that ends with the frame; ones stand before it.
std::vector<unsigned char> buildScan(const Qor_Frame& frame, unsigned coreIndex, std::size_t scanBits);

/// The first 16 bits of an answer.
unsigned answerHead(const std::vector<unsigned char>& answer);

/// What the answer, answerLength() bits of it, says of the frame.
Qor_Verdict judgeAnswer(const std::vector<unsigned char>& answer, const Qor_Frame& frame, unsigned coreIndex);

/// What is wrong, of a verdict that no repetition would mend.
std::string failureText(Qor_Verdict verdict, const std::vector<unsigned char>& answer,
                        const Qor_Frame& frame);

}  // namespace QorRT
