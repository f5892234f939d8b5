/// @file
/// Simulated boards, for tests and demonstrations without hardware. A board is built by a sentence:
///
///     auto cable = qorsim::chain()
///                      .device(0x0A5F1093).named("fpga").irLength(6)
///                      .core(1, 0, qorsim::vio().asyncOut(8).asyncIn(8).design(qorsim::loopback()))
///                      .core(1, 1, qorsim::otherCore(7))
///                      .device(0x1234567B)
///                      .cable();
///
/// Conventions
///
///  1. Device 0, the first one named, is nearest to TDO.
///  2. What the hardware could not be is refused with an invalid_argument whose text names the device, the
///     core and the value; the board stays as it was then.
///  3. Copies of a board or a core share its design objects: give each core that is to live on its own a
///     design of its own.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "Qor_Cable.h"
#include "SimCable.h"
#include "SimCoreDescription.h"
#include "SimDesign.h"
#include "SimPins.h"

namespace qorsim {

/// One core: widths in bits, numbers as its status word gives them. Nothing is checked before the core is put
/// on a board.
class QOR_API CoreSpec {
 public:
  /// A core of that type; vio() and otherCore() read better.
  explicit CoreSpec(unsigned type);

  /// The width of a port, 0 when it is not set.
  /// @{
  CoreSpec& asyncIn(unsigned width);
  CoreSpec& syncIn(unsigned width);
  CoreSpec& asyncOut(unsigned width);
  CoreSpec& syncOut(unsigned width);
  /// @}

  /// The core version, 10.0 when it is not set. Versions before 10.0 have an older status word; before 6.2
  /// that knows no port wider than 255 bits.
  CoreSpec& version(unsigned major, unsigned minor);
  /// 0, and hexadecimal 51, when they are not set.
  /// @{
  CoreSpec& revision(unsigned number);
  CoreSpec& manufacturer(unsigned id);
  /// @}

  /// Of versions from 10.0 on only; 1.0.0 when it is not set.
  CoreSpec& cgVersion(unsigned major, unsigned minor, unsigned minorAlpha);

  /// What the ports are connected to; nothing, as idle(), when it is not set.
  CoreSpec& design(std::shared_ptr<Design> design);

  /// What has been said so far.
  const CoreDescription& description() const { return description_; }

 private:
  CoreDescription description_;
};

/// A VIO core, without ports at first.
QOR_API CoreSpec vio();

/// A core of another type, which delivers its status word and does nothing else. It has no ports and no
/// design.
QOR_API CoreSpec otherCore(unsigned type);

/// A board, device by device. Everything about a device and its cores follows the device.
class QOR_API ChainBuilder {
 public:
  /// The next device, with an IR of 6 bits; `idcode` 0 when it has none.
  ChainBuilder& device(unsigned idcode = 0);
  /// The name of the device, for people.
  ChainBuilder& named(const std::string& name);

  /// 4 to 32 bits.
  ChainBuilder& irLength(unsigned bits);

  /// The instructions that select USER1 and so on, 1 to 4 of them: 2, 3, 4 and 5 when they are not set. Each has room
  /// in the IR, whose length is set before, and is not all ones.
  ChainBuilder& userOpcodes(const std::vector<unsigned>& opcodes);

  /// A core at user chain 1 to 4 of the device, at an index of 0 to 15.
  ChainBuilder& core(unsigned userChain, unsigned index, const CoreSpec& core);

  /// The user registers of the device pass TDI to their hubs, and what their hubs deliver to TDO, so many TCKs late:
  /// 0 to 2, and 0 when they are not set.
  /// @{
  ChainBuilder& lateTdi(unsigned tcks);
  ChainBuilder& lateTdo(unsigned tcks);
  /// @}

  /// The design clock of all cores ticks once in so many of the TCKs that count, see SimCable: 1 when it is not set;
  /// with 0 it stops.
  ChainBuilder& tcksPerClock(unsigned tcks);

  /// The cable to the board, powered up.
  std::unique_ptr<SimCable> cable() const;

  /// The board's four wires, powered up and in Test-Logic-Reset.
  std::unique_ptr<SimPins> pins() const;

 private:
  struct PlacedCore {
    unsigned userChain = 0;
    unsigned index = 0;
    CoreDescription description;
  };
  struct Device {
    QorRT::Qor_Device head;
    std::vector<unsigned> userOpcodes{2, 3, 4, 5};
    unsigned lateTdi = 0, lateTdo = 0;
    std::vector<PlacedCore> cores{};
  };

  std::unique_ptr<Chain> powerUp() const;
  Device& lastDevice(const char* what);
  std::string nameOfLast() const;
  void requireFree(const std::string& part, unsigned userChain, unsigned index) const;

  std::vector<Device> devices_;
  unsigned tcksPerClock_ = 1;
};

/// A board without devices.
QOR_API ChainBuilder chain();

/// The board of "sim:".
///
/// | Device | IDCODE   | Name | IR | User chain | Core | What it is                                        |
/// |--------|----------|------|----|------------|------|---------------------------------------------------|
/// | 0      | 0A5F1093 | fpga | 6  | 1          | 0    | VIO 10.0, 8 bits of every port, outputs loop back |
/// | 0      |          |      |    | 1          | 1    | a core of type 7                                  |
/// | 1      | 1234567B | cpld | 8  | 1          | 0    | VIO 6.1, 16 bits of both inputs, 4 of both        |
/// |        |          |      |    |            |      | outputs; the inputs count design clocks           |
QOR_API ChainBuilder demoBoard();

/// The board that a TOML file describes. Throws runtime_error, "FILE:LINE: KEY: what is wrong", for a file
/// that cannot be read or does not describe a board.
QOR_API ChainBuilder boardFile(const std::string& path);

/// The same of a text; `file` is the name that messages give it.
QOR_API ChainBuilder boardText(const std::string& text, const std::string& file);

}  // namespace qorsim
