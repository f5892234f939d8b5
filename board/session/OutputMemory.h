/// @file
/// What the outputs of a core were last given. The hardware cannot be asked, so it is kept from run to run in a file.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "QorVIO_Records.h"
#include "board/Export.h"
#include "board/model/Bits.h"
#include "board/model/Signal.h"

namespace qor {

class StateFile;

/// The folder that the command line keeps such files in: "qorvio" in XDG_STATE_HOME, else in ~/.local/state; empty when
/// neither is set.
QORBOARD_API std::string userStateFolder();

/// Who gave an output its value, and when.
struct Gift {
  std::string by;   ///< "qorvio, process 4711"
  std::int64_t at;  ///< seconds since 1970
};

/// Reads the file at its beginning and writes it at its end and whenever save() is called: what a host that is killed
/// gave since then is not remembered. Of a bit that was never given, or whose file is damaged, cannot be kept up to date
/// or was made for other port widths, nothing is known.
class QORBOARD_API OutputMemory {
 public:
  /// Without a file. `isNew`: the board was powered up in this process, so that its outputs are known to be 0.
  OutputMemory(const QORVIO_CORE_INFO& info, bool isNew);

  /// In a file of that folder; `key` names board and core.
  OutputMemory(const QORVIO_CORE_INFO& info, const std::string& folder, const std::string& key);

  OutputMemory(const OutputMemory&) = delete;
  OutputMemory& operator=(const OutputMemory&) = delete;

  /// As save(), but nobody hears of a failure.
  ~OutputMemory();

  /// The value that the output was last given; nothing where that is not known of every bit.
  std::optional<Bytes> lastGiven(const Signal& output) const;

  /// Who last gave any of its bits a value; nothing where that is not remembered. Reads the file: what was not saved does
  /// not count.
  std::optional<Gift> lastGift(const Signal& output) const;

  void set(const Signal& output, const Bytes& value);

  /// Writes the file, whole or not at all, if anything was set since the time before. Bits that were not stay as the file
  /// has them by then, and are taken from it: another run may have given them meanwhile. A folder that cannot be written
  /// is no failure. Throws Failure when others have kept the folder locked for two seconds, or the file cannot be written.
  void save();

 private:
  struct Image {
    Bytes values, known;
  };
  struct Images {
    explicit Images(const QORVIO_CORE_INFO& info);
    const Image& of(Port port) const { return port == Port::asyncOut ? async : sync; }
    Image& of(Port port) { return port == Port::asyncOut ? async : sync; }

    Image async, sync;
  };

  struct Giver {
    const Bytes& of(Port port) const { return port == Port::asyncOut ? async : sync; }

    Gift gift;
    Bytes async, sync;  ///< masks of the bits that nobody has given since
  };

  Images remembered() const;
  std::vector<Giver> givers() const;
  void merge();

  std::unique_ptr<StateFile> file_;  // null without one
  QORVIO_CORE_INFO info_;
  Images now_;
  Images given_;  // since the last save
  bool isChanged_ = false;
};

}  // namespace qor
