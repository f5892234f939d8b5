// Board files. Input: the file. It makes a board that answers, or an error that begins with file and line.
#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "Sim.h"
#include "tests/fuzz/Fuzz.h"

void fuzz(std::string_view input) {
  try {
    const unsigned session = QorJtag_session_openCable(qorsim::boardText(std::string(input), "F").cable());
    QorJtag_session_setMessageHandler(session, [](unsigned, const char*) {});
    std::vector<QorRT::Qor_Device> devices;
    QorJtag_session_getDevices(session, devices);
    require(!devices.empty(), "a device");
    for (unsigned chain = 1; chain <= 4; ++chain) {
      const QOR_CORE_REF ref{0, chain, 0};
      QORVIO_CORE_INFO info{};
      const bool isVio = QorVIO_getInfo(session, ref, &info) == 0;
      require((QorVIO_initCore(session, ref) == 0) == isVio, "a VIO core can be set up");
    }
    QorJtag_session_close(session);
  } catch (const std::runtime_error& e) {
    const std::string what = e.what();
    const std::size_t end = what.find_first_not_of("0123456789", 2);
    require(what.rfind("F:", 0) == 0 && end > 2 && what.compare(end, 2, ": ") == 0, what);
  }
}
