#include "board/session/LocalCore.h"

#include <algorithm>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/session/ActivityMemory.h"
#include "board/session/CableUrl.h"

namespace qor {
namespace {

QORVIO_CORE_INFO setUp(Link& link, QOR_CORE_REF ref) {
  if (QorVIO_initCore(link.session(), ref) != 0) failAt(link, ref);
  return readInfo(link, ref);
}

// Under which files of the state folder are kept; empty for a board that no other host can reach.
std::string keyOf(const Link& link, QOR_CORE_REF ref, const SharedState& state) {
  if (isNewBoard(link.url()) || state.folder.empty() || link.url().empty()) return {};
  return boardName(link.url()) + " " + refText(ref);
}

OutputMemory memoryOf(const Link& link, QOR_CORE_REF ref, const SharedState& state,
                      const QORVIO_CORE_INFO& info) {
  const std::string key = keyOf(link, ref, state);
  if (key.empty()) return OutputMemory(info, isNewBoard(link.url()));
  return {info, state.folder, key};
}

// Values and masks of one output port, for whole-port writes: `steps` images one after another.
struct PortWrite {
  PortWrite(unsigned portWidth, unsigned steps)
      : width(portWidth), values(steps * byteCount(portWidth)), mask(byteCount(portWidth)) {}

  void put(const Assignment& assignment, unsigned step) {
    const Bytes& value = assignment.steps[std::min<std::size_t>(step, assignment.steps.size() - 1)];
    for (unsigned i = 0; i < assignment.signal.width(); ++i) {
      setBit(values.data() + step * mask.size(), assignment.signal.bits[i], bitAt(value, i));
      setBit(mask, assignment.signal.bits[i], 1);
    }
    used = true;
  }
  unsigned count() const { return used ? width : 0; }

  unsigned width;
  Bytes values;
  Bytes mask;
  bool used = false;
};

}  // namespace

LocalCore::LocalCore(Link& link, QOR_CORE_REF ref, const SharedState& state)
    : link_(link),
      ref_(ref),
      state_(state),
      info_(setUp(link, ref)),
      memory_(memoryOf(link, ref, state, info_)) {}

LocalCore::~LocalCore() = default;

void LocalCore::claim() {
  const std::string key = keyOf(link_, ref_, state_);
  if (!key.empty() && !state_.isShared)
    claim_ = std::make_unique<Claim>(state_.folder, key, "core " + refText(ref_) + " of " + link_.url());
}

void LocalCore::keepActivity(const Sample& unshown) noexcept {
  try {
    if (activity_) activity_->keep(unshown);
  } catch (const std::exception&) {  // out of memory: nothing can be done about it
  }
}

void LocalCore::read(Sample& sample) {
  const bool isFirst = activity_ == nullptr;
  if (isFirst) claim();
  link_.check(QorVIO_getPortBits(link_.session(), ref_, sample.asyncIn.data(), sample.asyncUp.data(),
                                 sample.asyncDown.data(), info_.async_input_count, sample.syncIn.data(),
                                 sample.syncUp.data(), sample.syncDown.data(), sample.syncSyncUp.data(),
                                 sample.syncSyncDown.data(), info_.sync_input_count));
  if (!isFirst) return;
  const std::string key = keyOf(link_, ref_, state_);
  activity_ =
      key.empty() ? std::make_unique<ActivityMemory>() : std::make_unique<ActivityMemory>(state_.folder, key);
  activity_->giveTo(sample);
}

void LocalCore::write(const std::vector<Assignment>& assignments) {
  PortWrite async(info_.async_output_count, 1), sync(info_.sync_output_count, stepCount);
  for (const Assignment& each : assignments) {
    if (each.signal.port == Port::asyncOut) async.put(each, 0);
    for (unsigned step = 0; each.signal.port == Port::syncOut && step < stepCount; ++step)
      sync.put(each, step);
  }
  link_.check(QorVIO_setPortBits(link_.session(), ref_, async.values.data(), async.mask.data(), async.count(),
                                 sync.values.data(), sync.mask.data(), sync.count()));
  for (const Assignment& each : assignments) memory_.set(each.signal, each.steps.back());
}

}  // namespace qor
