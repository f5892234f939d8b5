/// @file
/// libQorCore: the cores of each session, base classes of cores and signals, and the transfers to and from
/// cores on the chip.
///
/// Conventions
///
///  1. Every buffer is a little-endian bit array: bit i is bit (i mod 8) of byte i / 8.
///  2. Any thread may use the core list. Only the owner of the session's target lock may call the functions
///     of Qor_CoreComm.
///  3. Failures are standard exceptions. Their text says what is wrong, and at which address.
#pragma once

#include <map>
#include <stdexcept>
#include <string>
#include <vector>

#include "QorCore_Records.h"
#include "QorExport.h"
#include "QorUtil.h"

/// The state of a command sequence when it reports progress.
enum QOR_PROGRESS_STATUS { QOR_PROGRESS_RUNNING, QOR_PROGRESS_DONE };
/// What a callback asks of the sequence.
enum QOR_PROGRESS_RETURN { QOR_PROGRESS_CONTINUE, QOR_PROGRESS_ABORT };
/// Called before each pair of lines of a command text and at its end. The numbers are the session, the pairs
/// that are done, and all pairs. If it returns QOR_PROGRESS_ABORT, the sequence throws logic_error.
using QOR_PROGRESS_CALLBACK = QOR_PROGRESS_RETURN (*)(unsigned, unsigned, unsigned, QOR_PROGRESS_STATUS);

namespace QorRT {

/// Thrown when nothing that begins as a debug hub's answer came back at any attempt: no hub is at that device and
/// user chain, its device is off, or TDO is dead. Anything else that goes wrong is another exception.
class QOR_API Qor_NoHub : public std::runtime_error {
 public:
  explicit Qor_NoHub(const std::string& text);
  Qor_NoHub(const Qor_NoHub&);
  ~Qor_NoHub() override;
};

}  // namespace QorRT

/// Reads the head of the core's status word into `*coreInfo` (out), and its first `bitCount` bits into
/// `statusWord` (out; may be null if `bitCount` is 0). Returns 0; or a nonzero status, with the record all
/// zero, if there is no such core. Throws Qor_NoHub, with the record all
/// zero, if no debug hub answers.
extern "C" QOR_API unsigned QorCore_getCoreStatus(unsigned session, QOR_CORE_REF coreRef,
                                                  QOR_CORE_INFO* coreInfo, unsigned char* statusWord,
                                                  unsigned bitCount);

namespace QorRT {

/// A core at an address of a session. Keeps the arguments of its constructor, and a copy of the status word.
class QOR_API Qor_Core {
 public:
  virtual ~Qor_Core();

  /// Sets the core up from its status word. Returns false if the word is not valid for this kind of core.
  virtual bool initFromStatusWord(unsigned session) = 0;
  /// Returns false, unless a derived class overrides it.
  virtual bool isQorVbrnSlave();

  /// The arguments of the constructor.
  /// @{
  unsigned getCoreType() const { return coreInfo_.core_type; }
  QOR_CORE_REF getCoreRef() const { return coreRef_; }
  QOR_CORE_INFO getCoreInfo() const { return coreInfo_; }
  /// @}

 protected:
  /// `statusWord` (in) is `bitCount` bits, rounded up to whole bytes.
  Qor_Core(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo, const unsigned char* statusWord,
           unsigned bitCount);
  Qor_Core(const Qor_Core&) = delete;
  /// If it throws (bad_alloc), the target is as it was.
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

  /// The generic signals of the core, for kinds of core that have such signals.
  /// @{
  virtual void addSignal(Qor_SignalBase* signal) = 0;
  virtual Qor_SignalBase* getSignal(const std::string& name, unsigned first, unsigned last) = 0;
  virtual void removeSignal(Qor_SignalBase* signal) = 0;
  /// @}

  /// The count that was last set for the type; 0 before that.
  unsigned getCorePhysicalSignalCount(unsigned type) const;

 protected:
  /// The arguments are the same as those of Qor_Core.
  Qor_SignalCore(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                 const unsigned char* statusWord, unsigned bitCount);
  /// If it throws (bad_alloc), the target is as it was.
  Qor_SignalCore& operator=(const Qor_SignalCore& other);

  /// Sets the count of each signal type of the core.
  virtual void setCorePhysicalSignalCounts() = 0;
  /// Sets the count of the type.
  void setCorePhysicalSignalCount(unsigned type, unsigned count);

