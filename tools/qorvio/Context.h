// What the commands share: settings, and the board, core and names that they lead to, opened when first asked for.
#pragma once

#include <cstdio>
#include <memory>
#include <optional>
#include <string>

#include "board/Board.h"
#include "board/session/CountingCable.h"
#include "board/session/LoggingCable.h"
#include "os/Stop.h"
#include "tools/qorvio/Settings.h"

namespace qor::tool {

class Context {
 public:
  Settings settings;

  /// The cable's URL; without one the simulated demo board, and a remark on standard error.
  const std::string& cable();

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

  /// How the program is to end when nothing fails: 0, or 128 and the signal that ended a command before its time.
  /// @{
  int exitStatus() const { return exitStatus_; }
  void endBySignal(int signal) { exitStatus_ = signal == 0 ? 0 : 128 + signal; }
  /// @}

  /// A command that a signal ends before its time, however that shows: the program ends as that signal asks.
  class Stoppable : public os::Stop {
   public:
    explicit Stoppable(Context& context) : context_(context) {}
    Stoppable(const Stoppable&) = delete;
    Stoppable& operator=(const Stoppable&) = delete;
    ~Stoppable() { context_.endBySignal(signal()); }

   private:
    Context& context_;
  };

 private:
  LogFunction logFunction();

  std::unique_ptr<std::FILE, int (*)(std::FILE*)> log_{nullptr, std::fclose};
  Traffic* traffic_ = nullptr;
  std::unique_ptr<Link> link_;
  std::unique_ptr<Board> board_;
  std::optional<SignalTable> file_;
  int exitStatus_ = 0;
};

}  // namespace qor::tool
