#include "OutputMemory.h"

#include <unistd.h>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include <nlohmann/json.hpp>

#include "Digits.h"

namespace tool {
namespace {

namespace fs = std::filesystem;

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
  std::string name = key;
  for (char& each : name)
    if (each == '/') each = '%';
  return (folder / "qorvio" / (name + ".json")).string();
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

}  // namespace

OutputMemory::Images::Images(const QORVIO_CORE_INFO& info)
    : asyncOut((info.async_output_count + 7) / 8), syncOut((info.sync_output_count + 7) / 8) {}

OutputMemory::OutputMemory(const std::string& key, const QORVIO_CORE_INFO& info)
    : path_(pathFor(key)), info_(info), now_(remembered()), given_(info) {}

OutputMemory::~OutputMemory() {
  try {
    if (isChanged_ && !path_.empty()) save();
  } catch (const std::exception&) {
    return;  // what the command did stands; only the next toggle starts from older values
  }
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

void OutputMemory::save() const {
  Images images = remembered();
  overlay(images.asyncOut, now_.asyncOut, given_.asyncOut);
  overlay(images.syncOut, now_.syncOut, given_.syncOut);
  const nlohmann::json json{{"async_out", textOf(images.asyncOut)}, {"sync_out", textOf(images.syncOut)}};
  std::error_code failed;
  fs::create_directories(fs::path(path_).parent_path(), failed);
  const std::string fresh = path_ + "." + std::to_string(getpid());  // of this run alone
  bool written = false;
  {
    std::ofstream file(fresh);
    file << json.dump() << '\n';
    written = static_cast<bool>(file.flush());
  }
  if (written) fs::rename(fresh, path_, failed);
  if (!written || failed) fs::remove(fresh, failed);
}

}  // namespace tool
