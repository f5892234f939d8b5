// wait and expect: conditions on inputs.
#include <chrono>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

constexpr const char* language =
    "A condition is NAME == VALUE, or with != < > <= >=; NAME alone (not 0); NAME rises, falls or moves; "
    "joined by &, |,\n"
    "! and parentheses. Values are written as for write.\n\n";

struct WaitOptions {
  std::vector<std::string> conditions;
  std::string timeout = "10s";
};

Condition allOf(const Board& board, const std::vector<std::string>& texts) {
  Condition all = board.condition(texts.front());
  for (std::size_t i = 1; i < texts.size(); ++i) all = all && board.condition(texts[i]);
  return all;
}

void wait(Context& context, const WaitOptions& options) {
  const std::chrono::nanoseconds timeout = parseDuration(options.timeout);
  Board& board = context.board();
  const Condition condition = allOf(board, options.conditions);
  const Context::Stoppable stop(context);
  const auto begin = std::chrono::steady_clock::now();
  board.waitFor(condition, timeout);
  board.markSeen(condition.signals());
  const double seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
  if (context.settings.json) print({{}, {{"condition", condition.text()}, {"after_s", seconds}}}, true);
}

}  // namespace

void addWait(CLI::App& app, Context& context) {
  auto options = std::make_shared<WaitOptions>();
  CLI::App* command = app.add_subcommand("wait", "waits until conditions on inputs are all true");
  command
      ->add_option("CONDITION", options->conditions, "such as 'state == RUN', 'fault rises' or 'level > 3 V'")
      ->required();
  command->add_option("--timeout", options->timeout, "how long at most")
      ->type_name("TIME")
      ->capture_default_str();
  command->footer(std::string(language) +
                  "Exit status 1 when the time is over; the message says what was seen last.\n\n"
                  "Example:\n  qorvio wait 'async_in_data == 0' '!sync_in_data[3]' --timeout 2s");
  command->callback([&context, options] { wait(context, *options); });
}

void addExpect(CLI::App& app, Context& context) {
  auto conditions = std::make_shared<std::vector<std::string>>();
  CLI::App* command = app.add_subcommand("expect", "fails unless conditions on inputs are all true, now");
  command
      ->add_option("CONDITION", *conditions, "such as 'state == RUN'; activity counts since the poll before")
      ->required();
  command->footer(std::string(language) + "Example:\n  qorvio expect 'async_in_data == 0'");
  command->callback([&context, conditions] {
    const Condition condition = allOf(context.board(), *conditions);
    try {
      context.board().waitFor(condition, std::chrono::nanoseconds(0));
      context.board().markSeen(condition.signals());
    } catch (const Timeout& error) {
      throw Failure("not true: " +
                    std::string(error.what()).substr(std::string(error.what()).find(": ") + 2));
    }
  });
}

}  // namespace qor::tool
