// Ends a call whose reason has already been reported to the session.
#pragma once

#include <stdexcept>

namespace QorRT {

/// An exception with this text is reported as the notice of an abort, wherever it comes from.
inline constexpr const char* abortText = "Qor abort command";

class Qor_AbortException : public std::logic_error {
 public:
  Qor_AbortException();
  Qor_AbortException(const Qor_AbortException& other) noexcept;
  ~Qor_AbortException() override;
};

}  // namespace QorRT
