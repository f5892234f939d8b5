// Activity that one host took from a core and did not show: kept in a file for the host that asks next.
#pragma once

#include <memory>
#include <string>

#include "board/model/Sample.h"

namespace qor {

class StateFile;

class ActivityMemory {
 public:
  /// Without a file: keeps nothing.
  ActivityMemory();
  ActivityMemory(const std::string& folder, const std::string& key);
  ~ActivityMemory();

  /// Adds what is kept to the flags of the sample, and keeps it no more. A file that is damaged, or that others keep
  /// locked, counts as none.
  void giveTo(Sample& sample);

  /// Keeps these flags, too. What cannot be kept is lost.
  void keep(const Sample& sample);

 private:
  std::unique_ptr<StateFile> file_;
};

}  // namespace qor
