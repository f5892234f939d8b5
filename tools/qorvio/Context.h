// What the commands share: settings, and the board, core and names behind them, opened when first asked for.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "board/Board.h"
#include "board/session/CountingCable.h"

namespace qor::tool {

/// From the command line, else the environment (QORVIO_CABLE, QORVIO_CORE, QORVIO_SIGNALS), else qorvio.toml in the
/// working folder.
struct Settings {
  std::string cable;
  std::string core;
  std::string signals;
  bool forceCore = false;  ///< --core counts though the signals file is for another one
  bool json = false;
  bool quiet = false;

  /// Fills what the command line left empty. Throws WrongUse for a malformed qorvio.toml.
  void complete();
};

class Context {
 public:
  Settings settings;

  /// The session with the board, without setting up a core.
  Link& link();

  /// Has the cable's traffic counted, from its opening on. `traffic` outlives the context.
  void countTraffic(Traffic& traffic) { traffic_ = &traffic; }

  /// The board: the core that was named, or those of the signals file, or the first VIO core. Set up.
  Board& board();

  /// Its first core.
  Core& core() { return board().core(); }

  /// Where core() will be, without setting it up.
  QOR_CORE_REF coreRef();

  /// The signals file, empty without one. Needs no board.
  const SignalTable& file();

  /// The signals file with the whole ports of the cores.
  const SignalTable& signals() { return board().signals(); }

 private:
  Traffic* traffic_ = nullptr;
  std::unique_ptr<Link> link_;
  std::unique_ptr<Board> board_;
  std::optional<SignalTable> file_;
};

}  // namespace qor::tool
