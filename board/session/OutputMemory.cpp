#include "board/session/OutputMemory.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <system_error>

#include <nlohmann/json.hpp>

#include "board/model/Digits.h"
#include "board/model/Errors.h"
#include "board/model/Sample.h"
#include "board/session/StateFile.h"
#include "os/Process.h"

namespace qor {
namespace {

namespace fs = std::filesystem;

const char* variable(const char* name) {
  const char* const text = std::getenv(name);
  return text != nullptr ? text : "";
}

void overlay(Bytes& image, const Bytes& bits, const Bytes& mask) {
  for (std::size_t i = 0; i < image.size(); ++i)
    image[i] = static_cast<unsigned char>((image[i] & ~mask[i]) | (bits[i] & mask[i]));
}

void remove(Bytes& bits, const Bytes& mask) {
  for (std::size_t i = 0; i < bits.size(); ++i) bits[i] = static_cast<unsigned char>(bits[i] & ~mask[i]);
}

// Those of before without the bits that were given now, and this process.
template <class Givers>
nlohmann::ordered_json mergedGivers(Givers before, const Bytes& async, const Bytes& sync) {
  nlohmann::ordered_json list = nlohmann::ordered_json::array();
  const auto add = [&](const Gift& gift, const Bytes& asyncBits, const Bytes& syncBits) {
    list.push_back({{"by", gift.by},
                    {"at", gift.at},
                    {"async_out", imageText(asyncBits)},
                    {"sync_out", imageText(syncBits)}});
  };
  for (auto& each : before) {
    remove(each.async, async);
    remove(each.sync, sync);
    if (bitLength(each.async) + bitLength(each.sync) != 0) add(each.gift, each.async, each.sync);
  }
  add({os::programName() + ", process " + std::to_string(os::processId()), os::now()}, async, sync);
  return list;
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
    : file_(std::make_unique<StateFile>(folder, key, ".json")), info_(info), now_(info), given_(info) {
  if (file_->isUsable()) now_ = remembered();
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
  const nlohmann::json json = file_->content();
  const auto fill = [&](Image& image, const std::string& port, unsigned width) {
    const auto values = imageIn(json, port, width), known = imageIn(json, port + "_known", width);
    if (values && known) image = {*values, *known};
  };
  fill(images.async, "async_out", info_.async_output_count);
  fill(images.sync, "sync_out", info_.sync_output_count);
  return images;
}

std::vector<OutputMemory::Giver> OutputMemory::givers() const {
  std::vector<Giver> givers;
  if (file_ == nullptr) return givers;
  const nlohmann::json json = file_->content();
  const auto list = json.find("givers");
  if (list == json.end() || !list->is_array()) return givers;
  for (const nlohmann::json& each : *list) {
    if (!each.is_object() || !each.value("by", nlohmann::json()).is_string() ||
        !each.value("at", nlohmann::json()).is_number_integer())
      continue;
    const auto async = imageIn(each, "async_out", info_.async_output_count),
               sync = imageIn(each, "sync_out", info_.sync_output_count);
    if (async && sync) givers.push_back({{each["by"], each["at"]}, *async, *sync});
  }
  return givers;
}

std::optional<Gift> OutputMemory::lastGift(const Signal& output) const {
  std::optional<Gift> newest;
  for (const Giver& each : givers())
    if ((!newest || each.gift.at > newest->at) && anyOf(output, each.of(output.port))) newest = each.gift;
  return newest;
}

void OutputMemory::save() {
  if (!isChanged_ || file_ == nullptr) return;
  file_->makeFolder();
  if (!file_->isUsable()) return;
  try {
    merge();
  } catch (const std::system_error& error) {
    const bool isLocked = error.code() == std::errc::timed_out;
    throw Failure("cannot remember what the outputs were given, in " + file_->path() + ": " +
                  (isLocked ? "another program keeps the folder locked" : error.code().message()));
  }
}

void OutputMemory::merge() {
  const os::FileLock lock = file_->lock();
  Images images = remembered();
  for (Port port : {Port::asyncOut, Port::syncOut}) {
    const Image& given = given_.of(port);
    overlay(images.of(port).values, given.values, given.known);
    overlay(images.of(port).known, given.known, given.known);
  }
  file_->replace({{"async_out", imageText(images.async.values)},
                  {"async_out_known", imageText(images.async.known)},
                  {"sync_out", imageText(images.sync.values)},
                  {"sync_out_known", imageText(images.sync.known)},
                  {"givers", mergedGivers(givers(), given_.async.known, given_.sync.known)}});
  now_ = images;
  given_ = Images(info_);
  isChanged_ = false;
}

}  // namespace qor
