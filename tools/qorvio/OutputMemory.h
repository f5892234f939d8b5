// What the outputs of a core were last given. The hardware cannot be asked, so it is kept from run to run in a file.
#pragma once

#include <string>

#include "QorVIO_Records.h"
#include "Signal.h"
#include "Value.h"

namespace tool {

class OutputMemory {
 public:
  /// `key` names cable and core; with an empty one nothing is kept in a file.
  OutputMemory(const std::string& key, const QORVIO_CORE_INFO& info);

  const Bytes& image(Port port) const { return port == Port::asyncOut ? asyncOut_ : syncOut_; }
  void set(const Signal& signal, const Bytes& value);

  /// Writes the file, whole or not at all; a folder that cannot be written is no failure.
  void save() const;

 private:
  std::string path_;
  Bytes asyncOut_;
  Bytes syncOut_;
};

}  // namespace tool
