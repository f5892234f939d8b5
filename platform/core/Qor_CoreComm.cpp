#include <algorithm>
#include <cstdint>
#include <stdexcept>
#include <utility>

#include "QorCore.h"
#include "platform/core/Qor_CommandText.h"
#include "platform/core/Qor_HubAccess.h"
#include "platform/core/Qor_SessionCores.h"
#include "platform/jtag/Qor_SessionAccess.h"

namespace QorRT {
namespace {

constexpr unsigned coreFound = 0, noSuchCore = 1;

Qor_HubAccess hubAccess(unsigned session, const QOR_CORE_REF& coreRef, Qor_CoreLink& link) {
  return {sessionCable(session), sessionRecord(session), link, coreRef};
}

/// Zeroes `*coreInfo` and `bitCount` bits of `bytes`, then fills both if there is a core; false if not.
bool readStatus(unsigned session, const QOR_CORE_REF& coreRef, QOR_CORE_INFO* coreInfo, unsigned char* bytes,
                std::size_t bitCount) {
  if (coreInfo == nullptr) throw std::logic_error("the core information record of a status read is null");
  *coreInfo = {};
  std::fill_n(bytes, (bitCount + 7) / 8, static_cast<unsigned char>(0));
  Qor_StatusWord word{};
  const std::shared_ptr<Qor_SessionCores> cores = Qor_SessionCores::open(session);
  if (!hubAccess(session, coreRef, cores->link(coreRef)).readStatus(word)) return false;
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

/// Reports to the callback the session, how many pairs of lines are done, and of how many.
void report(QOR_PROGRESS_CALLBACK progress, unsigned session, std::size_t done, std::size_t count) {
  if (progress == nullptr) return;
  const auto status = done == count ? QOR_PROGRESS_DONE : QOR_PROGRESS_RUNNING;
  const auto answer = progress(session, static_cast<unsigned>(done), static_cast<unsigned>(count), status);
  if (answer == QOR_PROGRESS_ABORT) throw std::logic_error("Qor abort command");
}

/// The reads of one text. The activity that each takes out of the inputs is owed from before its scan until its bits
/// are with the caller, so that whatever goes wrong between makes the next read report it again.
class Reads {
 public:
  /// True when an earlier text owes the activity of a read, and this one has not read the core yet.
  bool begin(Qor_CoreLink& link) {
    const bool isFirst = std::find(links_.begin(), links_.end(), &link) == links_.end();
    if (isFirst) links_.push_back(&link);
    return std::exchange(link.readIsOwed, true) && isFirst;
  }

  void delivered() noexcept {
    for (Qor_CoreLink* link : links_) link->readIsOwed = false;
  }

 private:
  std::vector<Qor_CoreLink*> links_;
};

/// The mask of the synchronous outputs is the lowest part of a write's data.
bool marksSyncOutputs(const Qor_PortCommand& command, std::size_t syncOutputs) {
  const std::size_t end = std::min(syncOutputs, command.bitCount);
  return findOne(command.payload, 0, end) < end;
}

void runWrite(unsigned session, const Qor_PortCommand& command, Qor_SessionCores& cores) {
  const bool playsTrains = marksSyncOutputs(command, cores.syncOutputCount(command.coreRef));
  hubAccess(session, command.coreRef, cores.link(command.coreRef))
      .write(command.payload, command.bitCount, playsTrains);
}

/// Appends what the command returns.
void runRead(unsigned session, const Qor_PortCommand& command, Qor_SessionCores& cores, Reads& reads,
             Qor_Bytes& result) {
  Qor_CoreLink& link = cores.link(command.coreRef);
  Qor_HubAccess hub = hubAccess(session, command.coreRef, link);
  const Qor_ReadResult read = hub.read(command.bitCount, reads.begin(link));
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

// Progress is reported before each pair of lines and after the last one. An abort at any of these points throws
// with the result as it was; what was written until then stays written.
void Qor_CoreComm::commandSequence(unsigned session, const std::string& text, unsigned char* result,
                                   unsigned resultBitCount, QOR_PROGRESS_CALLBACK progress) {
  const std::vector<Qor_PortCommand> commands = parseCommandText(text);
  requireResult(commands, result, resultBitCount);
  const std::shared_ptr<Qor_SessionCores> cores = Qor_SessionCores::open(session);
  Qor_Bytes read;
  Reads reads;
  for (std::size_t i = 0; i < commands.size(); ++i) {
    report(progress, session, i, commands.size());
    if (commands[i].isRead) {
      runRead(session, commands[i], *cores, reads, read);
    } else {
      runWrite(session, commands[i], *cores);
    }
  }
  report(progress, session, commands.size(), commands.size());
  std::copy(read.begin(), read.end(), result);
  reads.delivered();
}

}  // namespace QorRT

unsigned QorCore_getCoreStatus(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                               unsigned char* statusWord, unsigned bitCount) {
  if (statusWord == nullptr && bitCount != 0) throw std::logic_error("the status word buffer is null");
  const bool found = QorRT::readStatus(session, coreRef, coreInfo, statusWord, bitCount);
  return found ? QorRT::coreFound : QorRT::noSuchCore;
}
