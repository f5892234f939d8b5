// The names of a core: two tables, one for inputs and one for outputs.
#include <algorithm>
#include <memory>
#include <numeric>
#include <stdexcept>
#include <utility>

#include "QorVIO_Core.h"
#include "src/Messages.h"

namespace QorRT {

namespace {

constexpr unsigned syncOutputCode = 0;
constexpr unsigned syncInputCode = 1;
constexpr unsigned asyncOutputCode = 2;
constexpr unsigned asyncInputCode = 3;

constexpr const char* caseNote = "Note: Signal names are case-insensitive";

bool isInputCode(unsigned type) {
  return type == syncInputCode || type == asyncInputCode;
}

QorVIO_SignalGroup* find(const QorVIO_NameTable& table, std::string_view name) {
  auto entry = table.find(name);
  return entry == table.end() ? nullptr : entry->second.get();
}

void requireName(const std::string& name) {
  if (name.empty()) throw std::logic_error("Invalid signal name.");
}

void requirePositionsBelow(unsigned width, const std::vector<unsigned>& positions) {
  if (std::any_of(positions.begin(), positions.end(),
                  [width](unsigned position) { return position >= width; }))
    throw std::logic_error(
        "This signal cannot be defined because an index is greater than the number of this signal type.");
}

}  // namespace

struct QorVIO_Core::Port {
  unsigned signalType;
  unsigned width;
  QorVIO_NameTable& names;
};

QorVIO_Core::Port QorVIO_Core::portOf(unsigned type) {
  switch (type) {
    case syncOutputCode:
      return {Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT, vioCoreInfo.sync_output_count, outputSignals};
    case syncInputCode:
      return {Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, vioCoreInfo.sync_input_count, inputSignals};
    case asyncOutputCode:
      return {Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT, vioCoreInfo.async_output_count, outputSignals};
    case asyncInputCode:
      return {Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, vioCoreInfo.async_input_count, inputSignals};
    default:
      throw std::logic_error("This signal cannot be defined because the type is unknown.");
  }
}

void QorVIO_Core::defineSignal(const std::string& name, unsigned type, std::vector<unsigned>& positions) {
  requireName(name);
  if (positions.empty()) throw std::logic_error("This signal cannot be defined with a size of 0.");
  Port port = portOf(type);
  requirePositionsBelow(port.width, positions);
  if (find(port.names, name) != nullptr)
    throw std::logic_error("The name, " + name +
                           ", is already used by another signal and will not be re-defined. " + caseNote);
  auto group = std::make_unique<QorVIO_SignalGroup>(&command, port.signalType, positions, name, name);
  std::string_view key = group->getKeyName();
  port.names.emplace(key, std::move(group));
}

void QorVIO_Core::undefineSignal(const std::string& name, unsigned type) {
  requireName(name);
  QorVIO_NameTable& names = isInputCode(type) ? inputSignals : outputSignals;
  auto entry = names.find(name);
  if (entry == names.end())
    throw std::logic_error("The name, " + name + ", has not been defined. " + caseNote);
  auto groupBeyondItsEntry = std::move(entry->second);
  names.erase(entry);
}

QorVIO_SignalGroup* QorVIO_Core::getInputSignal(std::string_view name) const {
  return find(inputSignals, name);
}

QorVIO_SignalGroup* QorVIO_Core::getOutputSignal(std::string_view name) const {
  return find(outputSignals, name);
}

void QorVIO_Core::getSignalSizes(std::vector<std::string> names, unsigned* sizes, unsigned count,
                                 unsigned isOutput) {
  requireNames(names, count);
  for (unsigned i = 0; i < count; ++i) {
    const QorVIO_SignalGroup* group = isOutput != 0 ? getOutputSignal(names[i]) : getInputSignal(names[i]);
    if (group == nullptr) throw unknownName(names[i]);
    sizes[i] = group->size();
  }
}

void QorVIO_Core::addReservedSignals() {
  const std::pair<const char*, unsigned> wholePorts[] = {{"async_out_data", asyncOutputCode},
                                                         {"sync_out_data", syncOutputCode},
                                                         {"async_in_data", asyncInputCode},
                                                         {"sync_in_data", syncInputCode}};
  for (auto [name, type] : wholePorts) {
    std::vector<unsigned> positions(portOf(type).width);
    std::iota(positions.begin(), positions.end(), 0U);
    if (!positions.empty()) defineSignal(name, type, positions);
  }
}

}  // namespace QorRT
