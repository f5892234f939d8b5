// The hub at the end of a user chain: takes frames to its cores and brings their results back.
#pragma once

#include <array>
#include <memory>

#include "sim/Core.h"
#include "sim/Frame.h"

namespace qorsim {

class Hub {
 public:
  static constexpr unsigned coreCount = 16;

  /// Puts a core behind the hub, at an index that is free.
  void add(unsigned index, std::unique_ptr<Core> core);

  /// Capture-DR: what goes out first, with zeros behind it.
  Bits capture();

  /// Update-DR after that capture: all that TDI has brought since.
  void update(const Bits& received);

  /// One design clock of every core.
  void clock();

 private:
  Bits answer() const;
  void obey(const Frame& frame);

  std::array<std::unique_ptr<Core>, coreCount> cores_;

  // The last accepted frame. A frame that finds no core or no such code is accepted too, and returns nothing.
  unsigned index_ = 0;
  unsigned code_ = 0xF;
  Core* core_ = nullptr;  // of cores_; null when there is none at that index

  // The fate of the last frame of all.
  Reply reply_ = Reply::accepted;

  bool resultSeen_ = false;  // the last capture delivered a finished snapshot of core_
};

}  // namespace qorsim
