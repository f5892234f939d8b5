// Values by name as bytes, several samples a call: writeValues and readValues over parallel arrays.
#include <algorithm>
#include <stdexcept>

#include "QorVIO_Core.h"
#include "src/Messages.h"

namespace QorRT {

namespace {

constexpr unsigned burstOn = 1;

void requireSizes(const unsigned* sizes, unsigned count) {
  if (sizes == nullptr && count != 0) throw std::logic_error("The array of sizes is null.");
}

/// The bytes of `samples` values, beyond 32 bits where it takes them.
unsigned long long bytesOf(const QorVIO_SignalGroup& group, unsigned samples) {
  return static_cast<unsigned long long>(group.byteCount()) * samples;
}

/// One name of a write: its group, and what is left of its samples.
struct Source {
  QorVIO_SignalGroup* group;
  const unsigned char* values;
  unsigned size;

  void stage(unsigned samples) {
    group->setValues(values, size, samples);
    values += bytesOf(*group, samples);
    size -= static_cast<unsigned>(bytesOf(*group, samples));
  }
};

/// One name of a read: its group, and where its next sample goes.
struct Destination {
  QorVIO_SignalGroup* group;
  unsigned char* buffers[5];  // value, activity up and down, sync activity up and down; null: not wanted
  unsigned size;

  void store() {
    group->getValues(buffers[0], buffers[1], buffers[2], buffers[3], buffers[4], size);
    for (unsigned char*& buffer : buffers)
      if (buffer != nullptr) buffer += group->byteCount();
    size -= group->byteCount();
  }
};

unsigned char* bufferOf(unsigned char** buffers, unsigned index) {
  return buffers == nullptr ? nullptr : buffers[index];
}

}  // namespace

void QorVIO_Core::writeValues(unsigned session, QOR_CORE_REF coreRef, std::vector<std::string> names,
                              const unsigned char** values, unsigned* sizes, unsigned count, unsigned samples,
                              unsigned burst) {
  requireNames(names, count);
  requireSizes(sizes, count);
  if (values == nullptr && count != 0) throw std::logic_error("The array of values is null.");

  std::vector<Source> sources;
  sources.reserve(count);
  for (unsigned i = 0; i < count; ++i) {
    QorVIO_SignalGroup* group = getOutputSignal(names[i]);
    if (group == nullptr) throw unknownName(names[i]);
    if (burst == burstOn && group->getPortType() != Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT)
      throw std::logic_error("Burst mode cannot be used with the non-synchronous output: " + names[i]);
    if (sizes[i] < bytesOf(*group, samples)) throw tooSmall(names[i]);
    if (values[i] == nullptr) throw std::logic_error("Invalid values for signal: " + names[i]);
    sources.push_back({group, values[i], sizes[i]});
  }

  unsigned chunkLimit = burst == burstOn ? QorVIO_Command::stepCount : 1;
  for (unsigned remaining = samples; remaining > 0;) {
    unsigned chunk = std::min(remaining, chunkLimit);
    command.clearMasks();
    for (Source& source : sources) source.stage(chunk);
    command.writeOutputs(session, coreRef);
    remaining -= chunk;
  }
}

void QorVIO_Core::readValues(unsigned session, QOR_CORE_REF coreRef, std::vector<std::string> names,
                             unsigned char** values, unsigned char** activityUp, unsigned char** activityDown,
                             unsigned char** syncActivityUp, unsigned char** syncActivityDown,
                             unsigned* sizes, unsigned count, unsigned samples) {
  requireNames(names, count);
  requireSizes(sizes, count);

  std::vector<Destination> destinations;
  destinations.reserve(count);
  for (unsigned i = 0; i < count; ++i) {
    QorVIO_SignalGroup* group = getInputSignal(names[i]);
    if (group == nullptr) throw unknownName(names[i]);
    if (sizes[i] < bytesOf(*group, samples)) throw tooSmall(names[i]);
    destinations.push_back({group,
                            {bufferOf(values, i), bufferOf(activityUp, i), bufferOf(activityDown, i),
                             bufferOf(syncActivityUp, i), bufferOf(syncActivityDown, i)},
                            sizes[i]});
  }

  for (unsigned sample = 0; sample < samples; ++sample) {
    command.readInputs(session, coreRef);
    for (Destination& destination : destinations) destination.store();
  }
}

}  // namespace QorRT
