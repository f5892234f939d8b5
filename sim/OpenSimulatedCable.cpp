#include "Sim.h"
#include "platform/jtag/cable/Qor_CableFactories.h"

namespace QorRT {

std::unique_ptr<Qor_Cable> openSimulatedCable(const std::string& boardFile, StopFunction) {
  return (boardFile.empty() ? qorsim::demoBoard() : qorsim::boardFile(boardFile)).cable();
}

}  // namespace QorRT
