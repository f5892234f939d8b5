#include "platform/jtag/Qor_LinkRecord.h"

#include <algorithm>
#include <tuple>

namespace QorRT {
namespace {

using Guard = std::lock_guard<std::mutex>;

bool isBefore(const QorJtag_Hub& left, const QorJtag_Hub& right) {
  return std::tie(left.device_index, left.user_chain_number) <
         std::tie(right.device_index, right.user_chain_number);
}

}  // namespace

void Qor_LinkRecord::add(const QorJtag_Statistics& part) noexcept {
  const Guard guard(mutex_);
  for (const auto member : {&QorJtag_Statistics::transfers, &QorJtag_Statistics::bits,
                            &QorJtag_Statistics::nanoseconds, &QorJtag_Statistics::repeatsNoHub,
                            &QorJtag_Statistics::repeatsNoHead, &QorJtag_Statistics::repeatsBadCrc,
                            &QorJtag_Statistics::repeatsSlow, &QorJtag_Statistics::repeatsRefused})
    statistics_.*member += part.*member;
}

QorJtag_Statistics Qor_LinkRecord::statistics() const noexcept {
  const Guard guard(mutex_);
  return statistics_;
}

QorJtag_Hub Qor_LinkRecord::hub(unsigned device, unsigned userChain) const noexcept {
  const QorJtag_Hub unknown{device, userChain, 0, 0};
  const Guard guard(mutex_);
  const auto kept = std::lower_bound(hubs_.begin(), hubs_.end(), unknown, isBefore);
  return kept == hubs_.end() || isBefore(unknown, *kept) ? unknown : *kept;
}

void Qor_LinkRecord::keep(const QorJtag_Hub& hub) {
  const Guard guard(mutex_);
  const auto kept = std::lower_bound(hubs_.begin(), hubs_.end(), hub, isBefore);
  if (kept == hubs_.end() || isBefore(hub, *kept)) {
    hubs_.insert(kept, hub);
  } else {
    *kept = hub;
  }
}

std::vector<QorJtag_Hub> Qor_LinkRecord::hubs() const {
  const Guard guard(mutex_);
  return hubs_;
}

}  // namespace QorRT
