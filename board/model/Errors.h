// How a command ends: WrongUse with exit status 2, any other exception with 1. Texts read "what: offending value".
#pragma once

#include <stdexcept>

namespace qor {

class WrongUse : public std::runtime_error {
  using std::runtime_error::runtime_error;
};

/// The device or the link failed.
class Failure : public std::runtime_error {
  using std::runtime_error::runtime_error;
};

}  // namespace qor
