#include "tools/qorvio/WatchLayout.h"

#include <filesystem>
#include <system_error>

#include <nlohmann/json.hpp>

#include "board/session/OutputMemory.h"
#include "os/Files.h"

namespace qor::tool {
namespace {

namespace fs = std::filesystem;
using nlohmann::json;

fs::path fileName() {
  return fs::path(userStateFolder()) / "watch.layout";
}

json content() {
  try {
    constexpr std::size_t largest = 1 << 20;
    json all = json::parse(os::readFile(fileName().string(), largest), nullptr, false);
    if (all.is_object()) return all;
  } catch (const std::system_error&) {  // there is none
  }
  return json::object();
}

}  // namespace

void WatchLayout::restore(LiveWatch& live) const {
  const json all = content();
  const auto mine = all.find(cable_);
  if (mine == all.end() || !mine->is_object()) return;
  const auto chosen = mine->find("chosen"), history = mine->find("history");
  if (chosen != mine->end() && chosen->is_string()) live.choose(chosen->get<std::string>());
  if (history != mine->end() && *history == true) live.showHistory(true);
}

void WatchLayout::keep(const LiveWatch& live) const {
  if (userStateFolder().empty()) return;
  json all = content();
  all[cable_] = {{"chosen", live.chosen()}, {"history", live.showsHistory()}};
  std::error_code failed;
  fs::create_directories(userStateFolder(), failed);
  try {
    os::replaceFile(fileName().string(), all.dump(-1, ' ', false, json::error_handler_t::replace) + "\n");
  } catch (const std::system_error&) {
    return;
  }
}

}  // namespace qor::tool
