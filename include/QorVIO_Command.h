/// @file
/// The host's copy of a core's four ports, and the command texts that transfer it to and from the core.
///
/// Conventions
///
///  1. The image is characters, '0' or '1': character i of a port string is port bit i. After initialisation
///     no string changes its length.
///  2. A write sends the whole output image; its masks select the bits that the core takes. A read replaces
///     the whole input image; if it fails, the image is as it was.
///  3. Positions must be below the port's width; the accessors do not check them.
///  4. The class has no lock: only the owner of the session's target lock may use it.
///  5. Only the name of the class is part of the exported interface, because groups are constructed with a
///     pointer to it. The library hides the members.
#pragma once

#include <array>
#include <string>
#include <utility>
#include <vector>

#include "QorCore_Records.h"
#include "QorUtil.h"
#include "QorVIO_Export.h"
#include "QorVIO_Records.h"

namespace QorRT {

/// The port image of one core. A new image has no ports.
class QORVIO_API QorVIO_Command {
 public:
  /// Steps of a pulse train.
  static constexpr unsigned int stepCount = 16;

  /// The values of one synchronous output at steps 0 to 15. An array, not a string, because a port has one
  /// per bit: staging a value then allocates nothing, and all of a port is one block of memory.
  using PulseTrain = std::array<char, stepCount>;

  QorVIO_Command();
  /// Copies the whole image. If it throws, the target is as it was.
  /// @{
  QorVIO_Command(const QorVIO_Command& other);
  QorVIO_Command& operator=(const QorVIO_Command& other);
  /// @}
  ~QorVIO_Command();
  /// Exchanges the two images.
  void swap(QorVIO_Command& other) noexcept;

  /// Gives every string the width of its port in the record, all '0'. Called once, on a new object.
  void initFromCoreInfo(QORVIO_CORE_INFO info);

  /// Replaces `text` (out) by the command text of code 1 (output data), 2 (write) or 3 (read), and returns
  /// it; for other codes it is empty. `resultBitCount` (out, may be null) receives the number of bits that
  /// the text returns. Throws logic_error for an address that does not fit its fields (device above 255,
  /// user chain or core above 15); `text` must not be sent then.
  std::string& buildCommandText(const QOR_CORE_REF& coreRef, unsigned int commandCode, std::string& text,
                                unsigned int* resultBitCount);

  /// Sends the output image and flushes the target. Does nothing for a core without outputs. After a failure
  /// the image is as staged.
  void writeOutputs(unsigned int session, const QOR_CORE_REF& coreRef);

  /// Reads all inputs into the image. Does nothing for a core without inputs. After a failure the image is as
  /// it was.
  void readInputs(unsigned int session, const QOR_CORE_REF& coreRef);

  /// If true, the next read adds its activity flags to those in the image, which have not reached the caller;
  /// otherwise it replaces them. False at first, and after each read.
  void setKeepsActivity(bool keeps) { keepsActivity = keeps; }

  /// Marks no output for the next write.
  void clearMasks();

  /// Replace a whole string. The new one has the port's width, and only '0' and '1'.
  /// @{
  void setAsyncOutValues(std::string values) { asyncOutValues = std::move(values); }
  void setAsyncOutMask(std::string mask) { asyncOutMask = std::move(mask); }
  void setSyncOutMask(std::string mask) { syncOutMask = std::move(mask); }
  /// @}

  /// Set one bit to '0' or '1', or the 16 steps of one synchronous output.
  /// @{
  void setAsyncOutValueBit(unsigned int position, char c) { asyncOutValues[position] = c; }
  void setAsyncOutMaskBit(unsigned int position, char c) { asyncOutMask[position] = c; }
  void setSyncOutMaskBit(unsigned int position, char c) { syncOutMask[position] = c; }
  void setSyncOutPulseTrain(unsigned int position, PulseTrain train) { syncOutPulseTrains[position] = train; }
  void setSyncOutPulseTrainBit(unsigned int position, unsigned int step, char c) {
    syncOutPulseTrains[position][step] = c;
  }
  /// @}

  /// Value and activity flags of one input bit at the last read (out, '0' or '1' each).
  /// @{
  void getAsyncInBits(unsigned int position, char* value, char* activityUp, char* activityDown) const {
    *value = asyncInValues[position];
    *activityUp = asyncInActivityUp[position];
    *activityDown = asyncInActivityDown[position];
  }
  void getSyncInBits(unsigned int position, char* value, char* activityUp, char* activityDown,
                     char* syncActivityUp, char* syncActivityDown) const {
    *value = syncInValues[position];
    *activityUp = syncInActivityUp[position];
    *activityDown = syncInActivityDown[position];
    *syncActivityUp = syncInSyncActivityUp[position];
    *syncActivityDown = syncInSyncActivityDown[position];
  }
  /// @}

  /// Values and activity flags at the last read, one character per port bit.
  /// @{
  const std::string& getAsyncInValues() const { return asyncInValues; }
  const std::string& getAsyncInActivityUp() const { return asyncInActivityUp; }
  const std::string& getAsyncInActivityDown() const { return asyncInActivityDown; }
  const std::string& getSyncInValues() const { return syncInValues; }
  const std::string& getSyncInActivityUp() const { return syncInActivityUp; }
  const std::string& getSyncInActivityDown() const { return syncInActivityDown; }
  const std::string& getSyncInSyncActivityUp() const { return syncInSyncActivityUp; }
  const std::string& getSyncInSyncActivityDown() const { return syncInSyncActivityDown; }
  /// @}

 private:
  /// Fields 1 to 3 of a line, each with the blank after it.
  const std::string& addressText(const QOR_CORE_REF& coreRef);
  const std::string& outputData();
  unsigned int recordDigitCount() const;
  void decodeRecords(const char* digits);

  std::string asyncOutValues;
  std::vector<PulseTrain> syncOutPulseTrains;
  std::string asyncOutMask;
  std::string syncOutMask;
  std::string asyncInValues;
  std::string asyncInActivityUp;
  std::string asyncInActivityDown;
  std::string syncInValues;
  std::string syncInActivityUp;
  std::string syncInActivityDown;
  std::string syncInSyncActivityUp;
  std::string syncInSyncActivityDown;
  QORVIO_CORE_INFO vioCoreInfo;
  bool keepsActivity = false;

  /// Buffers of a transfer, kept so that polling allocates nothing. A copy starts with buffers of its own.
  struct Scratch {
    Scratch() = default;
    Scratch(const Scratch& /*other*/) noexcept {}
    Scratch& operator=(const Scratch& /*other*/) noexcept { return *this; }

    std::string address;
    QOR_CORE_REF addressOf{};
    std::string outputDigits;
    std::string outputHex;
    std::string text;
    std::string obeyText;
    std::string inputDigits;
    Qor_ByteBuffer result;
    Qor_ByteBuffer resultHex;
  };
  Scratch scratch;
};

}  // namespace QorRT
