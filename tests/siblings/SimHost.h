// A plain host for tests of the simulated chain: it sends frames and takes answers apart, bit by bit.
#pragma once

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "Sim.h"

/// Texts of bits are in wire order; texts of digits are the other way round, as port data is written.
class SimHost {
 public:
  explicit SimHost(qorsim::SimCable& cable, unsigned device = 0, unsigned userChain = 1, unsigned core = 0)
      : cable_(cable), device_(device), core_(core) {
    cable_.scanIr(device, userChain);
  }

  static std::string number(unsigned value, unsigned count) {
    std::string bits;
    for (unsigned i = 0; i < count; ++i) bits += value >> i & 1 ? '1' : '0';
    return bits;
  }

  static std::string reversed(std::string text) {
    std::reverse(text.begin(), text.end());
    return text;
  }

  static std::string crc(const std::string& bits, std::size_t dataLength) {
    unsigned crc = 0xFFFF;
    for (const char bit : bits) crc = (crc ^ static_cast<unsigned>(bit)) & 1 ? crc >> 1 ^ 0x8408 : crc >> 1;
    return number(~crc ^ static_cast<unsigned>(dataLength), 16);
  }

  static std::string hex(const std::string& bits) {
    std::string text;
    for (std::size_t i = 0; i < bits.size(); i += 4) {
      unsigned digit = 0;
      for (std::size_t j = i; j < std::min(i + 4, bits.size()); ++j)
        digit |= (bits[j] == '1' ? 1u : 0u) << (j - i);
      text += "0123456789ABCDEF"[digit];
    }
    return reversed(text);
  }

  std::string frame(unsigned code, const std::string& digits = "") const {
    const std::string body = reversed(digits) + number(core_, 4) + number(code, 4);
    return "10" + body + crc(body, digits.size());
  }

  /// One DR scan of exactly these bits, then Run-Test/Idle; returns the bits that came back.
  std::string scan(const std::string& bits, unsigned idle = 8) {
    std::vector<unsigned char> out((bits.size() + 7) / 8);
    for (std::size_t i = 0; i < bits.size(); ++i)
      out[i / 8] = static_cast<unsigned char>(out[i / 8] | (bits[i] - '0') << i % 8);
    const std::size_t number = cable_.scanDr(device_, std::move(out), bits.size(), true);
    cable_.idle(idle);
    const std::vector<unsigned char>& in = cable_.captured(number);
    std::string back;
    for (std::size_t i = 0; i < bits.size(); ++i) back += in[i / 8] >> i % 8 & 1 ? '1' : '0';
    return back;
  }

  /// Sends a frame in a scan that fetches `count` digits: "HEAD DIGITS", the head in hexadecimal. An answer
  /// with a wrong CRC, or with anything behind it, is returned as "damaged".
  std::string sendFrame(const std::string& frame, std::size_t count = 0) {
    const std::size_t length = std::max(frame.size(), 32 + count);
    const std::string in = scan(std::string(length - frame.size(), '1') + frame);
    const std::string body = in.substr(0, 16 + count);
    if (in != body + crc(body, count) + std::string(length - 32 - count, '0')) return "damaged";
    return hex(in.substr(0, 16)) + (count == 0 ? "" : " " + reversed(in.substr(16, count)));
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
