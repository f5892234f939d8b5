// A plain host for tests of the simulated chain: it makes scans and takes answers apart, bit by bit.
#pragma once

#include <algorithm>
#include <string>

#include "Sim.h"
#include "tests/platform/WireBits.h"

/// Texts of bits are in wire order; texts of digits are the other way round, as port data is written.
class SimHost {
 public:
  explicit SimHost(qorsim::SimCable& cable, unsigned device = 0, unsigned userChain = 1, unsigned core = 0)
      : cable_(cable), device_(device), core_(core), late_(cable.devices().size() - 1) {
    cable_.scanIr(device, userChain);
  }

  static std::string reversed(std::string text) {
    std::reverse(text.begin(), text.end());
    return text;
  }

  /// One DR scan; returns the bits that came back.
  Bits scan(const Bits& out) {
    const std::size_t number = cable_.scanDr(device_, bytesOf(out), out.size(), true);
    return bitsOfBytes(cable_.captured(number), out.size());
  }

  Bits header(unsigned code, unsigned tag) const {
    return bitsOf(code, 4) + bitsOf(core_, 4) + bitsOf(tag, 16);
  }

  static Bits frame(const Bits& header, const Bits& payload = "") {
    return "10" + header + crc32Of(header) + (payload.empty() ? "" : payload + crc32Of(header + payload));
  }

  /// Sends a frame with room for `count` digits and 8 waiting bits. Returns "HEAD DIGITS", the head in hexadecimal;
  /// "HEAD waits"; "silent"; or "damaged".
  std::string send(unsigned code, unsigned tag, std::size_t count = 0, const std::string& digits = "") {
    const Bits head = header(code, tag), payload = reversed(digits), out = frame(head, payload);
    const Bits in = scan(out + Bits(late_ + 50 + count, '1'));
    const std::size_t signature = in.find('1', 1);
    if (in[0] != '1' || signature == Bits::npos) return "silent";
    const bool isTaken = signature > late_ + out.size();
    return answer(in.substr(late_ + (isTaken ? out.size() : 58)), isTaken ? head + payload : head, count);
  }

 private:
  static std::string answer(const Bits& in, const Bits& understood, std::size_t count) {
    const Bits head = in.substr(1, 8);
    const std::size_t one = in.find('1', 9);
    if (one == Bits::npos) return hexOf(head) + " waits";
    const Bits data = head[1] == '1' || head[2] == '1' ? "" : in.substr(one + 1, count);
    const Bits due = data + crc32Of(understood + head + data), rest = in.substr(one + 1);
    if (rest.size() < due.size() || rest != due + Bits(rest.size() - due.size(), '0')) return "damaged";
    return hexOf(head) + (data.empty() ? "" : " " + reversed(data));
  }

  qorsim::SimCable& cable_;
  unsigned device_;
  unsigned core_;
  std::size_t late_;  // the answer, by the devices in BYPASS
};
