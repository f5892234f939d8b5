#include "Qor_CableFactories.h"
#include "Sim.h"

namespace QorRT {

std::unique_ptr<Qor_Cable> openSimulatedCable(const std::string& boardFile) {
  return (boardFile.empty() ? qorsim::demoBoard() : qorsim::boardFile(boardFile)).cable();
}

}  // namespace QorRT
