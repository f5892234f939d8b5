// The fields of a VIO core's status word, in the three layouts that core versions have had.
#include "QorVIO_Core.h"

namespace QorRT {

// Storage for the constants, so that a client may take the address of one.
const unsigned QorVIO_Core::BEFORE_062_ASYNC_INPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_062_SYNC_INPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_062_ASYNC_OUTPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_062_SYNC_OUTPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_062_PORT_BIT_LEN;
const unsigned QorVIO_Core::BEFORE_101_ASYNC_INPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_101_SYNC_INPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_101_ASYNC_OUTPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_101_SYNC_OUTPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::BEFORE_101_PORT_BIT_LEN;
const unsigned QorVIO_Core::CG_MAJOR_VERSION_BIT_OFFSET;
const unsigned QorVIO_Core::CG_MAJOR_VERSION_BIT_LEN;
const unsigned QorVIO_Core::CG_MINOR_VERSION_BIT_OFFSET;
const unsigned QorVIO_Core::CG_MINOR_VERSION_BIT_LEN;
const unsigned QorVIO_Core::CG_MINOR_VERSION_ALPHA_BIT_OFFSET;
const unsigned QorVIO_Core::CG_MINOR_VERSION_ALPHA_BIT_LEN;
const unsigned QorVIO_Core::ASYNC_INPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::SYNC_INPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::ASYNC_OUTPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::SYNC_OUTPUT_COUNT_BIT_OFFSET;
const unsigned QorVIO_Core::PORT_BIT_LEN;

namespace {

/// Bit offsets of the four widths, and the length of each.
struct WidthLayout {
  unsigned asyncInput;
  unsigned syncInput;
  unsigned asyncOutput;
  unsigned syncOutput;
  unsigned length;
};

constexpr unsigned version062 = 0x62;
constexpr unsigned version100 = 0xA0;

constexpr WidthLayout oldestLayout{
    QorVIO_Core::BEFORE_062_ASYNC_INPUT_COUNT_BIT_OFFSET, QorVIO_Core::BEFORE_062_SYNC_INPUT_COUNT_BIT_OFFSET,
    QorVIO_Core::BEFORE_062_ASYNC_OUTPUT_COUNT_BIT_OFFSET,
    QorVIO_Core::BEFORE_062_SYNC_OUTPUT_COUNT_BIT_OFFSET, QorVIO_Core::BEFORE_062_PORT_BIT_LEN};
constexpr WidthLayout middleLayout{
    QorVIO_Core::BEFORE_101_ASYNC_INPUT_COUNT_BIT_OFFSET, QorVIO_Core::BEFORE_101_SYNC_INPUT_COUNT_BIT_OFFSET,
    QorVIO_Core::BEFORE_101_ASYNC_OUTPUT_COUNT_BIT_OFFSET,
    QorVIO_Core::BEFORE_101_SYNC_OUTPUT_COUNT_BIT_OFFSET, QorVIO_Core::BEFORE_101_PORT_BIT_LEN};
constexpr WidthLayout currentLayout{QorVIO_Core::ASYNC_INPUT_COUNT_BIT_OFFSET,
                                    QorVIO_Core::SYNC_INPUT_COUNT_BIT_OFFSET,
                                    QorVIO_Core::ASYNC_OUTPUT_COUNT_BIT_OFFSET,
                                    QorVIO_Core::SYNC_OUTPUT_COUNT_BIT_OFFSET, QorVIO_Core::PORT_BIT_LEN};

void readWidths(const Qor_ByteBuffer& statusWord, const WidthLayout& layout, QORVIO_CORE_INFO& info) {
  info.async_input_count = statusWord.getBits(layout.asyncInput, layout.length);
  info.sync_input_count = statusWord.getBits(layout.syncInput, layout.length);
  info.async_output_count = statusWord.getBits(layout.asyncOutput, layout.length);
  info.sync_output_count = statusWord.getBits(layout.syncOutput, layout.length);
}

void readCgVersion(const Qor_ByteBuffer& statusWord, QORVIO_CORE_INFO& info) {
  info.cg_major_version =
      statusWord.getBits(QorVIO_Core::CG_MAJOR_VERSION_BIT_OFFSET, QorVIO_Core::CG_MAJOR_VERSION_BIT_LEN);
  info.cg_minor_version =
      statusWord.getBits(QorVIO_Core::CG_MINOR_VERSION_BIT_OFFSET, QorVIO_Core::CG_MINOR_VERSION_BIT_LEN);
  info.cg_minor_version_alpha = statusWord.getBits(QorVIO_Core::CG_MINOR_VERSION_ALPHA_BIT_OFFSET,
                                                   QorVIO_Core::CG_MINOR_VERSION_ALPHA_BIT_LEN);
}

QORVIO_CORE_INFO headOnly(const QOR_CORE_INFO& head) {
  QORVIO_CORE_INFO info{};
  info.manufacturer_id = head.manufacturer_id;
  info.core_type = head.core_type;
  info.core_major_version = head.core_major_version;
  info.core_minor_version = head.core_minor_version;
  info.core_revision = head.core_revision;
  return info;
}

}  // namespace

void QorVIO_Core::getVioCoreStatus(unsigned /*session*/, QOR_CORE_REF /*coreRef*/,
                                   const QOR_CORE_INFO& coreInfo, Qor_ByteBuffer& statusWord,
                                   unsigned /*bitCount*/, QORVIO_CORE_INFO* vioCoreInfo) {
  QORVIO_CORE_INFO info = headOnly(coreInfo);
  unsigned version = (coreInfo.core_major_version << 4) | coreInfo.core_minor_version;
  if (version < version062) {
    readWidths(statusWord, oldestLayout, info);
  } else if (version < version100) {
    readWidths(statusWord, middleLayout, info);
  } else {
    readCgVersion(statusWord, info);
    readWidths(statusWord, currentLayout, info);
  }
  *vioCoreInfo = info;
}

}  // namespace QorRT
