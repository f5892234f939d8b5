#include "board/session/StateFile.h"

#include <chrono>
#include <filesystem>
#include <system_error>

#include "board/model/Digits.h"
#include "board/model/Value.h"
#include "os/Files.h"
#include "os/Folder.h"

namespace qor {
namespace {

namespace fs = std::filesystem;

constexpr std::chrono::seconds lockTimeout(2);
constexpr std::size_t largestFile = 1 << 20;

// The key in characters that every file system takes; a long one in several folders, since a name has 255 at most.
std::string fileName(const std::string& key) {
  constexpr std::size_t longest = 200;
  std::string name;
  std::size_t begin = 0;
  for (const char letter : key) {
    const bool isPlain = (letter >= 'a' && letter <= 'z') || (letter >= 'A' && letter <= 'Z') ||
                         (letter >= '0' && letter <= '9') || letter == '.' || letter == '-';
    const auto byte = static_cast<unsigned char>(letter);
    if (name.size() - begin > longest) begin = (name += "_/").size();
    name += isPlain ? std::string(1, letter) : "%" + hexText({byte}, 8);
  }
  return name;
}

}  // namespace

StateFile::StateFile(const std::string& folder, const std::string& key, const std::string& ending)
    : path_((fs::path(folder) / (fileName(key) + ending)).string()) {}

bool StateFile::isUsable() const {
  return !path_.empty() && os::isWritableFolder(fs::path(path_).parent_path().string());
}

void StateFile::makeFolder() const {
  std::error_code failed;
  if (!path_.empty()) fs::create_directories(fs::path(path_).parent_path(), failed);
}

nlohmann::json StateFile::content() const {
  try {
    auto json = nlohmann::json::parse(os::readFile(path_, largestFile), nullptr, false);
    if (json.is_object()) return json;
  } catch (const std::system_error&) {  // there is none
  }
  return nlohmann::json::object();
}

os::FileLock StateFile::lock() const {
  return {(fs::path(path_).parent_path() / ".lock").string(), lockTimeout};
}

void StateFile::replace(const nlohmann::ordered_json& content) const {
  os::replaceFile(path_, content.dump() + "\n");
}

std::string imageText(const Bytes& image) {
  return hexText(image, static_cast<unsigned>(8 * image.size()));
}

std::optional<Bytes> imageIn(const nlohmann::json& file, const std::string& key, unsigned width) {
  const auto entry = file.find(key);
  if (entry == file.end() || !entry->is_string()) return std::nullopt;
  std::optional<Bytes> number = numberOf(entry->get<std::string>(), 16, width);
  if (!number || bitLength(*number) > width) return std::nullopt;
  number->resize(byteCount(width));
  return number;
}

}  // namespace qor
