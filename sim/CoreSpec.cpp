#include <utility>

#include "Sim.h"

namespace qorsim {

CoreSpec::CoreSpec(unsigned type) {
  description_.type = type;
}

CoreSpec& CoreSpec::asyncIn(unsigned width) {
  description_.asyncIn = width;
  return *this;
}

CoreSpec& CoreSpec::syncIn(unsigned width) {
  description_.syncIn = width;
  return *this;
}

CoreSpec& CoreSpec::asyncOut(unsigned width) {
  description_.asyncOut = width;
  return *this;
}

CoreSpec& CoreSpec::syncOut(unsigned width) {
  description_.syncOut = width;
  return *this;
}

CoreSpec& CoreSpec::version(unsigned major, unsigned minor) {
  description_.major = major;
  description_.minor = minor;
  return *this;
}

CoreSpec& CoreSpec::revision(unsigned number) {
  description_.revision = number;
  return *this;
}

CoreSpec& CoreSpec::manufacturer(unsigned id) {
  description_.manufacturer = id;
  return *this;
}

CoreSpec& CoreSpec::cgVersion(unsigned major, unsigned minor, unsigned minorAlpha) {
  description_.cg = CgVersion{major, minor, minorAlpha};
  return *this;
}

CoreSpec& CoreSpec::design(std::shared_ptr<Design> design) {
  description_.design = std::move(design);
  return *this;
}

CoreSpec vio() {
  return CoreSpec(CoreDescription::vioType);
}

CoreSpec otherCore(unsigned type) {
  return CoreSpec(type);
}

}  // namespace qorsim
