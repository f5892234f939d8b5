#include "tools/qorvio/InputJson.h"

namespace qor::tool {
namespace {

std::string bitsIn(const Bytes& portImage, const Signal& input) {
  Bytes bits;
  extract(input, portImage, bits);
  return hexText(bits, input.width());
}

}  // namespace

nlohmann::ordered_json jsonOf(const Signal& input, const Sample& sample, const Radix* radix) {
  Bytes value;
  extract(input, sample.values(input.port), value);
  nlohmann::ordered_json entry{{"name", input.name},
                               {"width", input.width()},
                               {"value", hexText(value, input.width())},
                               {"shown", shown(input, value, radix)}};
  addActivity(entry, input, sample, "");
  return entry;
}

void addActivity(nlohmann::ordered_json& entry, const Signal& input, const Sample& sample,
                 const std::string& ending) {
  entry["activity_up" + ending] = bitsIn(sample.up(input.port), input);
  entry["activity_down" + ending] = bitsIn(sample.down(input.port), input);
  if (input.port != Port::syncIn) return;
  entry["sync_activity_up" + ending] = bitsIn(sample.syncSyncUp, input);
  entry["sync_activity_down" + ending] = bitsIn(sample.syncSyncDown, input);
}

}  // namespace qor::tool
