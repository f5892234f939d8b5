#include "sim/Core.h"

namespace qorsim {

Reply Core::reply(const Command& command) const {
  return command.code == 0x0 || command.code == 0xF ? Reply::answered : Reply::unknown;
}

Bits Core::data(unsigned code) const {
  return code == 0x0 ? statusWord_ : Bits();
}

}  // namespace qorsim
