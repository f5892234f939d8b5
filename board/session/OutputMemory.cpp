#include "board/session/OutputMemory.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>
#include <cctype>
#include <cerrno>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include <nlohmann/json.hpp>

#include "board/model/Digits.h"

namespace qor {
namespace {

namespace fs = std::filesystem;

// As much of the key as can be read in a file name, and a hash (FNV-1a) of all of it.
std::string fileName(const std::string& key) {
  constexpr std::size_t longest = 80;
  std::uint64_t hash = 0xCBF29CE484222325;
  std::string name;
  for (const char letter : key) {
    hash = (hash ^ static_cast<unsigned char>(letter)) * 0x100000001B3;
    const bool isPlain =
        std::isalnum(static_cast<unsigned char>(letter)) != 0 || letter == '.' || letter == '-';
    if (name.size() < longest) name += isPlain ? letter : '_';
  }
  char digits[20];
  std::snprintf(digits, sizeof digits, "-%016llx", static_cast<unsigned long long>(hash));
  return name + digits + ".json";
}

// One file a core, named after where it is.
std::string pathFor(const std::string& key) {
  if (key.empty()) return {};
  const char* const state = std::getenv("XDG_STATE_HOME");
  const char* const home = std::getenv("HOME");
  fs::path folder;
  if (state != nullptr && *state != '\0') {
    folder = state;
  } else if (home != nullptr) {
    folder = fs::path(home) / ".local" / "state";
  } else {
    return {};
  }
  return (folder / "qorvio" / fileName(key)).string();
}

// The image that the file holds; zeros when it does not fit the port.
Bytes imageIn(const nlohmann::json& file, const char* port, unsigned width) {
  Bytes image((width + 7) / 8);
  const auto entry = file.find(port);
  if (entry == file.end() || !entry->is_string()) return image;
  const auto number = numberOf(entry->get<std::string>(), 16);
  if (!number || bitLength(*number) > width) return image;
  std::copy_n(number->begin(), std::min(number->size(), image.size()), image.begin());
  return image;
}

std::string textOf(const Bytes& image) {
  return hexText(image, static_cast<unsigned>(8 * image.size()));
}

void overlay(Bytes& image, const Bytes& bits, const Bytes& mask) {
  for (std::size_t i = 0; i < image.size(); ++i)
    image[i] = static_cast<unsigned char>((image[i] & ~mask[i]) | (bits[i] & mask[i]));
}

// Until its end, the only one that changes files of the folder; where the file system cannot tell, one of several.
class FolderLock {
 public:
  explicit FolderLock(const fs::path& folder)
      : folder_(open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC)) {
    while (folder_ >= 0 && flock(folder_, LOCK_EX) != 0 && errno == EINTR) continue;
  }
  FolderLock(const FolderLock&) = delete;
  FolderLock& operator=(const FolderLock&) = delete;
  ~FolderLock() {
    if (folder_ >= 0) close(folder_);
  }

 private:
  int folder_;
};

}  // namespace

OutputMemory::Images::Images(const QORVIO_CORE_INFO& info)
    : asyncOut((info.async_output_count + 7) / 8), syncOut((info.sync_output_count + 7) / 8) {}

OutputMemory::OutputMemory(const std::string& key, const QORVIO_CORE_INFO& info)
    : path_(pathFor(key)), info_(info), now_(remembered()), given_(info) {}

OutputMemory::~OutputMemory() {
  save();
}

void OutputMemory::set(const Signal& signal, const Bytes& value) {
  for (unsigned i = 0; i < signal.width(); ++i) {
    setBit(now_.of(signal.port), signal.bits[i], bitAt(value.data(), i));
    setBit(given_.of(signal.port), signal.bits[i], 1);
  }
  isChanged_ = true;
}

OutputMemory::Images OutputMemory::remembered() const {
  Images images(info_);
  std::ifstream file(path_);
  const auto json = nlohmann::json::parse(file, nullptr, false);
  if (!json.is_object()) return images;
  images.asyncOut = imageIn(json, "async_out", info_.async_output_count);
  images.syncOut = imageIn(json, "sync_out", info_.sync_output_count);
  return images;
}

void OutputMemory::save() {
  if (!isChanged_ || path_.empty()) return;
  try {
    merge();
  } catch (const std::exception&) {
    return;  // what the command did stands; only the next toggle starts from older values
  }
}

void OutputMemory::merge() {
  std::error_code failed;
  const fs::path folder = fs::path(path_).parent_path();
  fs::create_directories(folder, failed);
  const FolderLock lock(folder);
  Images images = remembered();
  overlay(images.asyncOut, now_.asyncOut, given_.asyncOut);
  overlay(images.syncOut, now_.syncOut, given_.syncOut);
  const nlohmann::json json{{"async_out", textOf(images.asyncOut)}, {"sync_out", textOf(images.syncOut)}};
  const std::string fresh = path_ + "." + std::to_string(getpid());  // of this run alone
  bool written = false;
  {
    std::ofstream file(fresh);
    file << json.dump() << '\n';
    written = static_cast<bool>(file.flush());
  }
  failed.clear();
  if (written) fs::rename(fresh, path_, failed);
  if (!written || failed) {
    fs::remove(fresh, failed);
    return;
  }
  now_ = images;
  given_ = Images(info_);
  isChanged_ = false;
}

}  // namespace qor
