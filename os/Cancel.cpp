#include "os/Cancel.h"

#include <pthread.h>

namespace os {

CancelLater::CancelLater() noexcept {
  pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &before_);
}

CancelLater::~CancelLater() {
  pthread_setcancelstate(before_, nullptr);
}

void endIfCancelled() {
  pthread_testcancel();
}

}  // namespace os
