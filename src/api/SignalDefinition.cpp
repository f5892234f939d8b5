#include <string>
#include <utility>
#include <vector>

#include "QorVIO.h"
#include "src/api/CoreAccess.h"

using namespace QorRT;

unsigned QorVIO_defineSignal(unsigned session, QOR_CORE_REF coreRef, const char* name, unsigned type,
                             unsigned bitIndex) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    require(name != nullptr, "QorVIO_defineSignal() arg. failed:name!=0");
    std::vector<unsigned> positions{bitIndex};
    core.defineSignal(name, type, positions);
  });
}

unsigned QorVIO_defineBus(unsigned session, QOR_CORE_REF coreRef, const char* name, unsigned type,
                          const unsigned* bitIndexArray, unsigned arrayLen) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    require(name != nullptr, "QorVIO_defineBus() arg. failed:name!=0");
    require(bitIndexArray != nullptr, "QorVIO_defineBus() arg. failed:bitIndexArray!=0");
    require(arrayLen != 0, "QorVIO_defineBus() arg. failed:arrayLen!=0");
    std::vector<unsigned> positions(bitIndexArray, bitIndexArray + arrayLen);
    core.defineSignal(name, type, positions);
  });
}

unsigned QorVIO_undefineName(unsigned session, QOR_CORE_REF coreRef, const char* name, unsigned type) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    require(name != nullptr, "QorVIO_undefineName() arg. failed:name!=0");
    core.undefineSignal(name, type);
  });
}

unsigned QorVIO_getSignalSizes(unsigned session, QOR_CORE_REF coreRef, const char** nameArray,
                               unsigned* sizeArray, unsigned arrayLen, unsigned isOutput) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    require(nameArray != nullptr, "QorVIO_getSignalSizes() arg. failed:nameArray!=0");
    require(sizeArray != nullptr, "QorVIO_getSignalSizes() arg. failed:sizeArray!=0");
    require(arrayLen != 0, "QorVIO_getSignalSizes() arg. failed:arrayLen!=0");
    std::vector<std::string> names;
    for (unsigned i = 0; i < arrayLen; ++i) {
      require(nameArray[i] != nullptr, "QorVIO_getSignalSizes() arg. failed:nameArray[i]!=0");
      names.emplace_back(nameArray[i]);
    }
    core.getSignalSizes(std::move(names), sizeArray, arrayLen, isOutput);
  });
}
