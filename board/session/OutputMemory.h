// What the outputs of a core were last given. The hardware cannot be asked, so it is kept from run to run in a file.
#pragma once

#include <string>

#include "QorVIO_Records.h"
#include "board/model/Signal.h"
#include "board/model/Value.h"

namespace qor {

/// Reads the file at its beginning and writes it at its end and whenever save() is called: what a command that is killed
/// gave since then is not remembered.
class OutputMemory {
 public:
  /// `key` names cable and core; with an empty one nothing is kept in a file.
  OutputMemory(const std::string& key, const QORVIO_CORE_INFO& info);
  OutputMemory(const OutputMemory&) = delete;
  OutputMemory& operator=(const OutputMemory&) = delete;

  ~OutputMemory();

  const Bytes& image(Port port) const { return now_.of(port); }
  void set(const Signal& signal, const Bytes& value);

  /// Writes the file, whole or not at all, if anything was set since the time before. Bits that were not stay as the file
  /// has them by then, and are taken from it: another run may have given them meanwhile. A folder that cannot be written
  /// is no failure.
  void save();

 private:
  struct Images {
    explicit Images(const QORVIO_CORE_INFO& info);
    const Bytes& of(Port port) const { return port == Port::asyncOut ? asyncOut : syncOut; }
    Bytes& of(Port port) { return port == Port::asyncOut ? asyncOut : syncOut; }

    Bytes asyncOut, syncOut;
  };

  Images remembered() const;
  void merge();

  std::string path_;
  QORVIO_CORE_INFO info_;
  Images now_;
  Images given_;  // which bits were set since the last save
  bool isChanged_ = false;
};

}  // namespace qor
