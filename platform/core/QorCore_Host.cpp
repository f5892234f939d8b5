#include "platform/core/QorCore_Host.h"

#include "QorJtag.h"
#include "platform/core/Qor_HubAccess.h"
#include "platform/core/Qor_SessionCores.h"
#include "platform/jtag/Qor_SessionAccess.h"

namespace QorRT {
namespace {

// Another core could have had the same tag from another host.
constexpr int marks = 2;

}  // namespace

bool isOneCore(unsigned session, const QOR_CORE_REF& one, const QOR_CORE_REF& other,
               std::size_t payloadBits) {
  const QorJtagTargetLock lock(session, 60000);
  const std::shared_ptr<Qor_SessionCores> cores = Qor_SessionCores::open(session);
  Qor_CoreLink &link = cores->link(one), &otherLink = cores->link(other);
  link.knowsWriteTags = otherLink.knowsWriteTags = false;
  Qor_HubAccess hub(sessionCable(session), sessionRecord(session), link, one);
  Qor_HubAccess otherHub(sessionCable(session), sessionRecord(session), otherLink, other);
  for (int i = 0; i < marks; ++i) {
    const unsigned tag = drawTagAbove() << 4;
    if (!hub.mark(tag, payloadBits) || !otherHub.isMarked(tag, payloadBits)) return false;
  }
  return true;
}

}  // namespace QorRT
