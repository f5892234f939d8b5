// The plain records that name a core on the chain and tell what it is.
#pragma once

/// The address of one core. A device index counts from the device nearest to TDO; user chain n is reached
/// through the device's USERn register.
struct QOR_CORE_REF {
  unsigned device_index;
  unsigned user_chain_number;
  unsigned core_index;
};

/// The head of every core's status word. A record of zeros means that there is no such core.
struct QOR_CORE_INFO {
  unsigned manufacturer_id;
  unsigned core_type;  // 9: a VIO core
  unsigned core_major_version;
  unsigned core_minor_version;
  unsigned core_revision;
};
