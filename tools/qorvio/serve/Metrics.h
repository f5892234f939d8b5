// What a server counts, for Prometheus.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "board/model/Sample.h"
#include "board/session/Link.h"

namespace qor::tool {

/// How many took at most so many seconds.
class Histogram {
 public:
  static constexpr std::array<double, 12> bounds{0.0001, 0.00025, 0.0005, 0.001, 0.0025, 0.005,
                                                 0.01,   0.025,   0.05,   0.1,   0.5,    1};

  void add(double seconds);
  void append(std::string& text, const std::string& name) const;

 private:
  std::array<std::uint64_t, bounds.size()> counts_{};  // each of its own bucket alone
  std::uint64_t count_ = 0;
  double sum_ = 0;
};

struct Counts {
  std::uint64_t polls = 0;   ///< that were done
  std::uint64_t missed = 0;  ///< that the rate asked for and the link was too slow for
  std::uint64_t failed = 0;
  std::uint64_t writes = 0;
  std::uint64_t frames = 0, snapshots = 0;  ///< sent, each to one client
  std::uint64_t refused = 0;                ///< connections without a good token, Host or Origin
  Histogram latency{};
};

/// What is so now.
struct Gauges {
  bool isUp = true;
  std::size_t clients = 0, claimed = 0, recordings = 0;
  QorJtag_Statistics link{};
};

/// The text format of Prometheus, with each of the inputs that has a scale or a unit.
std::string metricsText(const Counts& counts, const Gauges& gauges, const std::vector<Signal>& signals,
                        const std::vector<Sample>& samples);

}  // namespace qor::tool
