// Values by name as hexadecimal text: writeValues and readValues over a map.
#include <array>
#include <memory>
#include <stdexcept>
#include <utility>

#include "QorVIO_Core.h"
#include "src/Messages.h"
#include "src/core/HexField.h"

namespace QorRT {

namespace {

using TextMap = hash_map<std::string, std::string>;

/// NAME.suffix, split at the first dot.
struct Key {
  std::string_view name;
  std::string_view suffix;
};

Key splitKey(std::string_view key) {
  auto dot = key.find('.');
  if (dot == std::string_view::npos) return {key, {}};
  return {key.substr(0, dot), key.substr(dot + 1)};
}

/// One entry of a map to be written, its name resolved.
struct Assignment {
  QorVIO_SignalGroup* group;
  bool isPulseTrain;
  std::string_view text;
};

void stage(const Assignment& assignment) {
  constexpr unsigned stepCount = QorVIO_Command::stepCount;
  // A pulse train's field is twice as long as its 16 values; the left half is checked and not used.
  constexpr unsigned long long pulseTrainBitsAByte = 2ULL * stepCount * 8;
  auto bitWidth = assignment.isPulseTrain ? pulseTrainBitsAByte * assignment.group->byteCount()
                                          : assignment.group->size();
  auto bytes = fitHexField(assignment.text, bitWidth);
  assignment.group->setValues(bytes->uPtr(), bytes->getSize(), assignment.isPulseTrain ? stepCount : 1);
}

/// The value and the activity flags of one group, as texts under its name.
class InputReading {
 public:
  explicit InputReading(const QorVIO_SignalGroup& group)
      : group_(group), isSynchronous_(group.getPortType() == Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT) {
    const unsigned size = group.byteCount();
    for (std::size_t kind = 0; kind < (isSynchronous_ ? 5 : 3); ++kind)
      bits_[kind] = Qor_ByteBuffer(size, 0, 0);
    group.getValues(bits_[0].uPtr(), bits_[1].uPtr(), bits_[2].uPtr(), bits_[3].uPtr(), bits_[4].uPtr(),
                    size);
  }

  void storeIn(TextMap& map) const {
    std::string value = textOf(bits_[0]);
    map.insert_or_assign(group_.getName(), value);
    map.insert_or_assign(group_.getName() + ".value", std::move(value));
    map.insert_or_assign(group_.getName() + ".activity_up", textOf(bits_[1]));
    map.insert_or_assign(group_.getName() + ".activity_down", textOf(bits_[2]));
    if (!isSynchronous_) return;
    map.insert_or_assign(group_.getName() + ".sync_activity_up", textOf(bits_[3]));
    map.insert_or_assign(group_.getName() + ".sync_activity_down", textOf(bits_[4]));
  }

 private:
  std::string textOf(const Qor_ByteBuffer& bits) const {
    std::unique_ptr<Qor_ByteBuffer> text(bits.bin2HexString(0, group_.size()));
    return text->ptr();
  }

  const QorVIO_SignalGroup& group_;
  bool isSynchronous_;
  std::array<Qor_ByteBuffer, 5> bits_;  // value, activity up and down, sync activity up and down
};

}  // namespace

void QorVIO_Core::writeValues(unsigned session, QOR_CORE_REF coreRef, TextMap* outputHashMap) {
  std::vector<Assignment> assignments;
  assignments.reserve(outputHashMap->size());
  for (const auto& [key, text] : *outputHashMap) {
    auto [name, suffix] = splitKey(key);
    QorVIO_SignalGroup* group = getOutputSignal(name);
    if (group == nullptr) throw unknownName(name);
    bool isPulseTrain = suffix == "pulsetrain";
    if (isPulseTrain && group->getPortType() != Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT)
      throw std::logic_error(".pulsetrain cannot be used with the non-synchronous output: " +
                             std::string(name));
    assignments.push_back({group, isPulseTrain, text});
  }
  command.clearMasks();
  for (const Assignment& assignment : assignments) stage(assignment);
  command.writeOutputs(session, coreRef);
}

void QorVIO_Core::readValues(unsigned session, QOR_CORE_REF coreRef, TextMap* inputHashMap) {
  command.readInputs(session, coreRef);
  command.setKeepsActivity(true);
  for (const auto& entry : inputSignals) InputReading(*entry.second).storeIn(*inputHashMap);
  command.setKeepsActivity(false);
}

}  // namespace QorRT
