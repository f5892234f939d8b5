#include "platform/core/Qor_HubAccess.h"

#include <algorithm>
#include <stdexcept>

#include "platform/core/Qor_SessionCores.h"

namespace QorRT {
namespace {

/// TCKs in Run-Test/Idle after each frame, first try first.
constexpr unsigned idleCyclesOfTry[] = {8, 64, 512, 4096, 32768};

constexpr std::size_t headBytes = 2, checkBits = 16;

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

/// What to send in the place of a frame that has to be repeated.
Qor_Frame repeatOf(const Qor_Frame& frame, Qor_Verdict verdict) {
  Qor_Frame next = frame;
  if (frame.code == Qor_HubCode::read) next.code = Qor_HubCode::readAgain;
  // A pending write was taken: sent again, its pulse trains would play twice.
  if (frame.code == Qor_HubCode::write && verdict == Qor_Verdict::pending) next = {Qor_HubCode::nothing};
  return next;
}

/// The bytes behind the head, with the bits from `bitCount` on cleared.
std::vector<unsigned char> bitsBehindHead(const std::vector<unsigned char>& answer, std::size_t bitCount) {
  std::vector<unsigned char> bits(answer.begin() + headBytes, answer.end());
  if (bitCount % 8 != 0) bits.back() &= static_cast<unsigned char>((1U << bitCount % 8) - 1);
  return bits;
}

}  // namespace

Qor_HubAccess::Qor_HubAccess(Qor_Cable& cable, const QOR_CORE_REF& coreRef)
    : cable_(cable), coreRef_(coreRef) {
  if (coreRef.core_index <= 15) return;
  throw std::logic_error("the core index " + std::to_string(coreRef.core_index) + " is above 15");
}

void Qor_HubAccess::settle() {
  run({{Qor_HubCode::nothing}, {Qor_HubCode::nothing}});
}

bool Qor_HubAccess::readStatus(Qor_StatusWord& word) {
  const auto answers = run({{Qor_HubCode::status, 8 * statusWordBytes}, {Qor_HubCode::nothing}});
  if (!answers) return false;
  std::copy_n(answers->front().begin() + headBytes, statusWordBytes, word.begin());
  return true;
}

void Qor_HubAccess::write(const std::vector<unsigned char>& payload, std::size_t bitCount) {
  if (!run({{Qor_HubCode::write, 0, &payload, bitCount}, {Qor_HubCode::nothing}})) {
    fail("no such core, or it cannot be written");
  }
}

Qor_ReadResult Qor_HubAccess::read(std::size_t recordBits, bool afterFailure) {
  const unsigned code = afterFailure ? Qor_HubCode::readAgain : Qor_HubCode::read;
  const auto answers = run({{code, recordBits}, {Qor_HubCode::acknowledge}, {Qor_HubCode::nothing}});
  if (!answers) fail("no such core, or it cannot be read");
  return {bitsBehindHead(answers->front(), recordBits + checkBits), answerHead(answers->back()) & 0xF};
}

std::optional<Qor_HubAccess::Answers> Qor_HubAccess::run(Frames frames) {
  for (const unsigned idleCycles : idleCyclesOfTry) {
    Answers answers = exchange(frames, idleCycles);
    Qor_Verdict verdict = Qor_Verdict::good;
    std::size_t i = 0;
    for (; i < answers.size() && verdict == Qor_Verdict::good; ++i) {
      verdict = judgeAnswer(answers[i], frames[i], coreRef_.core_index);
    }
    if (verdict == Qor_Verdict::good) return answers;
    if (verdict == Qor_Verdict::noSuchCore) return std::nullopt;
    if (verdict != Qor_Verdict::pending && verdict != Qor_Verdict::refused) {
      fail(failureText(verdict, answers[i - 1], frames[i - 1]));
    }
    frames.front() = repeatOf(frames.front(), verdict);
  }
  fail("design clock stopped");
}

Qor_HubAccess::Answers Qor_HubAccess::exchange(const Frames& frames, unsigned idleCycles) {
  const QueueGuard guard(cable_);
  cable_.scanIr(coreRef_.device_index, coreRef_.user_chain_number);
  std::vector<std::size_t> captures;
  for (std::size_t i = 0; i < frames.size(); ++i) {
    const bool fetches = i != 0;  // the first scan brings what an earlier sequence left
    const std::size_t bits = fetches ? answerLength(frames[i - 1]) : frameLength(frames[i]);
    const std::size_t scan =
        cable_.scanDr(coreRef_.device_index, buildScan(frames[i], coreRef_.core_index, bits), bits, fetches);
    if (fetches) captures.push_back(scan);
    cable_.idle(idleCycles);
  }
  flush();
  Answers answers;
  for (const std::size_t scan : captures) answers.push_back(cable_.captured(scan));
  return answers;
}

void Qor_HubAccess::flush() {
  try {
    cable_.flush();
  } catch (const std::runtime_error& e) {  // the cable knows what is wrong with the link, not what it was for
    fail(e.what());
  }
}

void Qor_HubAccess::fail(const std::string& text) const {
  throw std::runtime_error(addressText(coreRef_) + ": " + text);
}

}  // namespace QorRT
