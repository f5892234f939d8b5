#include "platform/core/Qor_HubAccess.h"

#include <algorithm>
#include <chrono>
#include <stdexcept>

#include "QorCore.h"
#include "platform/core/Qor_Attempts.h"
#include "platform/core/Qor_SessionCores.h"

namespace QorRT {
namespace {

constexpr std::size_t mostLate = 2;  // of TDI and of TDO, in TCKs

/// Leaves nothing queued, whatever throws.
class QueueGuard {
 public:
  explicit QueueGuard(Qor_Cable& cable) : cable_(cable) {}
  ~QueueGuard() { cable_.drop(); }
  QueueGuard(const QueueGuard&) = delete;
  QueueGuard& operator=(const QueueGuard&) = delete;

 private:
  Qor_Cable& cable_;
};

std::uint64_t& repeatsOf(const Qor_Answer& answer, QorJtag_Statistics& statistics) {
  switch (answer.verdict) {
    case Qor_Verdict::good:
      return statistics.repeatsRefused;
    case Qor_Verdict::slow:
      return statistics.repeatsSlow;
    case Qor_Verdict::noHub:
      return statistics.repeatsNoHub;
    case Qor_Verdict::badCrc:
      return statistics.repeatsBadCrc;
    default:
      return statistics.repeatsNoHead;
  }
}

std::string waitText(const Qor_Answer& answer, bool mayBeDone) {
  const bool isAnothers = answer.verdict == Qor_Verdict::good && mayBeDone;
  return isAnothers
             ? "the write was refused when repeated: another program wrote to the core, or its design clock "
               "stopped"
             : "design clock stopped";
}

std::uint64_t nanosecondsSince(std::chrono::steady_clock::time_point begin) {
  const std::chrono::nanoseconds passed = std::chrono::steady_clock::now() - begin;
  return static_cast<std::uint64_t>(passed.count());
}

}  // namespace

Qor_HubAccess::Qor_HubAccess(Qor_Cable& cable, Qor_LinkRecord& record, Qor_CoreLink& link,
                             const QOR_CORE_REF& coreRef)
    : cable_(cable), record_(record), link_(link), coreRef_(coreRef), lead_(cable.devices().size() - 1) {
  if (coreRef.core_index <= 15) return;
  throw std::logic_error("the core index " + std::to_string(coreRef.core_index) + " is above 15");
}

bool Qor_HubAccess::readStatus(Qor_StatusWord& word) {
  Qor_WaitingRoom room(leastRoom);
  const Qor_Answer answer =
      ask({Qor_HubCode::status, coreRef_.core_index, link_.readTags.upcoming(), 8 * statusWordBytes}, room);
  if (answer.isNoSuchCore()) return false;
  std::copy_n(answer.bits.begin(), statusWordBytes, word.begin());
  return true;
}

void Qor_HubAccess::write(const Qor_Bytes& payload, std::size_t bitCount, bool playsTrains) {
  try {
    if (!link_.knowsWriteTags) introduce(bitCount);
    const Qor_Request request{Qor_HubCode::write, coreRef_.core_index, link_.writeTags.next(), 0, &payload,
                              bitCount,           Qor_HubCode::repeat};
    const Qor_Answer answer = ask(request, playsTrains ? link_.playRoom : link_.writeRoom);
    if (answer.isNoSuchCore()) fail("no such core, or it cannot be written");
    link_.writeTags.succeeded();
  } catch (...) {
    if (link_.writeTags.failed()) link_.knowsWriteTags = false;
    throw;
  }
}

// A write that marks no output. Only a hub that has obeyed one of our tags knows whether a repeat was obeyed before.
void Qor_HubAccess::introduce(std::size_t payloadBits) {
  link_.knowsWriteTags = mark(link_.writeTags.current(), payloadBits);
}

bool Qor_HubAccess::mark(unsigned tag, std::size_t payloadBits) {
  const Qor_Bytes nothing(byteCount(payloadBits));
  const Qor_Answer answer =
      ask({Qor_HubCode::write, coreRef_.core_index, tag, 0, &nothing, payloadBits}, link_.writeRoom);
  return !answer.isNoSuchCore();
}

// A repeat is refused by a core whose last write was another host's.
bool Qor_HubAccess::isMarked(unsigned tag, std::size_t payloadBits) {
  const Qor_Bytes nothing(byteCount(payloadBits));
  Qor_Request request{
      Qor_HubCode::write | Qor_HubCode::repeat, coreRef_.core_index, tag, 0, &nothing, payloadBits};
  request.mayBeRefused = true;
  const Qor_Answer answer = ask(request, link_.writeRoom);
  return !answer.isRefused() && !answer.isNoSuchCore();
}

Qor_ReadResult Qor_HubAccess::read(std::size_t recordBits, bool keepActivity) {
  try {
    const unsigned code = keepActivity ? Qor_HubCode::readAgain : Qor_HubCode::read;
    Qor_Answer answer =
        ask({code, coreRef_.core_index, link_.readTags.next(), recordBits, nullptr, 0, Qor_HubCode::repeat},
            link_.readRoom);
    if (answer.isNoSuchCore()) fail("no such core, or it cannot be read");
    link_.readTags.succeeded();
    return {std::move(answer.bits), answer.flags()};
  } catch (...) {
    link_.readTags.failed();
    throw;
  }
}

Qor_Answer Qor_HubAccess::ask(Qor_Request request, Qor_WaitingRoom& room) {
  Qor_Damage damage;
  Qor_Wait wait;
  for (bool mayBeDone = false, isRepeat = false;; isRepeat = true) {
    std::string seen;
    Qor_Answer answer = exchange(request, room.bits(), isRepeat, seen);
    const bool isWhole = answer.verdict == Qor_Verdict::good;
    if (isWhole && answer.isOfTwoCores()) fail("two cores have this index, so the hub obeys neither");
    if (isWhole && (request.mayBeRefused || !answer.isRefused())) {
      room.needed(answer.waited);
      return answer;
    }
    if (isWhole || answer.verdict == Qor_Verdict::slow) {
      if (!wait.mayRepeat(room, cable_.isStopped())) fail(waitText(answer, mayBeDone) + ", " + wait.text());
    } else if (!damage.mayRepeat(seen, answer.verdict == Qor_Verdict::noHub)) {
      if (damage.isOnlySilence()) throw Qor_NoHub(addressText(coreRef_) + ": " + damage.text());
      fail(damage.text());
    }
    QorJtag_Statistics repeat;
    ++repeatsOf(answer, repeat);
    record_.add(repeat);
    mayBeDone = mayBeDone || !isWhole;
    if (mayBeDone) request.code |= request.repeat;
  }
}

/// One attempt; `seen` gets what was wrong with it. `selects`: the cable does not rely on the instruction that it
/// selected before.
Qor_Answer Qor_HubAccess::exchange(const Qor_Request& request, std::size_t room, bool selects,
                                   std::string& seen) {
  const Qor_Frame frame(request);
  const std::size_t late = hub().late();
  const std::size_t bitCount = lead_ + late + frame.scanBits(room);
  const Qor_Bytes bits = run(frame.scan(bitCount), bitCount, selects);
  Qor_Answer answer{Qor_Verdict::noHead};
  if (request.code == Qor_HubCode::status) answer = calibrate(frame, bits, bitCount);
  if (answer.verdict != Qor_Verdict::good) answer = frame.judge({bits, bitCount, lead_ + late});
  if (answer.verdict != Qor_Verdict::good)
    seen = failureText(answer, {bits, bitCount, lead_ + late}, request);
  return answer;
}

// A late TDO delays the hello and the answer, a late TDI the answer alone.
Qor_Answer Qor_HubAccess::calibrate(const Qor_Frame& frame, const Qor_Bytes& bits, std::size_t bitCount) {
  QorJtag_Hub found = hub();
  if (const std::size_t hello = findHello(bits); hello <= mostLate)
    found.lateTdo = static_cast<unsigned>(hello);
  Qor_Answer answer{Qor_Verdict::noHead};
  for (found.lateTdi = 0; found.lateTdi <= mostLate; ++found.lateTdi) {
    answer = frame.judge({bits, bitCount, lead_ + found.late()});
    if (answer.verdict != Qor_Verdict::good) continue;
    record_.keep(found);
    break;
  }
  return answer;
}

Qor_Bytes Qor_HubAccess::run(const Qor_Bytes& out, std::size_t bitCount, bool selects) {
  const QueueGuard guard(cable_);
  const auto begin = std::chrono::steady_clock::now();
  cable_.scanIr(coreRef_.device_index, coreRef_.user_chain_number, selects);
  const std::size_t scan = cable_.scanDr(coreRef_.device_index, out, bitCount, true);
  try {
    cable_.flush();
  } catch (const std::runtime_error& e) {  // the cable knows what is wrong with the link, not what it was for
    fail(e.what());
  }
  QorJtag_Statistics transfer;
  transfer.transfers = 1;
  transfer.bits = bitCount;
  transfer.nanoseconds = nanosecondsSince(begin);
  record_.add(transfer);
  return cable_.captured(scan);
}

QorJtag_Hub Qor_HubAccess::hub() const {
  return record_.hub(coreRef_.device_index, coreRef_.user_chain_number);
}

void Qor_HubAccess::fail(const std::string& text) const {
  throw std::runtime_error(addressText(coreRef_) + ": " + text);
}

}  // namespace QorRT
