/// @file
/// libQorCore: the cores of each session, base classes for cores and signals, and the way to a core on the
/// chip.
///
/// Conventions
///
///  1. Every buffer is a little-endian bit array: bit i is bit (i mod 8) of byte i / 8.
///  2. The core list may be used by any thread. The functions of Qor_CoreComm are called by the holder of the
///     session's target lock.
///  3. Failures are standard exceptions whose text says what was seen and where.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "QorCore_Records.h"
#include "QorExport.h"
#include "QorUtil.h"

/// What a command sequence tells of itself.
enum QOR_PROGRESS_STATUS { QOR_PROGRESS_RUNNING, QOR_PROGRESS_DONE };
/// What a callback wants of the sequence.
enum QOR_PROGRESS_RETURN { QOR_PROGRESS_CONTINUE, QOR_PROGRESS_ABORT };
/// Called before each pair of lines of a command text and at its end; the numbers are the session, how many
/// pairs are done, and of how many. Asking to abort ends the sequence with a logic_error.
using QOR_PROGRESS_CALLBACK = QOR_PROGRESS_RETURN (*)(unsigned, unsigned, unsigned, QOR_PROGRESS_STATUS);

/// Fills `*coreInfo` from the head of the core's status word. Returns 0, or nonzero with the record all zero
/// when there is no such core. `statusWord` may be null with a `bitCount` of 0, or receives the first
/// `bitCount` bits. Throws when nothing answers there, with the record all zero.
extern "C" QOR_API unsigned QorCore_getCoreStatus(unsigned session, QOR_CORE_REF coreRef,
                                                  QOR_CORE_INFO* coreInfo, unsigned char* statusWord,
                                                  unsigned bitCount);

namespace QorRT {

/// A core at an address of a session. Keeps what its constructor was given, the status word as a copy.
class QOR_API Qor_Core {
 public:
  virtual ~Qor_Core();

  /// Sets the core up from its status word; false when the word does not suit the core.
  virtual bool initFromStatusWord(unsigned session) = 0;
  /// False, unless a kind of core says otherwise.
  virtual bool isQorVbrnSlave();

  /// What the constructor was given.
  /// @{
  unsigned getCoreType() const { return coreInfo_.core_type; }
  QOR_CORE_REF getCoreRef() const { return coreRef_; }
  QOR_CORE_INFO getCoreInfo() const { return coreInfo_; }
  /// @}

 protected:
  /// `statusWord` holds `bitCount` bits, rounded up to whole bytes.
  Qor_Core(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo, const unsigned char* statusWord,
           unsigned bitCount);
  Qor_Core(const Qor_Core&) = delete;
  /// Assigns wholly, or throws bad_alloc with the target as it was.
  Qor_Core& operator=(const Qor_Core& other);

  /// The status word that the constructor copied.
  Qor_ByteBuffer& getStatusWord() { return statusWord_; }

 private:
  unsigned session_;
  QOR_CORE_REF coreRef_;
  QOR_CORE_INFO coreInfo_;
  Qor_ByteBuffer statusWord_;
};

class Qor_SignalBase;

/// A core with signals, and a count of physical signals for each signal type.
class QOR_API Qor_SignalCore : public Qor_Core {
 public:
  ~Qor_SignalCore() override;

  /// The generic signals of the core, for those kinds of core that keep such.
  /// @{
  virtual void addSignal(Qor_SignalBase* signal) = 0;
  virtual Qor_SignalBase* getSignal(const std::string& name, unsigned first, unsigned last) = 0;
  virtual void removeSignal(Qor_SignalBase* signal) = 0;
  /// @}

  /// The count last set for the type, 0 before that.
  unsigned getCorePhysicalSignalCount(unsigned type) const;

 protected:
  /// The arguments are those of Qor_Core.
  Qor_SignalCore(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                 const unsigned char* statusWord, unsigned bitCount);
  /// Assigns wholly, or throws bad_alloc with the target as it was.
  Qor_SignalCore& operator=(const Qor_SignalCore& other);

  /// Sets the count of every type that the core has.
  virtual void setCorePhysicalSignalCounts() = 0;
  /// `count` signals of the type from now on.
  void setCorePhysicalSignalCount(unsigned type, unsigned count);

