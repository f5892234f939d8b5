#include "os/Descriptor.h"

#include <fcntl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <cerrno>
#include <system_error>

namespace os {
namespace {

constexpr int firstPrivate = 3;

}  // namespace

int privateCopy(int descriptor) {
  const int copy = ::fcntl(descriptor, F_DUPFD_CLOEXEC, firstPrivate);
  if (copy < 0) throw std::system_error(errno, std::generic_category(), "no descriptor is left");
  return copy;
}

int keptPrivate(int descriptor) {
  struct Closing {
    ~Closing() { ::close(descriptor); }
    int descriptor;
  } closing{descriptor};
  return privateCopy(descriptor);
}

// The kernel may be older than the call.
void inheritNothing() noexcept {
  if (::close_range(firstPrivate, ~0u, CLOSE_RANGE_CLOEXEC) == 0) return;
  rlimit most{};
  if (::getrlimit(RLIMIT_NOFILE, &most) != 0) return;
  for (int each = firstPrivate; each < static_cast<int>(most.rlim_cur); ++each)
    ::fcntl(each, F_SETFD, FD_CLOEXEC);
}

}  // namespace os
