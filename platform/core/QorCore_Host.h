// The host side of libQorCore: questions about cores that libQorVIO does not ask.
#pragma once

#include <cstddef>

#include "QorCore_Records.h"
#include "QorExport.h"

namespace QorRT {

/// Whether one VIO core answers at both addresses. It is given a mark at one of them, by a write that marks no output, and
/// looked for at the other. `payloadBits`: what a write of the core takes. Throws as reads and writes do.
QOR_API bool isOneCore(unsigned session, const QOR_CORE_REF& one, const QOR_CORE_REF& other,
                       std::size_t payloadBits);

}  // namespace QorRT
