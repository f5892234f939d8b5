#include "board/model/Sample.h"

#include <algorithm>

namespace qor {
namespace {

constexpr Bytes Sample::*flagImages[] = {&Sample::asyncUp,  &Sample::asyncDown,  &Sample::syncUp,
                                         &Sample::syncDown, &Sample::syncSyncUp, &Sample::syncSyncDown};

}  // namespace

Sample emptySample(const QORVIO_CORE_INFO& info) {
  const Bytes async(byteCount(info.async_input_count)), sync(byteCount(info.sync_input_count));
  return {async, async, async, sync, sync, sync, sync, sync};
}

bool anyOf(const Signal& signal, const Bytes& portImage) {
  return std::any_of(signal.bits.begin(), signal.bits.end(),
                     [&](unsigned bit) { return bitAt(portImage, bit) != 0; });
}

void addActivity(Sample& sample, const Sample& more) {
  for (const auto image : flagImages)
    for (std::size_t i = 0; i < (sample.*image).size(); ++i)
      (sample.*image)[i] = static_cast<unsigned char>((sample.*image)[i] | (more.*image)[i]);
}

void forgetActivity(Sample& sample) {
  for (const auto image : flagImages) std::fill((sample.*image).begin(), (sample.*image).end(), 0);
}

void forgetActivity(Sample& sample, const Signal& signal) {
  for (const auto image : flagImages) {
    const bool isAsync = image == &Sample::asyncUp || image == &Sample::asyncDown;
    if (isAsync != (signal.port == Port::asyncIn)) continue;
    for (unsigned bit : signal.bits) setBit(sample.*image, bit, 0);
  }
}

Activity activityOf(const Signal& signal, const Sample& sample) {
  Activity activity;
  activity.up = anyOf(signal, sample.up(signal.port));
  activity.down = anyOf(signal, sample.down(signal.port));
  if (signal.port == Port::syncIn) {
    activity.syncUp = anyOf(signal, sample.syncSyncUp);
    activity.syncDown = anyOf(signal, sample.syncSyncDown);
  }
  return activity;
}

void extract(const Signal& signal, const Bytes& portImage, Bytes& value) {
  if (signal.width() == 1) {
    value.resize(1);
    value[0] = static_cast<unsigned char>(bitAt(portImage, signal.bits[0]));
    return;
  }
  value.assign(byteCount(signal.width()), 0);
  for (unsigned i = 0; i < signal.width(); ++i)
    value[i / 8] = static_cast<unsigned char>(value[i / 8] | bitAt(portImage, signal.bits[i]) << i % 8);
}

std::uint64_t lowBits(const Signal& signal, const Bytes& portImage) {
  std::uint64_t value = 0;
  for (unsigned i = std::min(signal.width(), 64U); i-- > 0;)
    value = value << 1 | bitAt(portImage, signal.bits[i]);
  return value;
}

}  // namespace qor
