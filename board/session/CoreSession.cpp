#include "board/session/CoreSession.h"

#include <algorithm>

#include "board/model/Errors.h"

namespace qor {
namespace {

constexpr unsigned stepCount = 16;

Bytes room(unsigned width) {
  return Bytes((width + 7) / 8);
}

QORVIO_CORE_INFO setUp(Link& link, QOR_CORE_REF ref) {
  QORVIO_CORE_INFO info{};
  if (QorVIO_initCore(link.session(), ref) != 0)
    throw Failure("cannot set up the core " + refText(ref) + ": " + link.takeMessage());
  link.check(QorVIO_getInfo(link.session(), ref, &info));
  return info;
}

// Values and masks of one output port, for whole-port writes: `steps` images one after another.
struct PortWrite {
  PortWrite(unsigned portWidth, unsigned steps)
      : width(portWidth), values(steps * room(portWidth).size()), mask(room(portWidth)) {}

  void put(const Assignment& assignment, unsigned step) {
    const Bytes& value = assignment.steps[std::min<std::size_t>(step, assignment.steps.size() - 1)];
    unsigned char* const image = values.data() + step * mask.size();
    for (unsigned i = 0; i < assignment.signal.width(); ++i) {
      const unsigned bit = assignment.signal.bits[i];
      const auto place = static_cast<unsigned char>(1u << bit % 8);
      const bool one = bitAt(value.data(), i) != 0;
      image[bit / 8] = static_cast<unsigned char>(one ? image[bit / 8] | place : image[bit / 8] & ~place);
      mask[bit / 8] |= place;
    }
    used = true;
  }
  unsigned count() const { return used ? width : 0; }

  unsigned width;
  Bytes values;
  Bytes mask;
  bool used = false;
};

void requireBit(const Signal& signal) {
  if (signal.width() == 1) return;
  throw WrongUse(signal.name + " has " + std::to_string(signal.width()) +
                 " bits; name one of them: " + signal.name + "[0]");
}

}  // namespace

CoreSession::CoreSession(Link& link, QOR_CORE_REF ref, const std::string& memory)
    : link_(link), ref_(ref), info_(setUp(link, ref)), memory_(memory, info_) {}

Sample CoreSession::emptySample() const {
  const Bytes async = room(info_.async_input_count), sync = room(info_.sync_input_count);
  return {async, async, async, sync, sync, sync, sync, sync};
}

void CoreSession::read(Sample& sample) {
  link_.check(QorVIO_getPortBits(link_.session(), ref_, sample.asyncIn.data(), sample.asyncUp.data(),
                                 sample.asyncDown.data(), info_.async_input_count, sample.syncIn.data(),
                                 sample.syncUp.data(), sample.syncDown.data(), sample.syncSyncUp.data(),
                                 sample.syncSyncDown.data(), info_.sync_input_count));
}

void CoreSession::write(const std::vector<Assignment>& assignments) {
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

Bytes CoreSession::lastWritten(const Signal& signal) const {
  Bytes value;
  extract(signal, memory_.image(signal.port), value);
  return value;
}

Assignment pulse(const Signal& signal, unsigned at, unsigned width) {
  requireBit(signal);
  if (signal.port != Port::syncOut)
    throw WrongUse("an asynchronous output plays no pulses, press it instead: " + signal.name);
  if (width == 0 || at >= stepCount || width >= stepCount - at)
    throw WrongUse("a pulse must begin and end within 16 steps, the last of them low: steps " +
                   std::to_string(at) + " to " + std::to_string(std::uint64_t{at} + width - 1));
  std::vector<Bytes> steps(stepCount, Bytes{0});
  for (unsigned step = at; step < at + width; ++step) steps[step] = {1};
  return {signal, steps};
}

Assignment toggle(const CoreSession& core, const Signal& signal) {
  requireBit(signal);
  return {signal, {{static_cast<unsigned char>(core.lastWritten(signal)[0] ^ 1)}}};
}

Assignment level(const Signal& signal, Bytes value) {
  return {signal, {std::move(value)}};
}

}  // namespace qor
