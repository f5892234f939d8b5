// What the outputs of a core were last given. The hardware cannot be asked, so it is kept from run to run in a file.
#pragma once

#include <string>

#include "QorVIO_Records.h"
#include "Signal.h"
#include "Value.h"

namespace tool {

/// Reads the file at its beginning and writes it once, at its end, however the command ends.
class OutputMemory {
 public:
  /// `key` names cable and core; with an empty one nothing is kept in a file.
  OutputMemory(const std::string& key, const QORVIO_CORE_INFO& info);
  OutputMemory(const OutputMemory&) = delete;
  OutputMemory& operator=(const OutputMemory&) = delete;

  /// Writes the file, whole or not at all, if anything was set. Bits that were not set stay as the file has them by then:
  /// another run may have given them meanwhile. A folder that cannot be written is no failure.
  ~OutputMemory();

  const Bytes& image(Port port) const { return now_.of(port); }
  void set(const Signal& signal, const Bytes& value);

 private:
  struct Images {
    explicit Images(const QORVIO_CORE_INFO& info);
    const Bytes& of(Port port) const { return port == Port::asyncOut ? asyncOut : syncOut; }
    Bytes& of(Port port) { return port == Port::asyncOut ? asyncOut : syncOut; }

    Bytes asyncOut, syncOut;
  };

  Images remembered() const;
  void save() const;

  std::string path_;
  QORVIO_CORE_INFO info_;
  Images now_;
  Images given_;  // which bits were set
  bool isChanged_ = false;
};

}  // namespace tool
