// A host that unloads libQorVIO while a core of it is still set up: unload LIBQORVIO.
#include <dlfcn.h>

#include <cstdio>

#include "QorCore.h"
#include "QorJtag_Host.h"

int main(int, char** argv) {
  void* const library = dlopen(argv[1], RTLD_NOW);
  if (library == nullptr) return std::puts(dlerror());
  const unsigned session = QorJtag_session_open("sim:");
  const auto initCore =
      reinterpret_cast<unsigned (*)(unsigned, QOR_CORE_REF)>(dlsym(library, "QorVIO_initCore"));
  if (initCore(session, {0, 1, 0}) != 0) return std::puts("no core");
  dlclose(library);
  QorJtag_session_close(session);  // destroys the core
  return 0;
}
