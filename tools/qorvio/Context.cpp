#include "tools/qorvio/Context.h"

#include <cstdio>

#include "board/model/CoreAddress.h"
#include "board/session/OutputMemory.h"

namespace qor::tool {

const std::string& Context::cable() {
  if (settings.cable.empty()) {
    settings.cable = "sim:";
    if (!settings.quiet) std::fputs("qorvio: no cable given: the simulated demo board\n", stderr);
  }
  return settings.cable;
}

Link& Context::link() {
  if (board_) return board_->link();
  if (link_) return *link_;
  std::unique_ptr<QorRT::Qor_Cable> opened = openCable(cable(), os::isStopAsked);
  if (traffic_ != nullptr) opened = std::make_unique<CountingCable>(std::move(opened), *traffic_);
  link_ = std::make_unique<Link>(std::move(opened), cable());
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
  options.stop = os::isStopAsked;
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
