#include <string>
#include <utility>

#include "QorVIO.h"
#include "src/api/CallFrame.h"
#include "src/api/CoreAccess.h"

using namespace QorRT;

namespace {

constexpr const char* noRecord = "Arg. to function QorVIO_getCoreInfo() failed:coreInfo!=0";
constexpr const char* noMap = "Arg. to function QorVIO_getCoreInfo() failed:*coreInfo!=0";
constexpr const char* wrongType = "QorVIO_getCoreInfo() for the wrong core type or non-existant core.";

constexpr std::pair<const char*, unsigned QORVIO_CORE_INFO::*> namedFields[] = {
    {"manufacturer_id", &QORVIO_CORE_INFO::manufacturer_id},
    {"core_type", &QORVIO_CORE_INFO::core_type},
    {"core_major_version", &QORVIO_CORE_INFO::core_major_version},
    {"core_minor_version", &QORVIO_CORE_INFO::core_minor_version},
    {"core_revision", &QORVIO_CORE_INFO::core_revision},
    {"cg_major_version", &QORVIO_CORE_INFO::cg_major_version},
    {"cg_minor_version", &QORVIO_CORE_INFO::cg_minor_version},
    {"cg_minor_version_alpha", &QORVIO_CORE_INFO::cg_minor_version_alpha},
    {"async_input_count", &QORVIO_CORE_INFO::async_input_count},
    {"sync_input_count", &QORVIO_CORE_INFO::sync_input_count},
    {"async_output_count", &QORVIO_CORE_INFO::async_output_count},
    {"sync_output_count", &QORVIO_CORE_INFO::sync_output_count},
};

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
    for (auto [key, field] : namedFields)
      (*coreInfo)->insert_or_assign(key, Qor_NumberUtil::uInt2DecStr(info.*field, text));
    return callSucceeded;
  });
}
