#include <algorithm>
#include <cstdint>
#include <stdexcept>

#include "QorCore.h"
#include "platform/core/Qor_CommandText.h"
#include "platform/core/Qor_HubAccess.h"
#include "platform/core/Qor_SessionCores.h"
#include "platform/jtag/Qor_SessionAccess.h"

namespace QorRT {
namespace {

constexpr unsigned coreFound = 0, noSuchCore = 1;

/// Zeroes `*coreInfo` and `bitCount` bits of `bytes`, then fills both if there is a core; false if not.
bool readStatus(unsigned session, const QOR_CORE_REF& coreRef, QOR_CORE_INFO* coreInfo, unsigned char* bytes,
                std::size_t bitCount) {
  if (coreInfo == nullptr) throw std::logic_error("the core information record of a status read is null");
  *coreInfo = {};
  std::fill_n(bytes, (bitCount + 7) / 8, static_cast<unsigned char>(0));
  Qor_StatusWord word{};
  if (!Qor_HubAccess(sessionCable(session), coreRef).readStatus(word)) return false;
  *coreInfo = {word[0], word[1], word[2], word[3], word[4]};
  std::copy_n(word.begin(), std::min((bitCount + 7) / 8, statusWordBytes), bytes);
  if (bitCount % 8 != 0) bytes[bitCount / 8] &= static_cast<unsigned char>((1U << bitCount % 8) - 1);
  return true;
}

void requireResult(const std::vector<Qor_PortCommand>& commands, const unsigned char* result,
                   unsigned bitCount) {
  std::uint64_t bytes = 0;
  for (const Qor_PortCommand& command : commands) bytes += command.resultBytes();
  if (bitCount != bytes * 8) {
    throw std::logic_error("the result has " + std::to_string(bitCount) +
                           " bits, but the command text returns " + std::to_string(bytes * 8));
  }
  if (result == nullptr && bytes != 0)
    throw std::logic_error("the result of a command text that reads is null");
}

/// Tells the callback the session, how many pairs of lines are done, and of how many.
void report(QOR_PROGRESS_CALLBACK progress, unsigned session, std::size_t done, std::size_t count) {
  if (progress == nullptr) return;
  const auto status = done == count ? QOR_PROGRESS_DONE : QOR_PROGRESS_RUNNING;
  const auto answer = progress(session, static_cast<unsigned>(done), static_cast<unsigned>(count), status);
  if (answer == QOR_PROGRESS_ABORT) throw std::logic_error("Qor abort command");
}

/// The reads of one text. Each is noted before its scans and struck off when its bits are with the caller, so
/// that whatever goes wrong between makes the next read keep the activity that this one took.
class ReadNotes {
 public:
  explicit ReadNotes(unsigned session) : session_(session) {}

  /// True when an earlier text did not bring home a read of the address, and this one has not yet.
  bool note(const QOR_CORE_REF& coreRef) {
    if (cores_ == nullptr) cores_ = Qor_SessionCores::open(session_);
    const bool isFirst = noted_.insert(coreRef).second;
    return cores_->note(Qor_Transfer::read, coreRef) && isFirst;
  }

  void strikeOff() noexcept {
    for (const QOR_CORE_REF& coreRef : noted_) cores_->succeeded(Qor_Transfer::read, coreRef);
  }

 private:
  const unsigned session_;
  std::shared_ptr<Qor_SessionCores> cores_;
  std::set<QOR_CORE_REF, Qor_AddressOrder> noted_;
};

void runWrite(unsigned session, const Qor_PortCommand& command) {
  Qor_HubAccess hub(sessionCable(session), command.coreRef);
  const std::shared_ptr<Qor_SessionCores> cores = Qor_SessionCores::open(session);
  if (cores->note(Qor_Transfer::write, command.coreRef)) hub.settle();
  hub.write(command.payload, command.bitCount);
  cores->succeeded(Qor_Transfer::write, command.coreRef);
}

/// Appends what the command returns.
void runRead(unsigned session, const Qor_PortCommand& command, ReadNotes& notes,
             std::vector<unsigned char>& result) {
  Qor_HubAccess hub(sessionCable(session), command.coreRef);
  const bool afterFailure = notes.note(command.coreRef);
  if (afterFailure) hub.settle();
  const Qor_ReadResult read = hub.read(command.bitCount, afterFailure);
  result.insert(result.end(), read.bits.begin(), read.bits.end());
  result.push_back(static_cast<unsigned char>(read.flags));
}

}  // namespace

void Qor_CoreComm::getCoreStatus(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                                 Qor_ByteBuffer& statusWord, unsigned bitCount) {
  std::fill_n(statusWord.uPtr(), statusWord.getSize(), static_cast<unsigned char>(0));
  const std::size_t bits = std::min<std::size_t>(bitCount, std::size_t{statusWord.getSize()} * 8);
  readStatus(session, coreRef, coreInfo, statusWord.uPtr(), bits);
}

// Progress is told before each pair of lines and after the last one. An abort at any of these points throws
// with the result as it was; what was written until then stays written.
void Qor_CoreComm::commandSequence(unsigned session, const std::string& text, unsigned char* result,
                                   unsigned resultBitCount, QOR_PROGRESS_CALLBACK progress) {
  const std::vector<Qor_PortCommand> commands = parseCommandText(text);
  requireResult(commands, result, resultBitCount);
  std::vector<unsigned char> read;
  ReadNotes notes(session);
  for (std::size_t i = 0; i < commands.size(); ++i) {
    report(progress, session, i, commands.size());
    if (commands[i].isRead) {
      runRead(session, commands[i], notes, read);
    } else {
      runWrite(session, commands[i]);
    }
  }
  report(progress, session, commands.size(), commands.size());
  std::copy(read.begin(), read.end(), result);
  notes.strikeOff();
}

}  // namespace QorRT

unsigned QorCore_getCoreStatus(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                               unsigned char* statusWord, unsigned bitCount) {
  if (statusWord == nullptr && bitCount != 0) throw std::logic_error("the status word buffer is null");
  const bool found = QorRT::readStatus(session, coreRef, coreInfo, statusWord, bitCount);
  return found ? QorRT::coreFound : QorRT::noSuchCore;
}
