#include "board/session/Link.h"

#include <algorithm>
#include <iterator>
#include <stdexcept>
#include <utility>

#include "QorVIO_Core.h"
#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "platform/core/QorCore_Host.h"

namespace qor {
namespace {

using QorRT::Qor_ByteBuffer;

constexpr unsigned statusBytes = 16, statusBits = 8 * statusBytes;
constexpr unsigned coresOfAHub = 16;

// Reads the status word; false when there is no such core. Throws when nothing answers.
bool probe(unsigned session, FoundCore& core) {
  const QorRT::QorJtagTargetLock lock(session, 60000);
  QOR_CORE_INFO head{};
  Qor_ByteBuffer word(statusBytes, statusBytes, statusBytes);
  QorRT::Qor_CoreComm::getCoreStatus(session, core.ref, &head, word, statusBits);
  if (head.core_type == 0 && head.manufacturer_id == 0) return false;
  core.info = {};
  core.info.manufacturer_id = head.manufacturer_id;
  core.info.core_type = head.core_type;
  core.info.core_major_version = head.core_major_version;
  core.info.core_minor_version = head.core_minor_version;
  core.info.core_revision = head.core_revision;
  if (core.isVio())
    QorRT::QorVIO_Core::getVioCoreStatus(session, core.ref, head, word, statusBits, &core.info);
  return true;
}

void findBehind(Link& link, unsigned device, unsigned userChain, std::vector<FoundCore>& cores) {
  for (unsigned index = 0; index < coresOfAHub; ++index) {
    FoundCore core{{device, userChain, index}, {}};
    try {
      if (probe(link.session(), core)) cores.push_back(core);
    } catch (const QorRT::Qor_NoHub&) {
      return;
    } catch (const std::exception& error) {
      throw Failure(error.what());
    }
  }
}

// "no VIO core at 0.1.1, a core of type 7 is there"; empty when the hub does not say.
std::string whatIsAt(unsigned session, QOR_CORE_REF ref) {
  FoundCore core{ref, {}};
  try {
    const bool isThere = probe(session, core);
    if (isThere && core.isVio()) return {};
    return "no VIO core at " + refText(ref) + ", " +
           (isThere ? "a core of type " + std::to_string(core.info.core_type) : "no core") +
           " is there, see qorvio scan: ";
  } catch (const std::exception&) {
    return {};
  }
}

bool isAlike(const FoundCore& one, const FoundCore& other) {
  const auto& fields = QorRT::QorVIO_coreFields;
  return one.isVio() && one.ref.core_index == other.ref.core_index &&
         std::all_of(std::begin(fields), std::end(fields), [&](const QorRT::QorVIO_CoreField& field) {
           return one.info.*field.member == other.info.*field.member;
         });
}

bool isOneCore(Link& link, const FoundCore& one, const FoundCore& other) {
  constexpr std::size_t asyncBits = 2, syncBits = 17;  // of a write: mask and value, mask and pulse train
  const std::size_t bits = asyncBits * one.info.async_output_count + syncBits * one.info.sync_output_count;
  try {
    return QorRT::isOneCore(link.session(), one.ref, other.ref, bits);
  } catch (const std::exception&) {  // whoever writes to it will hear why
    return false;
  }
}

}  // namespace

std::unique_ptr<QorRT::Qor_Cable> openCable(const std::string& url, StopFunction stop) {
  try {
    return QorRT::openCable(url.c_str(), std::move(stop));
  } catch (const std::logic_error& error) {  // the URL itself
    throw WrongUse("cannot open the cable " + url + ": " + error.what());
  } catch (const std::exception& error) {
    throw Failure("cannot open the cable " + url + ": " + error.what());
  }
}

Link::Link(std::unique_ptr<QorRT::Qor_Cable> cable, std::string url)
    : session_(QorJtag_session_openCable(std::move(cable))), url_(std::move(url)) {
  listen();
}

Link::~Link() {
  QorJtag_session_close(session_);
}

void Link::listen() {
  // The notice of an abort says nothing that the message before it did not.
  QorJtag_session_setMessageHandler(session_, [this](unsigned type, const char* text) {
    if (type == 0x100) message_ = text;
  });
}

std::vector<QorRT::Qor_Device> Link::devices() const {
  std::vector<QorRT::Qor_Device> devices;
  QorJtag_session_getDevices(session_, devices);
  return devices;
}

void Link::check(unsigned code) {
  if (code != 0) throw Failure(takeMessage());
}

std::string Link::takeMessage() {
  return std::exchange(message_, {});
}

std::vector<FoundCore> findCores(Link& link) {
  std::vector<FoundCore> cores;
  const std::size_t devices = link.devices().size();
  for (unsigned device = 0; device < devices; ++device)
    for (unsigned chain = 1; chain <= QorRT::Qor_Cable::userChainCount; ++chain)
      findBehind(link, device, chain, cores);
  return cores;
}

std::vector<CoreFoundTwice> coresFoundTwice(Link& link, const std::vector<FoundCore>& cores) {
  std::vector<CoreFoundTwice> found;
  for (auto core = cores.begin(); core != cores.end(); ++core) {
    const auto first = std::find_if(cores.begin(), core, [&](const FoundCore& other) {
      return isAlike(*core, other) && isOneCore(link, other, *core);
    });
    if (first != core) found.push_back({first->ref, core->ref});
  }
  return found;
}

std::string foundTwiceText(const CoreFoundTwice& core) {
  return refText(core.ref) + " and " + refText(core.again) + " are the same core";
}

QOR_CORE_REF firstVioCore(Link& link) {
  const std::vector<FoundCore> cores = findCores(link);
  for (const FoundCore& core : cores)
    if (core.isVio()) return core.ref;
  throw Failure("no VIO core on this board: " + std::to_string(cores.size()) + " cores of other types, " +
                std::to_string(link.devices().size()) + " devices");
}

QORVIO_CORE_INFO readInfo(Link& link, QOR_CORE_REF ref) {
  QORVIO_CORE_INFO info{};
  if (QorVIO_getInfo(link.session(), ref, &info) != 0) failAt(link, ref);
  return info;
}

void failAt(Link& link, QOR_CORE_REF ref) {
  const std::string said = link.takeMessage();
  throw Failure(whatIsAt(link.session(), ref) + said);
}

}  // namespace qor
