#include "sim/StatusWord.h"

namespace qorsim {

StatusLayout statusLayout(const CoreDescription& core) {
  const unsigned key = core.major << 4 | core.minor;
  if (key < 0x62) return StatusLayout::oldest;
  return key < 0xA0 ? StatusLayout::middle : StatusLayout::current;
}

unsigned widestPort(const CoreDescription& core) {
  return statusLayout(core) == StatusLayout::oldest ? 255 : 65535;
}

Bits statusWord(const CoreDescription& core) {
  Bits bits;
  for (const unsigned field : {core.manufacturer, core.type, core.major, core.minor, core.revision})
    appendNumber(bits, field, 8);
  if (core.isVio()) {
    if (statusLayout(core) == StatusLayout::current) {
      const CgVersion cg = core.cg.value_or(CgVersion{1, 0, 0});
      appendNumber(bits, cg.major, 4);
      appendNumber(bits, cg.minor, 8);
      appendNumber(bits, cg.minorAlpha, 8);
    }
    const unsigned portBits = statusLayout(core) == StatusLayout::oldest ? 8 : 16;
    for (const unsigned width : {core.asyncIn, core.syncIn, core.asyncOut, core.syncOut})
      appendNumber(bits, width, portBits);
  }
  bits.resize(128);
  return bits;
}

}  // namespace qorsim
