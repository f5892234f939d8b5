#include "tools/qorvio/Context.h"

#include <cstdlib>
#include <filesystem>

#include "board/model/Errors.h"
#include "board/model/TomlPlace.h"

namespace qor::tool {
namespace {

void fillFromEnvironment(std::string& value, const char* variable) {
  const char* const text = std::getenv(variable);
  if (value.empty() && text != nullptr) value = text;
}

// A simulated board in this process is new in every run: nothing of its outputs is worth remembering.
std::string memoryKey(const std::string& cable, QOR_CORE_REF ref) {
  return cable.rfind("sim:", 0) == 0 ? "" : cable + " " + refText(ref);
}

QOR_CORE_REF firstVioCore(Link& link) {
  const std::vector<FoundCore> cores = findCores(link);
  for (const FoundCore& core : cores)
    if (core.isVio()) return core.ref;
  throw Failure("no VIO core on this board: " + std::to_string(cores.size()) + " cores of other types, " +
                std::to_string(link.devices().size()) + " devices");
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
  if (link_) return *link_;
  std::unique_ptr<QorRT::Qor_Cable> cable = openCable(settings.cable);
  if (traffic_ != nullptr) cable = std::make_unique<CountingCable>(std::move(cable), *traffic_);
  link_ = std::make_unique<Link>(std::move(cable));
  return *link_;
}

QOR_CORE_REF Context::coreRef() {
  if (core_) return core_->ref();
  if (!settings.core.empty()) return parseRef(settings.core);
  if (file().core) return *file().core;
  return firstVioCore(link());
}

CoreSession& Context::core() {
  if (!core_) {
    const QOR_CORE_REF ref = coreRef();
    core_ = std::make_unique<CoreSession>(link(), ref, memoryKey(settings.cable, ref));
  }
  return *core_;
}

const SignalTable& Context::file() {
  if (!file_) file_ = settings.signals.empty() ? SignalTable() : readSignalFile(settings.signals);
  return *file_;
}

const SignalTable& Context::signals() {
  if (signals_) return *signals_;
  SignalTable table = file();
  const std::vector<std::string> wrong = misfits(table, core().info());
  if (!wrong.empty()) throw WrongUse(settings.signals + ": " + wrong.front());
  table.addWholePorts(core().info());
  signals_ = std::move(table);
  return *signals_;
}

}  // namespace qor::tool
