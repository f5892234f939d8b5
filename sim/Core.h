// A core as its hub sees it.
#pragma once

#include <utility>

#include "sim/Bits.h"

namespace qorsim {

enum class Reply { accepted, rejected, noSuchCode, refused };

/// A core of any type: it delivers its status word. Kinds of cores add codes of their own.
class Core {
 public:
  explicit Core(Bits statusWord) : statusWord_(std::move(statusWord)) {}
  virtual ~Core() = default;

  Core(const Core&) = delete;
  Core& operator=(const Core&) = delete;

  /// Update-DR with a command for this core; `resultSeen` tells that the Capture-DR of the same scan
  /// delivered a finished snapshot of it. Only an accepted command changes anything.
  virtual Reply command(unsigned code, const Bits& payload, bool resultSeen);

  /// What an accepted command returns, least significant bit first.
  virtual Bits result(unsigned code) const;

  /// Whether a command still waits for the design clock.
  virtual bool pending() const { return false; }

  /// One design clock.
  virtual void clock() {}

 private:
  Bits statusWord_;
};

}  // namespace qorsim
