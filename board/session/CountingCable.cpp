#include "board/session/CountingCable.h"

namespace qor {

using QorRT::Qor_Scan;

void CountingCable::run(std::vector<Qor_Scan>& scans) {
  std::vector<std::size_t> numbers;
  numbers.reserve(scans.size());
  cable_->drop();
  for (const Qor_Scan& scan : scans) numbers.push_back(forward(scan));
  ++traffic_.exchanges;
  cable_->flush();
  for (std::size_t i = 0; i < scans.size(); ++i)
    if (scans[i].capture) scans[i].in = cable_->captured(numbers[i]);
}

// Returns the number under which the other cable captures.
std::size_t CountingCable::forward(const Qor_Scan& scan) {
  switch (scan.kind) {
    case Qor_Scan::Kind::ir:
      ++traffic_.scans;
      traffic_.bits += devices()[scan.device].irLength;
      cable_->scanIr(scan.device, scan.userChain, scan.always);
      break;
    case Qor_Scan::Kind::dr:
      ++traffic_.scans;
      traffic_.bits += scan.bitCount;
      return cable_->scanDr(scan.device, scan.out, scan.bitCount, scan.capture);
    case Qor_Scan::Kind::idle:
      traffic_.idle += scan.cycles;
      cable_->idle(scan.cycles);
      break;
  }
  return 0;
}

}  // namespace qor
