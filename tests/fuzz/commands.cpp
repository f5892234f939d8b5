// Command texts, run on a simulated core whose outputs loop back. Input: how many bytes of result there are, then the
// text. A text that is refused sends nothing; a failure leaves the result as it was.
#include "QorCore.h"
#include "QorJtag_Host.h"
#include "Sim.h"
#include "tests/fuzz/Fuzz.h"

void fuzz(std::string_view input) {
  const std::string line(input.substr(0, input.find('\n')));
  const std::string text(input.substr(std::min(line.size() + 1, input.size())));
  auto cable =
      qorsim::chain()
          .device()
          .core(1, 0, qorsim::vio().asyncOut(3).syncOut(2).asyncIn(3).syncIn(2).design(qorsim::loopback()))
          .core(1, 1, qorsim::otherCore(7))
          .device()
          .cable();
  const qorsim::SimCable& board = *cable;
  const unsigned session = QorJtag_session_openCable(std::move(cable));
  std::vector<unsigned char> result(std::strtoul(line.c_str(), nullptr, 10) % 100000, 0xEE);
  const std::vector<unsigned char> untouched = result;
  const std::string wrong = thrownBy([&] {
    QorRT::Qor_CoreComm::commandSequence(session, text, result.data(),
                                         static_cast<unsigned>(8 * result.size()), nullptr);
  });
  if (wrong.rfind("command text line ", 0) == 0) require(board.exchanges() == 0, "nothing is sent: " + wrong);
  require(wrong.empty() || result == untouched, "the result stays as it was: " + wrong);
  require(!wrong.empty() || result.empty() || result != untouched, "a read has a result");
  QorJtag_session_close(session);
}
