// Frames and answers of a debug hub as texts of '0' and '1', the first on the wire first: slow and obvious.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "tests/platform/WireBits.h"

/// A frame that is at the beginning of a scan.
struct SentFrame {
  explicit SentFrame(const Bits& scan) : header(scan.substr(2, 24)), bits(scan.size()) {
    const std::size_t last = scan.rfind('0');
    const bool isShort = last == scan.npos || last < 58;  // what follows are ones
    payload = code() % 8 != 2 || isShort ? "" : scan.substr(58, lastOf(scan) - 58);
    const Bits check = code() % 8 == 2 ? crc32Of(header + payload) : "";
    whole = scan ==
            (("10" + header + crc32Of(header) + payload + check).append(scan.size(), '1')).substr(0, bits);
  }

  unsigned code() const { return numberAt(0, 4); }
  unsigned tag() const { return numberAt(8, 16); }
  /// "CODE.TAG PAYLOAD /BITS", of the tag the last digit.
  std::string text() const {
    return (whole ? "" : "broken ") + hexOf(header.substr(0, 4)) + "." + hexOf(header.substr(8, 4)) + " " +
           (payload.empty() ? "" : hexOf(payload) + " ") + "/" + std::to_string(bits);
  }

  Bits header, payload;
  std::size_t bits;
  bool whole;

 private:
  unsigned numberAt(std::size_t at, std::size_t count) const {
    return static_cast<unsigned>(std::stoul(hexOf(header.substr(at, count)), nullptr, 16));
  }
  /// Where the payload ends: the longest one whose CRC follows it with nothing but ones after it.
  std::size_t lastOf(const Bits& scan) const {
    for (std::size_t end = scan.size() - 32; end > 58; --end) {
      const bool onesFollow = scan.find('0', end + 32) == scan.npos;
      if (onesFollow && scan.substr(end, 32) == crc32Of(header + scan.substr(58, end - 58))) return end;
    }
    return 58;
  }
};

/// What a hub says to a scan that begins with a frame, on a chain with one bypassed device.
struct Reply {
  unsigned head = 0xA0;  // 0: it says nothing
  Bits data{};
  std::size_t wait = 0;
  bool takesPayload = true;
  std::size_t lateTdi = 0, lateTdo = 0;
  bool isFlipped = false;  // in the CRC

  Bits to(const Bits& scan) const {
    const SentFrame sent(scan);
    const bool isTaken = takesPayload && !sent.payload.empty();
    Bits bits = Bits(lateTdo, '0') + "1" + Bits(58 + lateTdi, '0') +
                (isTaken ? Bits(sent.payload.size() + 32, '0') : "");
    if (head != 0) {
      const Bits crc = crc32Of(sent.header + (isTaken ? sent.payload : "") + bitsOf(head, 8) + data);
      bits += "0" + bitsOf(head, 8) + Bits(wait, '0') + "1" + data + crc;
    }
    if (isFlipped) bits[bits.size() - 5] ^= 1;
    return bits;
  }
};
