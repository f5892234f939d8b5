#include "sim/CoreCheck.h"

#include "sim/BoardError.h"
#include "sim/StatusWord.h"

namespace qorsim {
namespace {

std::string versionOf(const CoreDescription& core) {
  return std::to_string(core.major) + "." + std::to_string(core.minor);
}

void checkWidth(const std::string& part, const char* key, const CoreDescription& core, unsigned width) {
  if (!core.isVio() && width != 0)
    throw BoardError(part, key, "is for VIO cores only, is " + std::to_string(width));
  requireRange(part, key, width, 0, 65535);
  if (width > widestPort(core))
    throw BoardError(part, key,
                     "must be 0 to 255 in version " + versionOf(core) + ", is " + std::to_string(width));
}

void checkCg(const std::string& part, const CoreDescription& core) {
  if (!core.isVio()) throw BoardError(part, "cg_version", "is for VIO cores only");
  if (statusLayout(core) != StatusLayout::current)
    throw BoardError(part, "cg_version", "is for versions from 10.0 on only, version is " + versionOf(core));
  requireRange(part, "cg_version", core.cg->major, 0, 15);
  requireRange(part, "cg_version", core.cg->minor, 0, 255);
  requireRange(part, "cg_version", core.cg->minorAlpha, 0, 255);
}

}  // namespace

void requireRange(const std::string& part, const char* key, unsigned value, unsigned least, unsigned most) {
  if (value >= least && value <= most) return;
  const std::string range = std::to_string(least) + " to " + std::to_string(most);
  throw BoardError(part, key, "must be " + range + ", is " + std::to_string(value));
}

void checkCore(const std::string& part, const CoreDescription& core) {
  requireRange(part, "type", core.type, 0, 255);
  requireRange(part, "manufacturer", core.manufacturer, 0, 255);
  requireRange(part, "version", core.major, 0, 255);
  requireRange(part, "version", core.minor, 0, 255);
  requireRange(part, "revision", core.revision, 0, 255);
  checkWidth(part, "async_in", core, core.asyncIn);
  checkWidth(part, "sync_in", core, core.syncIn);
  checkWidth(part, "async_out", core, core.asyncOut);
  checkWidth(part, "sync_out", core, core.syncOut);
  if (core.cg) checkCg(part, core);
  if (core.design && !core.isVio()) throw BoardError(part, "design", "is for VIO cores only");
}

}  // namespace qorsim
