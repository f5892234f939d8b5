// The frame around every exported function: whatever is thrown inside becomes a message and an error return.
#pragma once

#include <cxxabi.h>

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
void sendMessage(unsigned session, unsigned type, const char* text);

/// Sends the exception's text and gives callFailed.
unsigned reportException(unsigned session, const std::exception& exception);

/// Runs the body of an exported function and returns its code. Locals of the body, the target lock among
/// them, are gone before a failure is reported. A thread that is cancelled unwinds through here: the C library
/// ends a process that stops it. So the message is sent outside the handlers, which it cannot leave.
template <class Body>
unsigned callFrame(unsigned session, const Body& body) {
  std::exception_ptr owner;
  const std::exception* failure = nullptr;
  try {
    return body();
  } catch (const std::exception& exception) {
    owner = std::current_exception();
    failure = &exception;
  } catch (const abi::__forced_unwind&) {
    throw;
  } catch (...) {  // a failure without a text
  }
  if (failure != nullptr) return reportException(session, *failure);
  sendMessage(session, errorMessage, "Qor internal error.");
  return callFailed;
}

}  // namespace QorRT
