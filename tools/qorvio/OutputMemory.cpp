#include "OutputMemory.h"

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

// The image that the file remembers; zeros when it does not fit the port.
Bytes remembered(const nlohmann::json& file, const char* port, unsigned width) {
  Bytes image((width + 7) / 8);
  const auto entry = file.find(port);
  if (entry == file.end() || !entry->is_string()) return image;
  const auto number = numberOf(entry->get<std::string>(), 16);
  if (!number || bitLength(*number) > width) return image;
  std::copy_n(number->begin(), std::min(number->size(), image.size()), image.begin());
  return image;
}

}  // namespace

OutputMemory::OutputMemory(const std::string& key, const QORVIO_CORE_INFO& info)
    : path_(pathFor(key)),
      asyncOut_((info.async_output_count + 7) / 8),
      syncOut_((info.sync_output_count + 7) / 8) {
  if (path_.empty()) return;
  std::ifstream file(path_);
  const auto json = nlohmann::json::parse(file, nullptr, false);
  if (!json.is_object()) return;
  asyncOut_ = remembered(json, "async_out", info.async_output_count);
  syncOut_ = remembered(json, "sync_out", info.sync_output_count);
}

void OutputMemory::set(const Signal& signal, const Bytes& value) {
  Bytes& image = signal.port == Port::asyncOut ? asyncOut_ : syncOut_;
  for (unsigned i = 0; i < signal.width(); ++i) setBit(image, signal.bits[i], bitAt(value.data(), i));
}

void OutputMemory::save() const {
  if (path_.empty()) return;
  const nlohmann::json json{{"async_out", hexText(asyncOut_, static_cast<unsigned>(8 * asyncOut_.size()))},
                            {"sync_out", hexText(syncOut_, static_cast<unsigned>(8 * syncOut_.size()))}};
  std::error_code failed;
  fs::create_directories(fs::path(path_).parent_path(), failed);
  const std::string fresh = path_ + ".new";
  bool written = false;
  {
    std::ofstream file(fresh);
    file << json.dump() << '\n';
    written = static_cast<bool>(file.flush());
  }
  if (written) fs::rename(fresh, path_, failed);
}

}  // namespace tool
