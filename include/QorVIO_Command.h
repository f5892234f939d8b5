/// @file
/// The host's image of a core's four ports, and the command texts that move it to and from the core.
///
/// Conventions
///
///  1. The image is characters, '0' or '1': character i of a port string belongs to port bit i. Once
///     initialised, no string ever changes its length.
///  2. A write sends the whole output image; its masks say which bits the core takes. A read replaces the
///     whole input image, or leaves it as it was when it fails.
///  3. Positions given to the accessors are below the port's width; they are not checked.
///  4. No lock of its own: the holder of the session's target lock uses it.
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

/// The port image of one core. A new one has no ports.
class QORVIO_API QorVIO_Command {
 public:
  /// Steps of a pulse train.
  static constexpr unsigned int stepCount = 16;

  /// The values of one synchronous output at steps 0 to 15. The string is held in place, because a port has
  /// one for each bit: no allocation to fail while values are staged, and one run of memory to send.
  using PulseTrain = std::array<char, stepCount>;

  QorVIO_Command();
  /// Copies the whole image, or throws with the target as it was.
  /// @{
  QorVIO_Command(const QorVIO_Command& other);
  QorVIO_Command& operator=(const QorVIO_Command& other);
  /// @}
  ~QorVIO_Command();
  /// Exchanges the images; throws nothing.
  void swap(QorVIO_Command& other) noexcept;

  /// Sizes the image by the record's widths, all '0'. Called once, on a new object.
  void initFromCoreInfo(QORVIO_CORE_INFO info);

  /// Replaces `text` by the command text of code 1 (outputs), 2 (obey) or 3 (read), and returns it; other
  /// codes leave it empty. `resultBitCount` (out, may be null) receives the number of bits that the text
  /// returns. Throws logic_error for an address that its fields cannot hold (device above 255, user chain or
  /// core above 15), with `text` unfit to be sent.
  std::string& buildCommandText(const QOR_CORE_REF& coreRef, unsigned int commandCode, std::string& text,
                                unsigned int* resultBitCount);

  /// Sends the output image and flushes the target; does nothing for a core without outputs. A failure leaves
  /// the image as staged.
  void writeOutputs(unsigned int session, const QOR_CORE_REF& coreRef);

  /// Reads all inputs into the image; does nothing for a core without inputs. A failure leaves the image as
  /// it was.
  void readInputs(unsigned int session, const QOR_CORE_REF& coreRef);

  /// Says whether the next read adds its activity flags to those in the image, because they have not reached
  /// the caller, instead of replacing them. False at first, and after each read.
  void setKeepsActivity(bool keeps) { keepsActivity = keeps; }

  /// Marks no output for the next write.
  void clearMasks();

  /// Whole strings are of the port's width, '0' and '1' only.
  /// @{
  void setAsyncOutValues(std::string values) { asyncOutValues = std::move(values); }
  void setAsyncOutMask(std::string mask) { asyncOutMask = std::move(mask); }
  void setSyncOutMask(std::string mask) { syncOutMask = std::move(mask); }
  /// @}

  /// One bit, '0' or '1', or the 16 steps of one synchronous output.
  /// @{
  void setAsyncOutValueBit(unsigned int position, char c) { asyncOutValues[position] = c; }
  void setAsyncOutMaskBit(unsigned int position, char c) { asyncOutMask[position] = c; }
  void setSyncOutMaskBit(unsigned int position, char c) { syncOutMask[position] = c; }
  void setSyncOutPulseTrain(unsigned int position, PulseTrain train) { syncOutPulseTrains[position] = train; }
  void setSyncOutPulseTrainBit(unsigned int position, unsigned int step, char c) {
    syncOutPulseTrains[position][step] = c;
  }
  /// @}

  /// What the last read brought of one input bit (out, '0' or '1' each).
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

  /// What the last read brought, a character a port bit.
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

  /// What a transfer needs on the way, kept so that polling allocates nothing. A copy starts with its own.
  struct Scratch {
    Scratch() = default;
    Scratch(const Scratch& /*other*/) noexcept {}
    Scratch& operator=(const Scratch& /*other*/) noexcept { return *this; }

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
