/// @file
/// The records and the map that cross the exported interface.
#pragma once

#include <string>
#include <unordered_map>

#include "QorCore_Records.h"

namespace QorRT {

/// The text map: hashed by the whole key, compared exactly.
template <class Key, class Value>
using hash_map = std::unordered_map<Key, Value>;

}  // namespace QorRT

/// What a VIO core says of itself. Widths are in bits; 0 means that the core has no such port.
struct QORVIO_CORE_INFO {
  unsigned manufacturer_id;         ///< as in QOR_CORE_INFO
  unsigned core_type;               ///< 9
  unsigned core_major_version;      ///< as in QOR_CORE_INFO
  unsigned core_minor_version;      ///< as in QOR_CORE_INFO
  unsigned core_revision;           ///< as in QOR_CORE_INFO
  unsigned cg_major_version;        ///< the cg fields are 0 for cores before version 10.0
  unsigned cg_minor_version;        ///< as the major one
  unsigned cg_minor_version_alpha;  ///< as the major one
  unsigned async_input_count;       ///< bits
  unsigned sync_input_count;        ///< bits
  unsigned async_output_count;      ///< bits
  unsigned sync_output_count;       ///< bits
};
