#include <memory>
#include <stdexcept>

#include "QorCore.h"
#include "platform/core/Qor_SessionCores.h"

namespace QorRT {

Qor_Core* Qor_CoreList::getCore(unsigned session, QOR_CORE_REF coreRef) {
  const auto cores = Qor_SessionCores::find(session);
  return cores == nullptr ? nullptr : cores->core(coreRef);
}

void Qor_CoreList::addCore(unsigned session, Qor_Core* core) {
  if (core == nullptr) throw std::logic_error("the core for the list is null");
  Qor_SessionCores::open(session)->add(core);
}

void Qor_CoreList::removeCore(unsigned session, Qor_Core** core) {
  if (core == nullptr || *core == nullptr) return;
  const auto cores = Qor_SessionCores::find(session);
  if (cores == nullptr) return;
  const std::unique_ptr<Qor_Core> removed = cores->take(*core);
  if (removed != nullptr) *core = nullptr;
}

}  // namespace QorRT
