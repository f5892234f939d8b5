// A host as small as can be, at the end of wires that damage what passes: calls of one core, with their repeats.
#pragma once

#include <functional>
#include <map>
#include <optional>
#include <string>

#include "rtl/cosim/PinsChain.h"
#include "rtl/cosim/RandomScans.h"

namespace qorrtl {

/// What a core says, or `lost` with what was seen.
struct Answer {
  enum Fate { whole, late, lost } fate = lost;  // late: a head, and no more within the scan
  unsigned flags = 0;
  qorsim::Bits data;
  static constexpr unsigned noSuch = 2, refused = 4, overlap = 8;
};

class AttackedHost {
 public:
  using Bits = qorsim::Bits;
  static constexpr unsigned statusBits = 128;

  /// `firstTag`: its upper 12 bits are this host's.
  AttackedHost(RandomScans& random, PinsChain& chain, std::size_t payloadBits, std::size_t recordBits,
               unsigned firstTag)
      : random_(random),
        chain_(chain),
        payloadBits_(payloadBits),
        recordBits_(recordBits),
        writeTag_(firstTag),
        readTag_(firstTag) {}

  /// One scan in so many is damaged; 0 for none.
  void setDamage(unsigned oneIn) { damage_ = oneIn; }

  /// Called between the attempts of a call, and between the IR and the DR scan of each.
  /// @{
  std::function<void()> between = [] {};
  std::function<void()> interrupting = [] {};
  /// @}

  bool synchronise() {
    const Bits nothing(payloadBits_, 0);
    for (unsigned i = 0; i < 60; ++i) {
      const Answer answer = transfer(0x2, writeTag_, nothing);
      if (answer.fate == Answer::whole && answer.flags == 0) return true;
      between();
    }
    return false;
  }

  bool write(const Bits& payload) {
    writeTag_ = nextTag(writeTag_);
    return call(0x2, writeTag_, payload).has_value();
  }

  /// The record, and its flags.
  std::optional<Answer> read() {
    readTag_ = nextTag(readTag_);
    const std::optional<Answer> answer = call(readFailed_ ? 0x5 : 0x3, readTag_, {});
    readFailed_ = !answer;
    return answer;
  }

  std::optional<Answer> status() { return call(0x0, 0, {}); }

  std::map<std::string, unsigned long> counts;

 private:
  static unsigned nextTag(unsigned tag) { return (tag & 0xFFF0) | ((tag + 1) & 0xF); }

  void select() {
    Bits ir;
    qorsim::appendNumber(ir, 2, 6);
    chain_.scanIr(ir, 0);
  }

  std::optional<Answer> call(unsigned code, unsigned tag, const Bits& payload) {
    ++counts["calls"];
    if (random_.oneIn(4)) room_ = 8;
    unsigned damaged = 0, first = code;
    for (unsigned attempts = 0; attempts < 30; ++attempts) {
      const Answer answer = transfer(code, tag, payload);
      const unsigned repeat = first == 0 ? 0 : first | 8;
      if (answer.fate == Answer::lost) {
        if (++damaged > 3) break;
        code = repeat;
      } else if (answer.fate == Answer::late) {
        ++counts["too late"];
        room_ = std::min(512u, room_ * 8);
        code = repeat;
      } else if ((answer.flags & Answer::refused) != 0) {
        ++counts["refused"];
      } else if ((answer.flags & Answer::noSuch) != 0) {
        ++counts["no such"];
        break;
      } else {
        return answer;
      }
      ++counts["repeats"];
      between();
    }
    ++counts["failed calls"];
    return std::nullopt;
  }

