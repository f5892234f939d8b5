#include "board/session/OutputMemory.h"

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <system_error>

#include <nlohmann/json.hpp>

#include "board/model/Digits.h"
#include "board/model/Errors.h"
#include "board/model/Value.h"
#include "os/FileLock.h"
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
  return name + ".json";
}

const char* variable(const char* name) {
  const char* const text = std::getenv(name);
  return text != nullptr ? text : "";
}

// The number of a file, as an image of the port; nothing when there is none that fits.
std::optional<Bytes> imageIn(const nlohmann::json& file, const char* key, unsigned width) {
  const auto entry = file.find(key);
  if (entry == file.end() || !entry->is_string()) return std::nullopt;
  std::optional<Bytes> number = numberOf(entry->get<std::string>(), 16, width);
  if (!number || bitLength(*number) > width) return std::nullopt;
  number->resize(byteCount(width));
  return number;
}

std::string textOf(const Bytes& image) {
  return hexText(image, static_cast<unsigned>(8 * image.size()));
}

void overlay(Bytes& image, const Bytes& bits, const Bytes& mask) {
  for (std::size_t i = 0; i < image.size(); ++i)
    image[i] = static_cast<unsigned char>((image[i] & ~mask[i]) | (bits[i] & mask[i]));
}

}  // namespace

std::string userStateFolder() {
  const std::string state = variable("XDG_STATE_HOME"), home = variable("HOME");
  if (!state.empty()) return (fs::path(state) / "qorvio").string();
  if (!home.empty()) return (fs::path(home) / ".local" / "state" / "qorvio").string();
  return {};
}

OutputMemory::Images::Images(const QORVIO_CORE_INFO& info) {
  async.values = async.known = Bytes(byteCount(info.async_output_count));
  sync.values = sync.known = Bytes(byteCount(info.sync_output_count));
}

OutputMemory::OutputMemory(const QORVIO_CORE_INFO& info, bool isNew) : info_(info), now_(info), given_(info) {
  for (Image* each : {&now_.async, &now_.sync})
    std::fill(each->known.begin(), each->known.end(), static_cast<unsigned char>(isNew ? 0xFF : 0));
}

OutputMemory::OutputMemory(const QORVIO_CORE_INFO& info, const std::string& folder, const std::string& key)
    : path_((fs::path(folder) / fileName(key)).string()), info_(info), now_(info), given_(info) {
  if (os::isWritableFolder(fs::path(path_).parent_path().string())) now_ = remembered();
}

OutputMemory::~OutputMemory() {
  try {
    save();
  } catch (const std::exception&) {
    return;  // those who want to know call save()
  }
}

std::optional<Bytes> OutputMemory::lastGiven(const Signal& output) const {
  const Image& image = now_.of(output.port);
  Bytes value(byteCount(output.width()));
  for (unsigned i = 0; i < output.width(); ++i) {
    if (bitAt(image.known, output.bits[i]) == 0) return std::nullopt;
    setBit(value, i, bitAt(image.values, output.bits[i]));
  }
  return value;
}

void OutputMemory::set(const Signal& output, const Bytes& value) {
  for (unsigned i = 0; i < output.width(); ++i) {
    for (Images* each : {&now_, &given_}) {
      setBit(each->of(output.port).values, output.bits[i], bitAt(value, i));
      setBit(each->of(output.port).known, output.bits[i], 1);
    }
  }
  isChanged_ = true;
}

OutputMemory::Images OutputMemory::remembered() const {
  Images images(info_);
  std::string text;
  try {
    text = os::readFile(path_, largestFile);
  } catch (const std::system_error&) {
    return images;
  }
  const auto json = nlohmann::json::parse(text, nullptr, false);
  if (!json.is_object()) return images;
  const auto fill = [&](Image& image, const std::string& port, unsigned width) {
    const auto values = imageIn(json, port.c_str(), width),
               known = imageIn(json, (port + "_known").c_str(), width);
    if (values && known) image = {*values, *known};
  };
  fill(images.async, "async_out", info_.async_output_count);
  fill(images.sync, "sync_out", info_.sync_output_count);
  return images;
}

void OutputMemory::save() {
  if (!isChanged_ || path_.empty()) return;
  const fs::path folder = fs::path(path_).parent_path();
  std::error_code failed;
  fs::create_directories(folder, failed);
  if (!os::isWritableFolder(folder.string())) return;
  try {
    merge();
  } catch (const std::system_error& error) {
    const bool isLocked = error.code() == std::errc::timed_out;
    throw Failure("cannot remember what the outputs were given, in " + path_ + ": " +
                  (isLocked ? "another program keeps the folder locked" : error.code().message()));
  }
}

void OutputMemory::merge() {
  const os::FileLock lock((fs::path(path_).parent_path() / ".lock").string(), lockTimeout);
  Images images = remembered();
  for (Port port : {Port::asyncOut, Port::syncOut}) {
    const Image& given = given_.of(port);
    overlay(images.of(port).values, given.values, given.known);
    overlay(images.of(port).known, given.known, given.known);
  }
  const nlohmann::ordered_json json{{"async_out", textOf(images.async.values)},
                                    {"async_out_known", textOf(images.async.known)},
                                    {"sync_out", textOf(images.sync.values)},
                                    {"sync_out_known", textOf(images.sync.known)}};
  os::replaceFile(path_, json.dump() + "\n");
  now_ = images;
  given_ = Images(info_);
  isChanged_ = false;
}

}  // namespace qor
