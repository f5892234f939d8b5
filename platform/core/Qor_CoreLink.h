// What a session remembers of one core between transfers. Guarded by the session's target lock.
#pragma once

#include <cstddef>

namespace QorRT {

/// The smallest and largest room for waiting, in TCKs: between them it grows by 8. A train plays for 16 design clocks.
inline constexpr std::size_t leastRoom = 8, trainRoom = 32, mostRoom = 512;

/// A number that two sessions hardly share, 001 to FFF: the upper 12 bits of their tags.
unsigned drawTagAbove();

/// A tag belongs to one call, and repeats of its frame have the same one, so that the hub knows them. Writes and reads
/// are counted each for itself. A row of failures draws a new upper part before the count comes round to a tag that
/// the hub may still know.
class Qor_CallTags {
 public:
  explicit Qor_CallTags(unsigned above) : above_(above) {}

  unsigned next() { return above_ << 4 | (++count_ & 0xF); }
  unsigned current() const { return above_ << 4 | (count_ & 0xF); }
  unsigned upcoming() const { return above_ << 4 | ((count_ + 1) & 0xF); }

  void succeeded() { failures_ = 0; }
  /// True when the upper part is another one from now on.
  bool failed();

 private:
  unsigned above_;
  unsigned count_ = 0;
  unsigned failures_ = 0;
};

/// How much slower than TCK the design clock is, learned from one transfer for the next of its kind.
class Qor_WaitingRoom {
 public:
  explicit Qor_WaitingRoom(std::size_t least) : least_(least), room_(least) {}

  std::size_t bits() const { return room_; }
  /// False when there is no larger one.
  bool grow();
  /// Shrinks when far less was needed.
  void needed(std::size_t bits);

 private:
  std::size_t least_;
  std::size_t room_;
};

struct Qor_CoreLink {
  explicit Qor_CoreLink(unsigned tagAbove) : writeTags(tagAbove), readTags(tagAbove) {}

  Qor_CallTags writeTags, readTags;
  bool knowsWriteTags = false;  // the hub has obeyed a write with the present upper part
  bool readIsOwed = false;      // the activity of a read may not have reached the caller
  Qor_WaitingRoom readRoom{leastRoom}, writeRoom{leastRoom}, playRoom{trainRoom};
};

}  // namespace QorRT
