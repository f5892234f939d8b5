// The shortest host: writes four output bits of the simulated board by name, and reads them back.
#include <cstdio>

#include "QorJtag_Host.h"
#include "QorVIO.h"

int main() {
  unsigned session = QorJtag_session_open("sim:");
  const QOR_CORE_REF core{0, 1, 0};  // device 0, user chain 1, core 0
  const unsigned bits[] = {0, 1, 2, 3};
  QorRT::hash_map<std::string, std::string> outputs{{"leds", "A"}}, inputs, *write = &outputs,
                                                                            *read = &inputs;

  bool done = QorVIO_initCore(session, core) == 0 &&
              QorVIO_defineBus(session, core, "leds", 2, bits, 4) == 0 &&
              QorVIO_defineBus(session, core, "leds_seen", 3, bits, 4) == 0 &&
              QorVIO_writeValues(session, core, &write) == 0 && QorVIO_readValues(session, core, &read) == 0;
  std::printf("leds_seen = %s, rose = %s\n", inputs["leds_seen"].c_str(),
              inputs["leds_seen.activity_up"].c_str());
  return done && inputs["leds_seen"] == "A" ? 0 : 1;
}
