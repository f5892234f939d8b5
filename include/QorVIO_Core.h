/// @file
/// One VIO core at one address of a session: its port widths, its named groups, and transfers by name or
/// whole port.
///
/// Conventions
///
///  1. Every failure is a standard exception, usually logic_error. The exported functions report it as a
///     message.
///  2. The class has no lock: only the owner of the session's target lock may use it.
///  3. Port type codes, names, bits and bytes are those of QorVIO.h; values of groups are those of
///     QorVIO_SignalGroup.h.
///  4. Names, sizes and arrays are checked first: if a check fails, nothing was staged or sent.
#pragma once

#include <array>
#include <string>
#include <string_view>
#include <vector>

#include "QorCore.h"
#include "QorUtil.h"
#include "QorVIO_Command.h"
#include "QorVIO_Export.h"
#include "QorVIO_NameTable.h"
#include "QorVIO_Records.h"

namespace QorRT {

/// A VIO core that has been set up: what QorVIO_initCore puts into the core list.
class QORVIO_API QorVIO_Core : public Qor_SignalCore {
 public:
  /// Bit offsets and lengths of the port widths and versions in the status word: before version 6.2, before
  /// 10.0, and since.
  /// @{
  static const unsigned int BEFORE_062_ASYNC_INPUT_COUNT_BIT_OFFSET = 40;
  static const unsigned int BEFORE_062_SYNC_INPUT_COUNT_BIT_OFFSET = 48;
  static const unsigned int BEFORE_062_ASYNC_OUTPUT_COUNT_BIT_OFFSET = 56;
  static const unsigned int BEFORE_062_SYNC_OUTPUT_COUNT_BIT_OFFSET = 64;
  static const unsigned int BEFORE_062_PORT_BIT_LEN = 8;

  static const unsigned int BEFORE_101_ASYNC_INPUT_COUNT_BIT_OFFSET = 40;
  static const unsigned int BEFORE_101_SYNC_INPUT_COUNT_BIT_OFFSET = 56;
  static const unsigned int BEFORE_101_ASYNC_OUTPUT_COUNT_BIT_OFFSET = 72;
  static const unsigned int BEFORE_101_SYNC_OUTPUT_COUNT_BIT_OFFSET = 88;
  static const unsigned int BEFORE_101_PORT_BIT_LEN = 16;

  static const unsigned int CG_MAJOR_VERSION_BIT_OFFSET = 40;
  static const unsigned int CG_MAJOR_VERSION_BIT_LEN = 4;
  static const unsigned int CG_MINOR_VERSION_BIT_OFFSET = 44;
  static const unsigned int CG_MINOR_VERSION_BIT_LEN = 8;
  static const unsigned int CG_MINOR_VERSION_ALPHA_BIT_OFFSET = 52;
  static const unsigned int CG_MINOR_VERSION_ALPHA_BIT_LEN = 8;
  static const unsigned int ASYNC_INPUT_COUNT_BIT_OFFSET = 60;
  static const unsigned int SYNC_INPUT_COUNT_BIT_OFFSET = 76;
  static const unsigned int ASYNC_OUTPUT_COUNT_BIT_OFFSET = 92;
  static const unsigned int SYNC_OUTPUT_COUNT_BIT_OFFSET = 108;
  static const unsigned int PORT_BIT_LEN = 16;
  /// @}

  /// Copies `statusWord` (in, `bitCount` bits). The core has no ports before initFromStatusWord.
  QorVIO_Core(unsigned int session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
              const unsigned char* statusWord, unsigned int bitCount);
  QorVIO_Core(const QorVIO_Core&) = delete;
  /// Copies session, address, information and port image, and duplicates every group; the duplicates use this
  /// core's own image. If it throws, names and image are as they were.
  QorVIO_Core& operator=(const QorVIO_Core& other);
  ~QorVIO_Core() override;

  /// Decodes widths and versions from the status word and defines the whole-port names. Called once, on a new
  /// core. Returns true.
  bool initFromStatusWord(unsigned int session) override;

  /// The generic signals of a core are not used here: adding and removing do nothing, getting returns null.
  /// @{
  void addSignal(Qor_SignalBase* signal) override;
  Qor_SignalBase* getSignal(const std::string& name, unsigned int first, unsigned int last) override;
  void removeSignal(Qor_SignalBase* signal) override;
  /// @}

  /// Decodes a status word (in), in the layout of the core's version, into `*vioCoreInfo` (out). Session,
  /// address and `bitCount` are not used. Nothing is checked.
  static void getVioCoreStatus(unsigned int session, QOR_CORE_REF coreRef, const QOR_CORE_INFO& coreInfo,
                               Qor_ByteBuffer& statusWord, unsigned int bitCount,
                               QORVIO_CORE_INFO* vioCoreInfo);

