/// @file
/// A VIO core of a session of this process.
#pragma once

#include <string>

#include "board/session/Core.h"
#include "board/session/Link.h"
#include "board/session/OutputMemory.h"

namespace qor {

class QORBOARD_API LocalCore : public Core {
 public:
  /// Sets the core up. What its outputs were given is remembered in `stateFolder`; with an empty one, only meanwhile.
  /// Throws Failure. The link must outlive it.
  LocalCore(Link& link, QOR_CORE_REF ref, const std::string& stateFolder = {});

  QOR_CORE_REF ref() const override { return ref_; }
  const QORVIO_CORE_INFO& info() const override { return info_; }
  void read(Sample& sample) override;
  void write(const std::vector<Assignment>& assignments) override;
  std::optional<Bytes> lastGiven(const Signal& output) const override { return memory_.lastGiven(output); }
  void rememberOutputs() override { memory_.save(); }

 private:
  Link& link_;
  QOR_CORE_REF ref_;
  QORVIO_CORE_INFO info_{};
  OutputMemory memory_;
};

}  // namespace qor
