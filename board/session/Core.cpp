#include "board/session/Core.h"

#include "board/model/Errors.h"

namespace qor {

Core::~Core() = default;

std::optional<Gift> Core::lastGift(const Signal&) const {
  return std::nullopt;
}

void Core::keepActivity(const Sample&) noexcept {}

Assignment toggled(const Core& core, const Signal& output, std::optional<bool> assumed) {
  requireBit(output);
  const std::optional<Bytes> last = core.lastGiven(output);
  if (!last && !assumed) throw WrongUse("it is not known what this output was last given: " + output.name);
  const bool isSet = last ? last->front() != 0 : *assumed;
  return level(output, {static_cast<unsigned char>(isSet ? 0 : 1)});
}

}  // namespace qor
