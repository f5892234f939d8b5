/// @file
/// The plain records that name a core on the chain and tell what it is.
#pragma once

/// The address of one core. A device index counts from the device nearest to TDO; user chain n is reached
/// through the device's USERn register.
struct QOR_CORE_REF {
  unsigned device_index;       ///< from the device nearest to TDO
  unsigned user_chain_number;  ///< 1 to 4
  unsigned core_index;         ///< 0 to 15
};

/// The head of every core's status word. A record of zeros means that there is no such core.
struct QOR_CORE_INFO {
  unsigned manufacturer_id;     ///< 8 bits
  unsigned core_type;           ///< 8 bits; 9: a VIO core
  unsigned core_major_version;  ///< 8 bits
  unsigned core_minor_version;  ///< 8 bits
  unsigned core_revision;       ///< 8 bits
};
