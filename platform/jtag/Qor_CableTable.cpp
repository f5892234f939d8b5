#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

#include "QorJtag_Host.h"
#include "platform/jtag/cable/Qor_CableFactories.h"

namespace QorRT {
namespace {

struct CableKind {
  std::string_view name;
  std::unique_ptr<Qor_Cable> (*open)(const std::string& rest, StopFunction stop);
};

constexpr CableKind cableKinds[] = {
    {"sim", openSimulatedCable},
    {"rbb", openBitbangCable},
    {"openocd", openOpenOcdCable},
};

std::string knownKinds() {
  std::string names;
  for (const CableKind& kind : cableKinds) names.append(names.empty() ? "" : ", ").append(kind.name);
  return names;
}

}  // namespace

std::unique_ptr<Qor_Cable> openCable(const char* url, StopFunction stop) {
  if (url == nullptr) throw std::logic_error("the cable URL is null");
  const std::string_view text(url);
  if (text.empty()) throw std::logic_error("the cable URL is empty");
  const std::size_t colon = text.find(':');
  if (colon == text.npos) {
    throw std::logic_error("the cable URL \"" + std::string(text) + "\" has no colon after its kind");
  }
  const std::string_view name = text.substr(0, colon);
  for (const CableKind& kind : cableKinds) {
    if (kind.name == name) return kind.open(std::string(text.substr(colon + 1)), std::move(stop));
  }
  throw std::logic_error("the cable URL \"" + std::string(text) + "\" is of the unknown kind \"" +
                         std::string(name) + "\"; known: " + knownKinds());
}

}  // namespace QorRT
