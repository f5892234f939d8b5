// What a noisy line does to calls: noise_bench [CALLS [RATE]]. Each row is a write and a read in turn, of asynchronous
// ports of so many bits that lead back; the value that is read must be the one that was written.
#include <cstdio>
#include <cstdlib>
#include <random>
#include <vector>

#include "FaultyCable.h"
#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "Sim.h"

namespace {

using Bytes = std::vector<unsigned char>;

struct Failures {
  std::size_t writes = 0, reads = 0, wrongValues = 0;
};

Failures callTimes(unsigned session, unsigned width, std::size_t calls) {
  const QOR_CORE_REF core{0, 1, 0};
  const Bytes all(width / 8, 0xFF);
  Bytes out(width / 8), in(width / 8);
  std::mt19937 random(3);
  Failures failures;
  for (std::size_t i = 0; i < calls; ++i) {
    Bytes next(width / 8);
    for (unsigned char& byte : next) byte = static_cast<unsigned char>(random());
    const bool isWritten =
        QorVIO_setPortBits(session, core, next.data(), all.data(), width, nullptr, nullptr, 0) == 0;
    failures.writes += isWritten ? 0 : 1;
    const bool isRead = QorVIO_getPortBits(session, core, in.data(), nullptr, nullptr, width, nullptr,
                                           nullptr, nullptr, nullptr, nullptr, 0) == 0;
    failures.reads += isRead ? 0 : 1;
    if (isRead && in != next && (isWritten || in != out)) ++failures.wrongValues;
    if (isWritten || isRead) out = isRead ? in : next;
  }
  return failures;
}

void measure(unsigned width, bool sent, std::size_t calls, double rate) {
  const auto core = qorsim::vio().asyncOut(width).asyncIn(width).design(qorsim::loopback());
  auto cable = std::make_unique<qorsim::FaultyCable>(qorsim::chain().device(0x11).core(1, 0, core).cable());
  cable->noise(sent ? rate : 0, sent ? 0 : rate);
  const qorsim::FaultyCable& noise = *cable;
  const unsigned session = QorJtag_session_openCable(std::move(cable));
  QorJtag_session_setMessageHandler(session, [](unsigned, const char*) {});
  QorVIO_initCore(session, {0, 1, 0});
  const Failures failures = callTimes(session, width, calls);
  QorJtag_Statistics link;
  QorJtag_session_getStatistics(session, link);
  std::printf("%4u %4s %9zu %9zu %9llu %9llu %9llu %9llu %7zu %7zu %7zu\n", width, sent ? "TDI" : "TDO",
              calls, noise.noisyBits(), static_cast<unsigned long long>(link.repeatsNoHub),
              static_cast<unsigned long long>(link.repeatsNoHead),
              static_cast<unsigned long long>(link.repeatsBadCrc),
              static_cast<unsigned long long>(link.repeatsSlow) + link.repeatsRefused, failures.writes,
              failures.reads, failures.wrongValues);
  QorJtag_session_close(session);
}

}  // namespace

int main(int argc, char** argv) {
  const std::size_t calls = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 20000;
  const double rate = argc > 2 ? std::strtod(argv[2], nullptr) : 1e-4;
  std::printf(
      "bits line     calls     flips   repeats: no hub, no head,  bad CRC,     waits  failed: writes, reads; "
      "wrong\n");
  for (const unsigned width : {32U, 256U})
    for (const bool sent : {false, true}) measure(width, sent, calls, rate);
  return 0;
}
