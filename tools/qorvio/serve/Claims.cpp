#include "tools/qorvio/serve/Claims.h"

#include "board/model/Errors.h"
#include "os/Process.h"

namespace qor::tool {
namespace {

// "12:03", with the day where it is not today.
std::string since(std::int64_t time) {
  const std::string then = os::localTime(time), today = os::localTime(os::now());
  return then.substr(0, 10) == today.substr(0, 10) ? then.substr(11, 5) : then.substr(0, 16);
}

}  // namespace

Claims::Claims(const std::vector<QORVIO_CORE_INFO>& cores) {
  for (const QORVIO_CORE_INFO& each : cores) {
    ports_.emplace_back(each.async_output_count);
    ports_.emplace_back(each.sync_output_count);
  }
}

const Claims::Bits& Claims::portOf(const Signal& output) const {
  return ports_.at(2 * output.core + (output.port == Port::syncOut ? 1 : 0));
}

Claims::Bits& Claims::portOf(const Signal& output) {
  return ports_.at(2 * output.core + (output.port == Port::syncOut ? 1 : 0));
}

const Owner* Claims::ownerOf(const Signal& output) const {
  return otherThan(0, output);
}

const Owner* Claims::otherThan(unsigned client, const Signal& output) const {
  const Bits& port = portOf(output);
  for (const unsigned bit : output.bits)
    if (port.at(bit) && port[bit]->client != client) return port[bit].get();
  return nullptr;
}

void Claims::require(unsigned client, const Signal& output) const {
  if (const Owner* other = otherThan(client, output))
    throw Driven(output.name + " is driven by " + other->name + ", since " + since(other->since));
}

void Claims::take(const std::shared_ptr<const Owner>& owner, const Signal& output) {
  Bits& port = portOf(output);
  for (const unsigned bit : output.bits)
    if (!port.at(bit) || port[bit]->client != owner->client) port[bit] = owner;
}

void Claims::release(unsigned client, const Signal& output) {
  Bits& port = portOf(output);
  for (const unsigned bit : output.bits)
    if (port.at(bit) && port[bit]->client == client) port[bit].reset();
}

void Claims::releaseAll(unsigned client) {
  for (Bits& port : ports_)
    for (auto& bit : port)
      if (bit && bit->client == client) bit.reset();
}

}  // namespace qor::tool