  Answer transfer(unsigned code, unsigned tag, const Bits& payload) {
    ++counts["transfers"];
    const bool writes = (code & 7) == 2;
    const std::size_t dataBits = writes ? 0 : code == 0 ? statusBits : recordBits_;
    const Frame frame = writes ? writeFrame(code, 0, tag, payload) : headerFrame(code, 0, tag);
    Bits out = frame.bits;
    out.resize(out.size() + 10 + room_ + dataBits + crcBits, 1);
    const Bits in = played(std::move(out));
    Answer answer = judged(in, headerEnd + 1, Crc(headerFrame(code, 0, tag).crc), dataBits);
    if (writes && answer.fate == Answer::lost)
      answer = judged(in, headerEnd + payloadBits_ + crcBits + 1, Crc(frame.crc), dataBits);
    return answer;
  }

  static Answer judged(const Bits& in, std::size_t place, Crc crc, std::size_t dataBits) {
    Answer answer;
    if (in.size() < place + headBits + 1 || in[0] == 0) return answer;
    const Bits head(in.begin() + place, in.begin() + place + headBits);
    answer.flags = qorsim::numberAt(head.data(), 4);
    if (qorsim::numberAt(head.data() + 4, 4) != 0xA || (answer.flags & 1) != 0) return answer;
    place += headBits;
    while (place < in.size() && in[place] == 0) ++place;
    answer.fate = Answer::late;
    if (place == in.size()) return answer;
    answer.fate = Answer::lost;
    const bool done = (answer.flags & (Answer::noSuch | Answer::refused)) == 0;
    const std::size_t first = place + 1, end = first + (done ? dataBits : 0);
    if (end + crcBits > in.size()) return answer;
    answer.data.assign(in.begin() + first, in.begin() + end);
    if (crc.add(head).add(answer.data).value() == qorsim::numberAt(in.data() + end, crcBits))
      answer.fate = Answer::whole;
    return answer;
  }

  // Both lines may be damaged, but the host knows how many bits it wants.
  Bits played(Bits bits) {
    const std::size_t count = bits.size();
    select();
    interrupting();
    if (damage_ != 0 && random_.oneIn(16)) otherSoftware();
    if (damages()) {
      const bool cut = random_.oneIn(6);
      damage(bits);
      if (cut) {
        ++counts["cut scans"];
        bits.resize(1 + random_.below(static_cast<unsigned>(count)));
      }
    }
    chain_.scanDr(bits, pausePoint(random_, bits));
    bits.resize(count, 0);
    if (damages()) damage(bits);
    if (damage_ != 0 && random_.oneIn(8)) otherSoftware();
    return bits;
  }

  bool damages() { return damage_ != 0 && random_.oneIn(damage_); }

  void damage(Bits& bits) {
    const std::size_t count = bits.size();
    const std::size_t place = random_.below(static_cast<unsigned>(count));
    switch (random_.below(6)) {
      case 0:
      case 1:
        ++counts["flipped bits"];
        bits[place] ^= 1;
        break;
      case 2:
        ++counts["lost bits"];
        bits.erase(bits.begin() + static_cast<std::ptrdiff_t>(place));
        break;
      case 3:
        ++counts["doubled bits"];
        bits.insert(bits.begin() + place, bits[place]);
        break;
      case 4:
        ++counts["bursts"];
        for (std::size_t i = place, end = std::min(count, place + 1 + random_.below(60)); i < end; ++i)
          bits[i] = static_cast<unsigned char>(random_.below(2));
        break;
      default:
        ++counts["stuck lines"];
        std::fill(bits.begin() + place, bits.end(), static_cast<unsigned char>(random_.below(2)));
    }
    bits.resize(count, 1);
  }

  // Scans that are no frames, of this user register or another.
  void otherSoftware() {
    ++counts["scans of other software"];
    Bits ir;
    qorsim::appendNumber(ir, random_.below(64), 6);
    chain_.scanIr(ir, 0);
    Bits scan = random_.bits(1 + random_.below(200));
    chain_.scanDr(scan, pausePoint(random_, scan));
  }

  RandomScans& random_;
  PinsChain& chain_;
  std::size_t payloadBits_, recordBits_;
  unsigned damage_ = 0;
  unsigned room_ = 8;
  unsigned writeTag_, readTag_;
  bool readFailed_ = false;
};

}  // namespace qorrtl
