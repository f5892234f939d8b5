/// @file
/// One recording: its polls in step with a period, and what it writes, whole whatever ends it.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "board/Export.h"
#include "board/model/Condition.h"
#include "board/record/Poller.h"
#include "board/record/SampleWriter.h"
#include "board/session/Stop.h"

namespace qor {

struct Limits {
  std::uint64_t samples = 0;           ///< 0: as many as the time allows
  std::chrono::nanoseconds time{0};    ///< 0: as long as the samples take
  std::chrono::nanoseconds period{0};  ///< between polls; 0: at the full rate

  /// Samples are kept from the one on that makes it true. Edges count from the beginning on.
  std::optional<Condition> when{};
  std::uint64_t before = 0;  ///< samples that are kept before that one; they take memory meanwhile
  std::uint64_t after =
      0;  ///< samples after it, which end the recording; 0: as many as the other limits allow

  /// Ends the recording with the sample that makes it true, after that of `when`.
  std::optional<Condition> until{};
};

struct Recorded {
  std::uint64_t samples = 0;
  std::uint64_t missed = 0;  ///< polls that the period asked for and the link was too slow for
  bool isTriggered = false;  ///< whether `when` was true, if there is one
};

/// "N samples in PATH", and how many polls were missed if any were.
QORBOARD_API std::string summary(const Recorded& recorded, const std::string& path);

/// Called after every sample, with the time since the recording began.
using OnSample = std::function<void(const Recorded& recorded, std::chrono::nanoseconds now)>;

/// Samples the inputs until a limit is reached or `stop` says so. Times in the file count from its first sample on. When
/// the link fails, ends the writer with what was recorded until then, adds to `recorded`, and throws Failure. Throws
/// Timeout, with the writer ended, when the time is over before the trigger; WrongUse for `before` or `after` without it.
QORBOARD_API void record(SampleWriter& writer, Poller& poller, const std::vector<Signal>& inputs,
                         const Limits& limits, Recorded& recorded, const StopFunction& stop = {},
                         const OnSample& onSample = {});

/// The same to a file, by the ending of its path as for sampleWriter(); a Failure then says "why; kept" and the summary.
QORBOARD_API Recorded recordTo(const std::string& path, Poller& poller, const std::vector<Signal>& inputs,
                               const Limits& limits, const StopFunction& stop = {},
                               const OnSample& onSample = {});

/// The samples of one input, one after another.
struct SampledInput {
  std::size_t bytesEach;             ///< of a value
  Bytes values;                      ///< as many values as there are samples
  std::vector<unsigned char> moves;  ///< one per sample: 1 rose, 2 fell, 4 sync rose, 8 sync fell, added
};

struct Samples {
  std::vector<std::int64_t> nanoseconds;  ///< since the recording began, one per sample
  std::vector<std::uint64_t> missed;      ///< polls that were missed before the sample
  std::optional<std::size_t> trigger{};   ///< which sample made `when` true
  std::vector<SampledInput> inputs;
};

/// The same to arrays, which are allocated at once where `limits` says how many samples there will be. Throws Failure,
/// and then nothing is kept.
QORBOARD_API Samples recordToArrays(Poller& poller, const std::vector<Signal>& inputs, const Limits& limits,
                                    const StopFunction& stop = {});

}  // namespace qor