 private:
  std::map<unsigned, unsigned> physicalSignalCounts_;
};

/// A named signal with properties. Destroyed through its own type only: there is no virtual destructor.
class QOR_API Qor_SignalBase {
 public:
  /// The signal types of VIO cores.
  /// @{
  static constexpr unsigned SIGNAL_TYPE_VIO_ASYNC_INPUT = 1;
  static constexpr unsigned SIGNAL_TYPE_VIO_SYNC_INPUT = 2;
  static constexpr unsigned SIGNAL_TYPE_VIO_ASYNC_OUTPUT = 3;
  static constexpr unsigned SIGNAL_TYPE_VIO_SYNC_OUTPUT = 4;
  /// @}
  /// A flag beside the type of a group.
  static constexpr unsigned SIGNAL_TYPE_GROUP = 0x100;

  /// One of the constants above, with SIGNAL_TYPE_GROUP beside it for a group.
  unsigned getType() const { return type_; }
  /// The name that the constructor was given.
  const std::string& getName() const { return name_; }

  /// The property's value, empty when it was never set.
  virtual std::string getProperty(const std::string& name) const;
  /// Sets the property, in the place of an earlier value.
  /// @{
  virtual void setProperty(const char* name, const char* value);
  virtual void setProperty(std::string& name, std::string& value);
  /// @}

 protected:
  /// Copies what it is given. Assigning is wholly done, or throws bad_alloc with the target as it was.
  /// @{
  Qor_SignalBase(unsigned type, const std::string& name);
  Qor_SignalBase(const Qor_SignalBase&);
  Qor_SignalBase& operator=(const Qor_SignalBase&);
  /// @}
  ~Qor_SignalBase();

 private:
  unsigned type_;
  std::string name_;
  std::map<std::string, std::string> properties_;
};

/// One physical signal: `position` is its index among the core's signals of its type, `unit` the unit of a
/// core that has several.
class QOR_API Qor_Signal : public Qor_SignalBase {
 public:
  /// Copies what it is given; `type` is one of the constants of Qor_SignalBase.
  Qor_Signal(unsigned type, unsigned unit, unsigned position, const std::string& name);

  /// What the constructor was given.
  /// @{
  unsigned getUnit() const { return unit_; }
  unsigned getPosition() const { return position_; }
  /// @}

 private:
  unsigned unit_;
  unsigned position_;
};

/// An ordered list of physical signals of one type. getType() carries SIGNAL_TYPE_GROUP beside the type.
class QOR_API Qor_SignalGroup : public Qor_SignalBase {
 public:
  /// Copies `positions`, order kept.
  Qor_SignalGroup(unsigned type, unsigned unit, std::vector<unsigned>& positions, const std::string& name);

  /// A copy has the same type, name, properties and positions.
  Qor_SignalGroup(const Qor_SignalGroup&) = default;
  /// Assigns wholly, or throws bad_alloc with the target as it was.
  Qor_SignalGroup& operator=(const Qor_SignalGroup& other);

  /// The positions, in the order of the constructor.
  const std::vector<unsigned>& getPositionVector() const { return positions_; }

 private:
  std::vector<unsigned> positions_;
};

/// The cores of every session, by address.
class QOR_API Qor_CoreList {
 public:
  /// The core at the address, or null. The list keeps owning it; it is valid until it is removed, or
  /// replaced, or its session is closed.
  static Qor_Core* getCore(unsigned session, QOR_CORE_REF coreRef);

  /// Registers the core under its own address and owns it from a normal return on. Throws, owning nothing,
  /// when the session is unknown or the address is taken.
  static void addCore(unsigned session, Qor_Core* core);

  /// Takes `*core` out of the session's list, destroys it, and sets `*core` to null. A core that the list
  /// does not hold (any more) is left alone. Throws nothing.
  static void removeCore(unsigned session, Qor_Core** core);
};

/// The way to a core through the session's cable.
class QOR_API Qor_CoreComm {
 public:
  /// Reads the status word into the first `bitCount` bits of `statusWord` (at most its size; bits that the
  /// core does not deliver are 0) and fills the record from its head. A core that does not exist leaves both
  /// zero. Throws when nothing answers there, with both zero.
  static void getCoreStatus(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                            Qor_ByteBuffer& statusWord, unsigned bitCount);

  /// Runs a command text: lines of seven fields separated by single blanks and joined by line feeds. `result`
  /// receives the bits that the lines return, each line's from a byte boundary on; `resultBitCount` is their
  /// number in whole bytes, and 0 with a null `result` for a text that returns none. A malformed text throws
  /// logic_error before anything is sent. When the target fails, throws with `result` as it was. `progress`
  /// may be null.
  static void commandSequence(unsigned session, const std::string& text, unsigned char* result,
                              unsigned resultBitCount, QOR_PROGRESS_CALLBACK progress);
};

}  // namespace QorRT
