// What the commands share: settings, and the board, core and names behind them, opened when first asked for.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "board/model/SignalTable.h"
#include "board/session/CoreSession.h"
#include "board/session/CountingCable.h"
#include "board/session/Link.h"

namespace qor::tool {

/// From the command line, else the environment (QORVIO_CABLE, QORVIO_CORE, QORVIO_SIGNALS), else qorvio.toml in the
/// working folder.
struct Settings {
  std::string cable;
  std::string core;
  std::string signals;
  bool json = false;
  bool quiet = false;

  /// Fills what the command line left empty. Throws WrongUse for a malformed qorvio.toml.
  void complete();
};

class Context {
 public:
  Settings settings;

  Link& link();

  /// Has the cable's traffic counted, from its opening on. `traffic` outlives the context.
  void countTraffic(Traffic& traffic) { traffic_ = &traffic; }

  /// The core that was named, or that the signals file names, or the first VIO core. Set up.
  CoreSession& core();

  /// Where core() will be, without setting it up.
  QOR_CORE_REF coreRef();

  /// The signals file, empty without one. Needs no board.
  const SignalTable& file();

  /// The signals file with the whole ports of the core.
  const SignalTable& signals();

 private:
  Traffic* traffic_ = nullptr;
  std::unique_ptr<Link> link_;
  std::unique_ptr<CoreSession> core_;
  std::optional<SignalTable> file_;
  std::optional<SignalTable> signals_;
};

}  // namespace qor::tool
