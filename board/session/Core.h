/// @file
/// One VIO core, wherever it is: of a session of this process, or of a server.
#pragma once

#include <optional>
#include <vector>

#include "board/model/Assignment.h"
#include "board/model/Sample.h"
#include "board/session/OutputMemory.h"

namespace qor {

class QORBOARD_API Core {
 public:
  Core() = default;
  Core(const Core&) = delete;
  Core& operator=(const Core&) = delete;
  virtual ~Core();

  virtual QOR_CORE_REF ref() const = 0;
  virtual const QORVIO_CORE_INFO& info() const = 0;

  /// Reads all inputs in one exchange, into a sample from emptySample(). Allocates nothing. Throws Failure, with
  /// `sample` as it was.
  virtual void read(Sample& sample) = 0;

  /// Writes all of them in one exchange, later ones winning where they overlap. Throws Failure; then it is not known
  /// whether the core took the values.
  virtual void write(const std::vector<Assignment>& assignments) = 0;

  /// The value that an output was last given; nothing where that is not known of every bit. Outputs cannot be read.
  virtual std::optional<Bytes> lastGiven(const Signal& output) const = 0;

  /// Who gave it, and when, as far as is remembered.
  virtual std::optional<Gift> lastGift(const Signal& output) const;

  /// Keeps activity that was read and not shown, for whoever reads next. Never throws: what cannot be kept is lost.
  virtual void keepActivity(const Sample& unshown) noexcept;

  /// Keeps what the outputs were given, not only at the end: for hosts that run for long, and for those that are to know
  /// whether it was kept. Throws Failure.
  virtual void rememberOutputs() = 0;
};

/// The opposite of what the one-bit output was last given; `assumed` counts where that is not known. Throws WrongUse when
/// neither is there.
QORBOARD_API Assignment toggled(const Core& core, const Signal& output, std::optional<bool> assumed = {});

}  // namespace qor