  /// Gives a name to port bits (in), in the order of the value's bits; see QorVIO_defineBus. A failure
  /// changes nothing.
  void defineSignal(const std::string& name, unsigned int type, std::vector<unsigned int>& positions);

  /// Removes a name from the inputs if `type` is 1 or 3, else from the outputs. A failure changes nothing.
  void undefineSignal(const std::string& name, unsigned int type);

  /// Writes the widths in bits of the first `count` names to `sizes` (out, `count` elements). At a name
  /// that is not defined it throws; the sizes before it are written.
  void getSignalSizes(std::vector<std::string> names, unsigned int* sizes, unsigned int count,
                      unsigned int isOutput);

  /// Defines a whole-port name for each port that has bits.
  void addReservedSignals();

  /// Writes every entry of the map (in) in one exchange; see QorVIO_writeValues. If a text is not
  /// hexadecimal, nothing is sent, but values of entries before it are staged; the next write does not mark
  /// them.
  void writeValues(unsigned int session, QOR_CORE_REF coreRef,
                   hash_map<std::string, std::string>* outputHashMap);

  /// Reads all inputs in one exchange into the map (in, out); see QorVIO_readValues. If not all entries can
  /// be set, each is set completely or not at all, and the next read reports the activity flags again.
  void readValues(unsigned int session, QOR_CORE_REF coreRef,
                  hash_map<std::string, std::string>* inputHashMap);

  /// Writes `samples` values of each of `count` names. `values[i]` (in, `sizes[i]` bytes) is the values of
  /// name i, one after another. One exchange per sample; with `burst` 1 one per 16 samples, as pulse trains
  /// of synchronous outputs. After a failed exchange the samples before it are written.
  void writeValues(unsigned int session, QOR_CORE_REF coreRef, std::vector<std::string> names,
                   const unsigned char** values, unsigned int* sizes, unsigned int count,
                   unsigned int samples, unsigned int burst);

  /// Reads `samples` values of each of `count` names, one exchange per sample. Sample k of name i is value
  /// k of its buffers (out, `sizes[i]` bytes each, zero-filled by the caller). Each of the five arrays, and
  /// each buffer, may be null: it is not filled then. After a failed exchange the samples before it are in
  /// the buffers.
  void readValues(unsigned int session, QOR_CORE_REF coreRef, std::vector<std::string> names,
                  unsigned char** values, unsigned char** activityUp, unsigned char** activityDown,
                  unsigned char** syncActivityUp, unsigned char** syncActivityDown, unsigned int* sizes,
                  unsigned int count, unsigned int samples);

  /// Writes whole output ports in one exchange; see QorVIO_setPortBits, whose checks are here.
  void setPortBits(unsigned int session, QOR_CORE_REF coreRef, const unsigned char* asyncOutValueBits,
                   const unsigned char* asyncOutMaskBits, unsigned int asyncOutDataBitCount,
                   const unsigned char* syncOutStepBits, const unsigned char* syncOutMaskBits,
                   unsigned int syncOutDataBitCount);

  /// Reads whole input ports in one exchange; see QorVIO_getPortBits. Any count except 0 delivers the whole
  /// port.
  void getPortBits(unsigned int session, QOR_CORE_REF coreRef, unsigned char* asyncInValueBits,
                   unsigned char* asyncInActivityUpBits, unsigned char* asyncInActivityDownBits,
                   unsigned int asyncInDataBitCount, unsigned char* syncInValueBits,
                   unsigned char* syncInActivityUpBits, unsigned char* syncInActivityDownBits,
                   unsigned char* syncInSyncActivityUpBits, unsigned char* syncInSyncActivityDownBits,
                   unsigned int syncInDataBitCount);

 protected:
  /// Sets the count of each signal type to the width of its port.
  void setCorePhysicalSignalCounts() override;

 private:
  struct Port;

  Port portOf(unsigned int type);
  QorVIO_SignalGroup* getInputSignal(std::string_view name) const;
  QorVIO_SignalGroup* getOutputSignal(std::string_view name) const;
  QorVIO_NameTable duplicate(const QorVIO_NameTable& table);

  QORVIO_CORE_INFO vioCoreInfo;
  QorVIO_Command command;
  QorVIO_NameTable inputSignals;
  QorVIO_NameTable outputSignals;
  std::array<std::string, QorVIO_Command::stepCount> stepPlanes;  // room for setPortBits, kept between calls
};

}  // namespace QorRT
