// What a session keeps of its transfers: how many they were, and how late the lines of each hub are. Any thread may
// look while the holder of the target lock adds.
#pragma once

#include <mutex>
#include <vector>

#include "QorExport.h"
#include "QorJtag_Host.h"

namespace QorRT {

class QOR_API Qor_LinkRecord {
 public:
  /// Adds every member.
  void add(const QorJtag_Statistics& part) noexcept;
  QorJtag_Statistics statistics() const noexcept;

  /// Not late, when nothing was kept of the hub.
  QorJtag_Hub hub(unsigned device, unsigned userChain) const noexcept;
  /// In the place of what was kept of the hub.
  void keep(const QorJtag_Hub& hub);
  /// By address.
  std::vector<QorJtag_Hub> hubs() const;

 private:
  mutable std::mutex mutex_;
  QorJtag_Statistics statistics_;
  std::vector<QorJtag_Hub> hubs_;
};

}  // namespace QorRT
