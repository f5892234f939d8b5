#include "SimCable.h"

#include <utility>

#include "ChainScan.h"
#include "sim/Chain.h"

namespace qorsim {

SimCable::SimCable(std::vector<QorRT::Qor_Device> devices, std::unique_ptr<Chain> chain)
    : devices_(std::move(devices)), chain_(std::move(chain)) {}

SimCable::~SimCable() = default;

void SimCable::setTcksPerClock(unsigned tcks) {
  chain_->setTcksPerClock(tcks);
}

void SimCable::run(std::vector<QorRT::Qor_Scan>& scans) {
  ++exchanges_;
  for (QorRT::Qor_Scan& scan : scans) {
    switch (scan.kind) {
      case QorRT::Qor_Scan::Kind::ir:
        runIr(scan);
        break;
      case QorRT::Qor_Scan::Kind::dr:
        runDr(scan);
        break;
      case QorRT::Qor_Scan::Kind::idle:
        chain_->idle(scan.cycles);
        break;
    }
  }
}

void SimCable::runIr(const QorRT::Qor_Scan& scan) {
  ++scans_;
  const std::uint32_t opcode = chain_->tap(scan.device).userOpcode(scan.userChain);
  const QorRT::ChainScan out = QorRT::chainIrScan(devices_, scan.device, opcode);
  Bits stream = unpack(out.bits, out.bitCount);
  chain_->scanIr(stream);
}

void SimCable::runDr(QorRT::Qor_Scan& scan) {
  ++scans_;
  const QorRT::ChainScan out = QorRT::chainDrScan(devices_.size(), scan.device, scan.out, scan.bitCount);
  Bits stream = unpack(out.bits, out.bitCount);
  chain_->scanDr(stream);
  if (scan.capture) scan.in = QorRT::chainDrCapture(scan.device, pack(stream), scan.bitCount);
}

}  // namespace qorsim
