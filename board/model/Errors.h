/// @file
/// What the engine throws. Texts read "what is wrong: offending value".
#pragma once

#include <stdexcept>

#include "board/Export.h"

namespace qor {

/// The base of all of them.
class QORBOARD_API Error : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// A name, value, file or option that cannot be used. Nothing was sent.
class QORBOARD_API WrongUse : public Error {
 public:
  using Error::Error;
};

/// No signal of that name; the text names the nearest one, if one is near.
class QORBOARD_API UnknownSignal : public WrongUse {
 public:
  using WrongUse::WrongUse;
};

/// The device, the link or a file that was being written failed.
class QORBOARD_API Failure : public Error {
 public:
  using Error::Error;
};

/// Another host reads the core.
class QORBOARD_API Busy : public Failure {
 public:
  using Failure::Failure;
};

/// Another client of the server drives the output. Nothing was sent.
class QORBOARD_API Driven : public Failure {
 public:
  using Failure::Failure;
};

/// A file could not be written: nothing more of it is worth keeping.
class QORBOARD_API FileFailure : public Failure {
 public:
  using Failure::Failure;
};

/// What was waited for did not come in time; the text says what was seen last.
class QORBOARD_API Timeout : public Error {
 public:
  using Error::Error;
};

/// The caller's stop function ended a wait.
class QORBOARD_API Stopped : public Error {
 public:
  using Error::Error;
};

}  // namespace qor
