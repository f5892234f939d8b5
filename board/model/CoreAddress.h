/// @file
/// The address of a core as text: "device.chain.index".
#pragma once

#include <string>

#include "QorVIO_Records.h"
#include "board/Export.h"

namespace qor {

QORBOARD_API std::string refText(QOR_CORE_REF ref);

/// Throws WrongUse.
QORBOARD_API QOR_CORE_REF parseRef(const std::string& text);

constexpr bool isSame(QOR_CORE_REF a, QOR_CORE_REF b) {
  return a.device_index == b.device_index && a.user_chain_number == b.user_chain_number &&
         a.core_index == b.core_index;
}

}  // namespace qor
