// Recording replacements for libQorJtag and libQorCore: they note every call, answer what a test prepared, and
// fail where a test asks for it.
#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "QorCore.h"

namespace fake {

struct Platform {
  /// One line a call, in order: "lock 7 60000", "unlock 7", "status 0.1.2 1232", "plain status 0.1.2",
  /// "sequence TEXT", "flush 7", "add 0.1.2", "remove 0.1.2", "message 100 TEXT".
  std::vector<std::string> calls;

  /// What a call does before anything else; set to throw.
  std::map<std::string, std::function<void()>> before;  // by the first word of its line

  QOR_CORE_INFO info{};                                           // the head that status reads give
  std::vector<unsigned char> word;                                // the status word
  unsigned plainStatus = 0;                                       // what QorCore_getCoreStatus returns
  std::string readDigits;                                         // the record digits of the next reads
  std::map<std::string, std::unique_ptr<QorRT::Qor_Core>> cores;  // by "device.chain.core"

  /// A VIO core of the current layout at every address.
  void answerAsVioCore(unsigned asyncIn, unsigned syncIn, unsigned asyncOut, unsigned syncOut);

  /// Puts an unsigned field into the status word.
  void putField(unsigned offset, unsigned length, unsigned value);

  /// The calls noted since the last time this was asked.
  std::vector<std::string> take();

  void note(const std::string& name, const std::string& rest);
};

/// The one set of fakes; reset() makes it new.
Platform& platform();
void reset();

std::string addressOf(QOR_CORE_REF coreRef);

}  // namespace fake
