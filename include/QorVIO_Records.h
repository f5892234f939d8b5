/// @file
/// The record and the map of the exported interface.
///
/// Conventions
///
///  1. All fields are unsigned 32-bit numbers. Widths are in bits.
#pragma once

#include <string>
#include <unordered_map>

#include "QorCore_Records.h"

namespace QorRT {

/// The text map. Keys are compared exactly, case included.
template <class Key, class Value>
using hash_map = std::unordered_map<Key, Value>;

}  // namespace QorRT

/// The decoded status word of a VIO core. A width of 0 means that the core has no such port.
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
