/// @file
/// A VIO core of a session of this process.
#pragma once

#include <memory>
#include <string>

#include "board/session/Claim.h"
#include "board/session/Core.h"
#include "board/session/Link.h"
#include "board/session/OutputMemory.h"

namespace qor {

class ActivityMemory;

/// What a core has in common with the other hosts of this user: nothing, without a folder.
struct SharedState {
  std::string folder{};
  bool isShared = false;  ///< read it though another host does
};

class QORBOARD_API LocalCore : public Core {
 public:
  /// Sets the core up. Throws Failure. The link must outlive it.
  LocalCore(Link& link, QOR_CORE_REF ref, const SharedState& state = {});
  ~LocalCore() override;

  QOR_CORE_REF ref() const override { return ref_; }
  const QORVIO_CORE_INFO& info() const override { return info_; }

  /// Its first read claims the core, and has the activity that hosts before have kept. Throws Busy.
  void read(Sample& sample) override;
  void write(const std::vector<Assignment>& assignments) override;
  std::optional<Bytes> lastGiven(const Signal& output) const override { return memory_.lastGiven(output); }
  std::optional<Gift> lastGift(const Signal& output) const override { return memory_.lastGift(output); }
  void keepActivity(const Sample& unshown) noexcept override;
  void rememberOutputs() override { memory_.save(); }

 private:
  void claim();

  Link& link_;
  QOR_CORE_REF ref_;
  SharedState state_;
  QORVIO_CORE_INFO info_{};
  OutputMemory memory_;
  std::unique_ptr<Claim> claim_;
  std::unique_ptr<ActivityMemory> activity_;  // null until the first read
};

}  // namespace qor
