// The output ports of a core, bit by bit, and the one text that writes them.
#pragma once

#include <array>
#include <string>
#include <vector>

#include "tests/fuzz/Fuzz.h"

/// A name: bit i of its value is bit `bits[i]` of the port.
struct Group {
  bool isInput, isSync;
  std::vector<unsigned> bits;
  unsigned bytes() const { return static_cast<unsigned>(bits.size() + 7) / 8; }
};

struct OutputModel {
  OutputModel(unsigned asyncWidth, unsigned syncWidth)
      : async(asyncWidth, '0'), asyncMask(async), syncMask(syncWidth, '0'), trains(syncWidth) {
    for (auto& train : trains) train.fill('0');
  }

  void clearMasks() {
    asyncMask.assign(asyncMask.size(), '0');
    syncMask.assign(syncMask.size(), '0');
  }

  /// Stages the value whose bit i at step s is `bit(s, i)`.
  template <typename Bit>
  void stage(const Group& group, Bit bit) {
    for (unsigned i = 0; i < group.bits.size(); ++i) {
      const unsigned position = group.bits[i];
      (group.isSync ? syncMask : asyncMask)[position] = '1';
      for (unsigned s = 0; s < (group.isSync ? 16 : 1); ++s)
        (group.isSync ? trains[position][s] : async[position]) = bit(s, i) ? '1' : '0';
    }
  }

  /// The command text, empty without outputs: a binary number, its first digit the most significant.
  std::string command() const {
    std::string digits = async;
    for (const auto& train : trains) digits.append(train.begin(), train.end());
    digits += asyncMask + syncMask;
    if (digits.empty()) return "";
    const std::string count = hexText(static_cast<unsigned>(digits.size() + 1), 8);
    digits.insert(0, (4 - digits.size() % 4) % 4, '0');
    std::string hex;
    for (std::size_t k = 0; k < digits.size(); k += 4)
      hex += hexText(static_cast<unsigned>(std::stoul(digits.substr(k, 4), nullptr, 2)), 1);
    return "sequence 00 1 0 01 0 " + count + " " + hex + "\n00 1 0 02 0 00000004 0\n";
  }

  std::string async, asyncMask, syncMask;
  std::vector<std::array<char, 16>> trains;
};
