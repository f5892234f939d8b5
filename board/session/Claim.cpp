#include "board/session/Claim.h"

#include <chrono>
#include <system_error>

#include "board/model/Errors.h"
#include "board/session/StateFile.h"
#include "os/FileLock.h"
#include "os/Process.h"

namespace qor {
namespace {

constexpr std::chrono::milliseconds timeout(500);

std::string holderIn(const nlohmann::json& file) {
  const auto text = [&](const char* key) {
    const auto entry = file.find(key);
    return entry != file.end() && entry->is_string() ? entry->get<std::string>() : "";
  };
  const auto process = file.find("process");
  const std::string number = process != file.end() && process->is_number() ? process->dump() : "";
  return number.empty() ? "another program"
                        : text("program") + ", process " + number + ", since " + text("since");
}

}  // namespace

struct Claim::Lock {
  explicit Lock(const std::string& path) : file(path, timeout) {}

  os::FileLock file;
};

Claim::Claim(const std::string& folder, const std::string& key, const std::string& what) {
  const StateFile file(folder, key, ".claim");
  file.makeFolder();
  if (!file.isUsable()) return;
  try {
    lock_ = std::make_unique<Lock>(file.path());
    const nlohmann::ordered_json holder{
        {"program", os::programName()}, {"process", os::processId()}, {"since", os::localTime(os::now())}};
    lock_->file.write(holder.dump() + "\n");
  } catch (const std::system_error& error) {
    if (error.code() != std::errc::timed_out) return;
    throw Busy(what + " is read by " + holderIn(file.content()) +
               ": two readers take activity from each other, --share goes on");
  }
}

Claim::~Claim() = default;

}  // namespace qor