 private:
  std::map<unsigned, unsigned> physicalSignalCounts_;
};

/// A named signal with properties. It has no virtual destructor: destroy an object through its own type only.
class QOR_API Qor_SignalBase {
 public:
  /// The signal types of VIO cores.
  /// @{
  static constexpr unsigned SIGNAL_TYPE_VIO_ASYNC_INPUT = 1;
  static constexpr unsigned SIGNAL_TYPE_VIO_SYNC_INPUT = 2;
  static constexpr unsigned SIGNAL_TYPE_VIO_ASYNC_OUTPUT = 3;
  static constexpr unsigned SIGNAL_TYPE_VIO_SYNC_OUTPUT = 4;
  /// @}
  /// A flag that the type of a group contains too.
  static constexpr unsigned SIGNAL_TYPE_GROUP = 0x100;

  /// One of the constants above; for a group, OR SIGNAL_TYPE_GROUP.
  unsigned getType() const { return type_; }
  /// The name that was passed to the constructor.
  const std::string& getName() const { return name_; }

  /// The property's value; empty if it was never set.
  virtual std::string getProperty(const std::string& name) const;
  /// Sets the property. It replaces an earlier value.
  /// @{
  virtual void setProperty(const char* name, const char* value);
  virtual void setProperty(std::string& name, std::string& value);
  /// @}

 protected:
  /// Copies its arguments. If an assignment throws (bad_alloc), the target is as it was.
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

/// One physical signal. `position` is its index among the core's signals of its type. `unit` is the unit,
/// for a core with several units.
class QOR_API Qor_Signal : public Qor_SignalBase {
 public:
  /// Copies its arguments. `type` is one of the constants of Qor_SignalBase.
  Qor_Signal(unsigned type, unsigned unit, unsigned position, const std::string& name);

  /// The arguments of the constructor.
  /// @{
  unsigned getUnit() const { return unit_; }
  unsigned getPosition() const { return position_; }
  /// @}

 private:
  unsigned unit_;
  unsigned position_;
};

/// An ordered list of physical signals of one type. getType() gives the type OR SIGNAL_TYPE_GROUP.
class QOR_API Qor_SignalGroup : public Qor_SignalBase {
 public:
  /// Copies `positions` (in), in their order.
  Qor_SignalGroup(unsigned type, unsigned unit, std::vector<unsigned>& positions, const std::string& name);

  /// A copy has the same type, name, properties and positions.
  Qor_SignalGroup(const Qor_SignalGroup&) = default;
  /// If it throws (bad_alloc), the target is as it was.
  Qor_SignalGroup& operator=(const Qor_SignalGroup& other);

  /// The positions, in the order of the constructor.
  const std::vector<unsigned>& getPositionVector() const { return positions_; }

 private:
  std::vector<unsigned> positions_;
};

/// The cores of each session, by address.
class QOR_API Qor_CoreList {
 public:
  /// The core at the address, or null. The list owns it. It is valid until it is removed or its session is
  /// closed.
  static Qor_Core* getCore(unsigned session, QOR_CORE_REF coreRef);

  /// Registers the core at its own address. After a normal return the list owns it. Throws if the session is
  /// unknown or there is a core at the address already; the caller owns the core then.
  static void addCore(unsigned session, Qor_Core* core);

  /// Removes `*core` from the session's list, destroys it, and sets `*core` to null. Does nothing if the list
  /// does not contain it. Throws nothing.
  static void removeCore(unsigned session, Qor_Core** core);
};

/// Transfers to and from a core, through the session's cable.
class QOR_API Qor_CoreComm {
 public:
  /// Reads the status word into the first `bitCount` bits of `statusWord` (out; at most its size; bits that
  /// the core does not have are 0), and its head into `*coreInfo` (out). If there is no such core, both are
  /// zero. If no debug hub answers, it throws Qor_NoHub,
  /// and both are zero.
  static void getCoreStatus(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                            Qor_ByteBuffer& statusWord, unsigned bitCount);

  /// Runs a command text: lines of seven fields, separated by single blanks; the lines are joined by line
  /// feeds. `result` (out) receives the bits that the lines return; those of each line start at a byte
  /// boundary. `resultBitCount` is their number, with each line rounded up to whole bytes. For a text that
  /// returns nothing `result` is null and `resultBitCount` 0. A malformed text throws logic_error before
  /// anything is sent. If the target fails, it throws, and `result` is as it was. `progress` may be null.
  static void commandSequence(unsigned session, const std::string& text, unsigned char* result,
                              unsigned resultBitCount, QOR_PROGRESS_CALLBACK progress);
};

}  // namespace QorRT
