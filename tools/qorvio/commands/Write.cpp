#include <chrono>

#include "board/model/Condition.h"
#include "tools/qorvio/Assignments.h"
#include "tools/qorvio/commands/Commands.h"

namespace qor::tool {
namespace {

// Reads the inputs of the same names, for a design that loops its outputs back, until they are alike.
void verify(Board& board, const std::vector<Assignment>& assignments) {
  constexpr std::chrono::milliseconds enough(500);  // for a slow clock of the design
  for (const Assignment& each : assignments) {
    const Signal input = board.signals().find(each.signal.name, Direction::input);
    board.waitFor(Condition::compare(input, Relation::equal, Value(each.steps.back())), enough);
  }
}

}  // namespace

void addWrite(CLI::App& app, Context& context) {
  auto texts = std::make_shared<std::vector<std::string>>();
  CLI::App* command = app.add_subcommand("write", "values for outputs, all in one exchange");
  command
      ->add_option("OUTPUT=VALUE", *texts, "digits in the signal's radix, 0x, 0b, 0d, or an enumerated name")
      ->required();
  auto isVerified = std::make_shared<bool>(false);
  command->add_flag("--verify", *isVerified, "fails unless the inputs of the same names then read the same");
  command->footer(
      "NAME.pulsetrain=V0,V1,... plays up to 16 values, one per clock of the design; the last one stays.\n\n"
      "Example:\n  qorvio write async_out_data=5A sync_out_data[2].pulsetrain=0,1,0");
  command->callback([&context, texts, isVerified] {
    std::vector<Drive> drives;
    for (const std::string& text : *texts) drives.push_back(parseDrive(text));
    const std::vector<Assignment> assignments = assignmentsOf(drives, context.signals());
    context.board().give(assignments);
    context.board().rememberOutputs();
    if (*isVerified) verify(context.board(), assignments);
    printWritten(context, assignments);
  });
}

}  // namespace qor::tool
