#include "tools/qorvio/Context.h"

#include <cstdlib>
#include <filesystem>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/model/TomlPlace.h"
#include "board/session/OutputMemory.h"

namespace qor::tool {
namespace {

void fillFromEnvironment(std::string& value, const char* variable) {
  const char* const text = std::getenv(variable);
  if (value.empty() && text != nullptr) value = text;
}

}  // namespace

void Settings::complete() {
  fillFromEnvironment(cable, "QORVIO_CABLE");
  fillFromEnvironment(core, "QORVIO_CORE");
  fillFromEnvironment(signals, "QORVIO_SIGNALS");
  const std::string path = "qorvio.toml";
  if (std::filesystem::exists(path)) {
    const toml::table parsed = readToml(path);
    const TomlPlace root(path, parsed, "");
    root.requireKeys({"cable", "core", "signals"});
    const auto fill = [&](std::string& value, const char* key) {
      if (root.has(key) && value.empty()) value = root.at(key).text();
    };
    fill(cable, "cable");
    fill(core, "core");
    fill(signals, "signals");
  }
  if (cable.empty()) cable = "sim:";
}

Link& Context::link() {
  if (board_) return board_->link();
  if (link_) return *link_;
  std::unique_ptr<QorRT::Qor_Cable> cable = openCable(settings.cable);
  if (traffic_ != nullptr) cable = std::make_unique<CountingCable>(std::move(cable), *traffic_);
  link_ = std::make_unique<Link>(std::move(cable), settings.cable);
  return *link_;
}

QOR_CORE_REF Context::coreRef() {
  if (!settings.core.empty()) return parseRef(settings.core);
  return file().cores().empty() ? firstVioCore(link()) : file().cores().front();
}

Board& Context::board() {
  if (board_) return *board_;
  BoardOptions options;
  if (!settings.core.empty()) options.core = parseRef(settings.core);
  options.forceCore = settings.forceCore;
  options.stateFolder = userStateFolder();
  const SignalTable& signals = file();
  link();
  board_ = std::make_unique<Board>(std::move(link_), signals, std::move(options));
  return *board_;
}

const SignalTable& Context::file() {
  if (!file_) file_ = settings.signals.empty() ? SignalTable() : readSignalFile(settings.signals);
  return *file_;
}

}  // namespace qor::tool
