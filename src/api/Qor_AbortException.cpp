#include "src/api/Qor_AbortException.h"

namespace QorRT {

Qor_AbortException::Qor_AbortException() : std::logic_error(abortText) {}

Qor_AbortException::Qor_AbortException(const Qor_AbortException& other) noexcept = default;

Qor_AbortException::~Qor_AbortException() = default;

}  // namespace QorRT
