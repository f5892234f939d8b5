#include "Qor_ServerLog.h"

namespace QorRT {

Qor_ServerLog::~Qor_ServerLog() = default;

}  // namespace QorRT
