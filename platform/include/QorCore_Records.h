/// @file
/// The address of a core on the chain, and the head of its status word.
///
/// Conventions
///
///  1. All fields are unsigned numbers. Values beyond a field's range are refused before anything is sent.
#pragma once

/// The address of one core: device, user data register (USER1 to USER4) of that device, and core on its hub.
struct QOR_CORE_REF {
  unsigned device_index;       ///< 0 is the device nearest to TDO
  unsigned user_chain_number;  ///< 1 to 4
  unsigned core_index;         ///< 0 to 15
};

/// The head of the status word of any core. All fields are 0 if there is no core at an address.
struct QOR_CORE_INFO {
  unsigned manufacturer_id;     ///< 8 bits
  unsigned core_type;           ///< 8 bits; 9: a VIO core
  unsigned core_major_version;  ///< 8 bits
  unsigned core_minor_version;  ///< 8 bits
  unsigned core_revision;       ///< 8 bits
};
