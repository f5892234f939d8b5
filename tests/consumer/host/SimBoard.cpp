#include "QorJtag_Host.h"
#include "Sim.h"

unsigned openBoard() {
  return QorJtag_session_openCable(
      qorsim::chain()
          .device()
          .core(1, 0, qorsim::vio().asyncOut(4).asyncIn(4).design(qorsim::loopback()))
          .cable());
}
