// The hub at the end of a user chain: takes frames to its cores and brings their results back.
#pragma once

#include <array>
#include <memory>

#include "Core.h"
#include "Frame.h"

namespace qorsim {

class Hub {
 public:
  static constexpr unsigned coreCount = 16;

  /// Puts a core behind the hub, at an index that is free.
  void add(unsigned index, std::unique_ptr<Core> core);

  /// A DR scan: replaces what TDI brings by what goes out, as many bits.
  void scan(Bits& stream);

  /// One design clock of every core.
  void clock();

 private:
  Bits answer() const;
  void obey(const Frame& frame, bool resultSeen);

  std::array<std::unique_ptr<Core>, coreCount> cores_;

  // The last accepted frame. A frame that finds no core or no such code is accepted too, and returns nothing.
  unsigned index_ = 0;
  unsigned code_ = 0xF;
  Core* core_ = nullptr;  // of cores_; null when there is none at that index

  // The fate of the last frame of all.
  Reply reply_ = Reply::accepted;
};

}  // namespace qorsim
