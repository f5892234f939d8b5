#include "platform/core/Qor_CoreLink.h"

#include <algorithm>
#include <random>

namespace QorRT {
namespace {

constexpr unsigned mostFailures = 8;
constexpr std::size_t growth = 8;

}  // namespace

unsigned drawTagAbove() {
  std::random_device source;
  return std::uniform_int_distribution<unsigned>(0x001, 0xFFF)(source);
}

bool Qor_CallTags::failed() {
  if (++failures_ < mostFailures) return false;
  const unsigned before = above_;
  while (above_ == before) above_ = drawTagAbove();
  failures_ = 0;
  return true;
}

bool Qor_WaitingRoom::grow() {
  if (room_ == mostRoom) return false;
  room_ = std::min(room_ * growth, mostRoom);
  return true;
}

// Not at once: where the need varies around a room, every other transfer would have to be repeated.
void Qor_WaitingRoom::needed(std::size_t bits) {
  const std::size_t smaller = std::max(room_ / growth, least_);
  if (bits <= smaller - smaller / 4) room_ = smaller;
}

}  // namespace QorRT
