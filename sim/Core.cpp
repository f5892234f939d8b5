#include "sim/Core.h"

namespace qorsim {

Reply Core::command(unsigned code, const Bits&, bool) {
  return code == 0x0 || code == 0xF ? Reply::accepted : Reply::noSuchCode;
}

Bits Core::result(unsigned code) const {
  return code == 0x0 ? statusWord_ : Bits();
}

}  // namespace qorsim
