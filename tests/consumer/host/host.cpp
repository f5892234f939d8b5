// A host program of another project: writes four bits by name, and wants to see them come back.
#include <cstdio>

#include "QorVIO.h"

/// A session on a board with a VIO core of four asynchronous outputs that loop back.
unsigned openBoard();

int main() {
  const unsigned session = openBoard();
  const QOR_CORE_REF core{0, 1, 0};
  const unsigned bits[] = {0, 1, 2, 3};
  QorRT::hash_map<std::string, std::string> outputs{{"leds", "A"}}, inputs;
  auto *write = &outputs, *read = &inputs;
  if (QorVIO_initCore(session, core) || QorVIO_defineBus(session, core, "leds", 2, bits, 4) ||
      QorVIO_defineBus(session, core, "seen", 3, bits, 4) || QorVIO_writeValues(session, core, &write) ||
      QorVIO_readValues(session, core, &read) || QorVIO_terminateCore(session, core))
    return 1;
  std::printf("seen = %s\n", inputs["seen"].c_str());
  return inputs["seen"] == "A" ? 0 : 1;
}
