#include "board/session/ActivityMemory.h"

#include <filesystem>
#include <system_error>
#include <utility>

#include "board/session/StateFile.h"

namespace qor {
namespace {

constexpr std::pair<const char*, Bytes Sample::*> images[] = {
    {"async_up", &Sample::asyncUp},        {"async_down", &Sample::asyncDown},
    {"sync_up", &Sample::syncUp},          {"sync_down", &Sample::syncDown},
    {"sync_sync_up", &Sample::syncSyncUp}, {"sync_sync_down", &Sample::syncSyncDown},
};

void addTo(Sample& sample, const nlohmann::json& content) {
  for (const auto& [key, image] : images) {
    Bytes& flags = sample.*image;
    const auto kept = imageIn(content, key, static_cast<unsigned>(8 * flags.size()));
    for (std::size_t i = 0; kept && i < flags.size(); ++i)
      flags[i] = static_cast<unsigned char>(flags[i] | (*kept)[i]);
  }
}

bool isQuiet(const Sample& sample) {
  for (const auto& [key, image] : images)
    for (const unsigned char byte : sample.*image)
      if (byte != 0) return false;
  return true;
}

}  // namespace

ActivityMemory::ActivityMemory() = default;

ActivityMemory::ActivityMemory(const std::string& folder, const std::string& key)
    : file_(std::make_unique<StateFile>(folder, key, ".activity")) {}

ActivityMemory::~ActivityMemory() = default;

void ActivityMemory::giveTo(Sample& sample) {
  std::error_code failed;
  if (file_ == nullptr || !file_->isUsable() || !std::filesystem::exists(file_->path(), failed)) return;
  try {
    const os::FileLock lock = file_->lock();
    addTo(sample, file_->content());
    std::filesystem::remove(file_->path(), failed);
  } catch (const std::system_error&) {  // others have it
  }
}

void ActivityMemory::keep(const Sample& sample) {
  if (file_ == nullptr || isQuiet(sample)) return;
  file_->makeFolder();
  if (!file_->isUsable()) return;
  try {
    const os::FileLock lock = file_->lock();
    Sample all = sample;
    addTo(all, file_->content());
    nlohmann::ordered_json content;
    for (const auto& [key, image] : images) content[key] = imageText(all.*image);
    file_->replace(content);
  } catch (const std::system_error&) {  // then it is lost, as it was before there were such files
  }
}

}  // namespace qor
