#include <mutex>
#include <stdexcept>
#include <utility>

#include "QorJtag_Host.h"
#include "platform/jtag/Qor_SessionAccess.h"
#include "platform/jtag/Qor_SessionTable.h"

using QorRT::Qor_Cable;
using QorRT::Qor_Session;
using QorRT::Qor_SessionTable;

unsigned QorJtag_session_open(const char* cableUrl) {
  return QorJtag_session_openCable(QorRT::openCable(cableUrl));
}

unsigned QorJtag_session_openCable(std::unique_ptr<Qor_Cable> cable) {
  if (cable == nullptr) throw std::logic_error("the cable of a session is null");
  return Qor_SessionTable::instance().add(std::make_shared<Qor_Session>(std::move(cable)));
}

void QorJtag_session_close(unsigned session) {
  const std::shared_ptr<Qor_Session> closing = Qor_SessionTable::instance().get(session);
  {
    const std::lock_guard<QorRT::Qor_TargetMutex> guard(closing->targetLock());
    if (closing->isClosed()) QorRT::throwClosed(session);
    closing->markClosed();
    Qor_SessionTable::instance().remove(session);
  }
  closing->shutDown(session);
}

void QorJtag_session_setMessageHandler(unsigned session, QorJtag_MessageHandler handler) {
  Qor_SessionTable::instance().get(session)->setHandler(std::move(handler));
}

void QorJtag_session_getDevices(unsigned session, std::vector<QorRT::Qor_Device>& devices) {
  std::vector<QorRT::Qor_Device> copy = Qor_SessionTable::instance().get(session)->devices();
  devices.swap(copy);
}

void QorJtag_session_getStatistics(unsigned session, QorJtag_Statistics& statistics) {
  statistics = Qor_SessionTable::instance().get(session)->record().statistics();
}

void QorJtag_session_getHubs(unsigned session, std::vector<QorJtag_Hub>& hubs) {
  std::vector<QorJtag_Hub> copy = Qor_SessionTable::instance().get(session)->record().hubs();
  hubs.swap(copy);
}

unsigned QorJtag_target_flush(unsigned session) {
  QorRT::sessionCable(session).flush();
  return 0;
}

namespace QorRT {

Qor_Cable& sessionCable(unsigned session) {
  return Qor_SessionTable::instance().get(session)->cable();
}

Qor_LinkRecord& sessionRecord(unsigned session) {
  return Qor_SessionTable::instance().get(session)->record();
}

void onSessionClose(unsigned session, void (*hook)(unsigned session) noexcept) {
  if (!Qor_SessionTable::instance().get(session)->addCloseHook(hook)) throwClosed(session);
}

}  // namespace QorRT
