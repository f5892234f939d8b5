// The kinds of cable that a URL can name.
#pragma once

#include <memory>

#include "Qor_Cable.h"

namespace QorRT {

/// Opens the cable of a URL "KIND:REST". Throws logic_error when the URL is null, empty, without a colon or
/// of an unknown kind, and what the factory throws.
std::unique_ptr<Qor_Cable> openCable(const char* url);

}  // namespace QorRT
