/// @file
/// The twelve fields of a core's information by name, as QorVIO_getCoreInfo() names them.
#pragma once

#include "QorVIO_Records.h"

namespace QorRT {

/// One of them.
struct QorVIO_CoreField {
  const char* name;                    ///< the entry of the map
  unsigned QORVIO_CORE_INFO::*member;  ///< the field of the record
  bool isGeneric;                      ///< cores of other types have it too
};

/// All of them, in the order of the record.
inline constexpr QorVIO_CoreField QorVIO_coreFields[] = {
    {"manufacturer_id", &QORVIO_CORE_INFO::manufacturer_id, true},
    {"core_type", &QORVIO_CORE_INFO::core_type, true},
    {"core_major_version", &QORVIO_CORE_INFO::core_major_version, true},
    {"core_minor_version", &QORVIO_CORE_INFO::core_minor_version, true},
    {"core_revision", &QORVIO_CORE_INFO::core_revision, true},
    {"cg_major_version", &QORVIO_CORE_INFO::cg_major_version, false},
    {"cg_minor_version", &QORVIO_CORE_INFO::cg_minor_version, false},
    {"cg_minor_version_alpha", &QORVIO_CORE_INFO::cg_minor_version_alpha, false},
    {"async_input_count", &QORVIO_CORE_INFO::async_input_count, false},
    {"sync_input_count", &QORVIO_CORE_INFO::sync_input_count, false},
    {"async_output_count", &QORVIO_CORE_INFO::async_output_count, false},
    {"sync_output_count", &QORVIO_CORE_INFO::sync_output_count, false},
};

}  // namespace QorRT
