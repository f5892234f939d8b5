// A plain host for tests of the simulated chain: it sends frames and takes answers apart, bit by bit.
#pragma once

#include <algorithm>
#include <string>

#include "Sim.h"
#include "tests/platform/WireBits.h"

/// Texts of bits are in wire order; texts of digits are the other way round, as port data is written.
class SimHost {
 public:
  explicit SimHost(qorsim::SimCable& cable, unsigned device = 0, unsigned userChain = 1, unsigned core = 0)
      : cable_(cable), device_(device), core_(core) {
    cable_.scanIr(device, userChain);
  }

  static std::string reversed(std::string text) {
    std::reverse(text.begin(), text.end());
    return text;
  }

  std::string frame(unsigned code, const std::string& digits = "") const {
    const std::string body = reversed(digits) + bitsOf(core_, 4) + bitsOf(code, 4);
    return "10" + body + checkOf(body, digits.size());
  }

  /// One DR scan of exactly these bits, then Run-Test/Idle; returns the bits that came back.
  std::string scan(const std::string& bits, unsigned idle = 8) {
    const std::size_t number = cable_.scanDr(device_, bytesOf(bits), bits.size(), true);
    cable_.idle(idle);
    return bitsOfBytes(cable_.captured(number), bits.size());
  }

  /// Sends a frame in a scan that fetches `count` digits: "HEAD DIGITS", the head in hexadecimal. An answer
  /// with a wrong CRC, or with anything behind it, is returned as "damaged".
  std::string sendFrame(const std::string& frame, std::size_t count = 0) {
    const std::size_t length = std::max(frame.size(), 32 + count);
    const std::string in = scan(std::string(length - frame.size(), '1') + frame);
    const std::string body = in.substr(0, 16 + count);
    if (in != body + checkOf(body, count) + std::string(length - 32 - count, '0')) return "damaged";
    return hexOf(in.substr(0, 16)) + (count == 0 ? "" : " " + reversed(in.substr(16, count)));
  }

  std::string send(unsigned code, const std::string& digits = "", std::size_t count = 0) {
    return sendFrame(frame(code, digits), count);
  }

  /// Snapshot, without acknowledging it: the digits of the records.
  std::string read(std::size_t count, unsigned code = 3) {
    send(code);
    return send(0xF, "", count).substr(5);
  }

 private:
  qorsim::SimCable& cable_;
  unsigned device_;
  unsigned core_;
};
