#include <string>

#include "QorVIO.h"
#include "QorVIO_CoreFields.h"
#include "src/api/CallFrame.h"
#include "src/api/CoreAccess.h"

using namespace QorRT;

namespace {

constexpr const char* noRecord = "Arg. to function QorVIO_getCoreInfo() failed:coreInfo!=0";
constexpr const char* noMap = "Arg. to function QorVIO_getCoreInfo() failed:*coreInfo!=0";
constexpr const char* wrongType = "QorVIO_getCoreInfo() for the wrong core type or non-existant core.";

QORVIO_CORE_INFO readVioInfo(unsigned session, QOR_CORE_REF coreRef) {
  Qor_ByteBuffer statusWord = statusBuffer();
  QOR_CORE_INFO head = readVioStatus(session, coreRef, statusWord, wrongType);
  QORVIO_CORE_INFO info{};
  QorVIO_Core::getVioCoreStatus(session, coreRef, head, statusWord, bitLength(statusWord), &info);
  return info;
}

}  // namespace

unsigned QorVIO_getInfo(unsigned session, QOR_CORE_REF coreRef, QORVIO_CORE_INFO* coreInfo) {
  return callFrame(session, [&] {
    require(coreInfo != nullptr, noRecord);
    QorJtagTargetLock lock(session, lockTimeout);
    *coreInfo = {};
    *coreInfo = readVioInfo(session, coreRef);
    return callSucceeded;
  });
}

unsigned QorVIO_isVIOCore(unsigned session, QOR_CORE_REF coreRef, unsigned* result) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    require(result != nullptr, "QorVIO_isVIOCore() arg. failed:result!=0");
    *result = 0;
    QOR_CORE_INFO head{};
    unsigned status = QorCore_getCoreStatus(session, coreRef, &head, nullptr, 0);
    *result = head.core_type == vioCoreType ? 1 : 0;
    return status;
  });
}

unsigned QorVIO_getCoreInfo(unsigned session, QOR_CORE_REF coreRef,
                            hash_map<std::string, std::string>** coreInfo) {
  return callFrame(session, [&] {
    require(coreInfo != nullptr, noRecord);
    require(*coreInfo != nullptr, noMap);
    QorJtagTargetLock lock(session, lockTimeout);
    QORVIO_CORE_INFO info = readVioInfo(session, coreRef);
    std::string text;
    for (const QorVIO_CoreField& each : QorVIO_coreFields)
      (*coreInfo)->insert_or_assign(each.name, Qor_NumberUtil::uInt2DecStr(info.*each.member, text));
    return callSucceeded;
  });
}
