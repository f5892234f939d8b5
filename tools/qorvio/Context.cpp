#include "tools/qorvio/Context.h"

#include <cerrno>
#include <cstdio>
#include <system_error>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/session/OutputMemory.h"
#include "tools/qorvio/terminal/Printable.h"

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
  if (const LogFunction log = logFunction()) opened = std::make_unique<LoggingCable>(std::move(opened), log);
  link_ = std::make_unique<Link>(std::move(opened), cable());
  return *link_;
}

// Empty when no log is wanted.
LogFunction Context::logFunction() {
  if (settings.log.empty() && !settings.verbose) return {};
  if (!settings.log.empty()) {
    log_.reset(std::fopen(settings.log.c_str(), "w"));
    if (log_ == nullptr)
      throw Failure("cannot write the file " + settings.log + ": " + std::generic_category().message(errno));
    std::setvbuf(log_.get(), nullptr, _IOLBF, BUFSIZ);  // each line is there when something goes wrong
  }
  return [this](const std::string& line) {
    if (log_ != nullptr) std::fprintf(log_.get(), "%s\n", printable(line).c_str());
    if (settings.verbose) std::fprintf(stderr, "%s\n", printable(line).c_str());
  };
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
  options.share = settings.share;
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
