// The frame around every exported function: whatever is thrown inside becomes a message and an error return.
#pragma once

#include <exception>

#include "QorJtag.h"
#include "src/Require.h"

namespace QorRT {

inline constexpr unsigned callSucceeded = 0;
inline constexpr unsigned callFailed = 0x80000000;
inline constexpr unsigned errorMessage = 0x100;
inline constexpr unsigned abortMessage = 0x8000;
inline constexpr unsigned lockTimeout = 60000;  // milliseconds

/// Sends the session a message, whatever the receiving side does with it.
void sendMessage(unsigned session, unsigned type, const char* text) noexcept;

/// Sends the exception's text and gives callFailed.
unsigned reportException(unsigned session, const std::exception& exception) noexcept;

/// Runs the body of an exported function and returns its code. Locals of the body, the target lock among
/// them, are gone before a failure is reported.
template <class Body>
unsigned callFrame(unsigned session, const Body& body) noexcept {
  try {
    return body();
  } catch (const std::exception& exception) {
    return reportException(session, exception);
  } catch (...) {
    sendMessage(session, errorMessage, "Qor internal error.");
    return callFailed;
  }
}

}  // namespace QorRT
