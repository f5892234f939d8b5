#include "rtl/cosim/PinsCable.h"

#include <utility>

#include "ChainScan.h"

namespace qorrtl {

using QorRT::Qor_Scan;
using QorRT::TckSequence;

PinsCable::PinsCable(std::vector<QorRT::Qor_Device> devices, qorsim::Pins& pins)
    : devices_(std::move(devices)), pins_(pins) {
  TckSequence reset;
  reset.reset();
  play(reset);
}

void PinsCable::run(std::vector<Qor_Scan>& scans) {
  for (Qor_Scan& scan : scans) {
    TckSequence sequence;
    if (scan.kind == Qor_Scan::Kind::idle) sequence.idle(scan.cycles);
    if (scan.kind == Qor_Scan::Kind::ir)
      sequence.scanIr(QorRT::chainIrScan(devices_, scan.device, scan.userChain + 1));
    if (scan.kind == Qor_Scan::Kind::dr)
      sequence.scanDr(QorRT::chainDrScan(devices_.size(), scan.device, scan.out, scan.bitCount),
                      scan.capture);
    const std::vector<unsigned char> tdo = play(sequence);
    if (scan.capture) scan.in = QorRT::chainDrCapture(scan.device, tdo, scan.bitCount);
  }
}

// The captured bits.
std::vector<unsigned char> PinsCable::play(const TckSequence& sequence) {
  std::vector<unsigned char> bits((sequence.captureCount() + 7) / 8);
  std::size_t count = 0;
  for (const unsigned char tck : sequence.tcks()) {
    const bool tms = (tck & TckSequence::tms) != 0, tdi = (tck & TckSequence::tdi) != 0;
    pins_.write(false, tms, tdi);
    if ((tck & TckSequence::capture) != 0) {
      if (pins_.tdo()) bits[count / 8] = static_cast<unsigned char>(bits[count / 8] | 1u << count % 8);
      ++count;
    }
    pins_.write(true, tms, tdi);
  }
  pins_.write(false, false, true);
  return bits;
}

}  // namespace qorrtl
