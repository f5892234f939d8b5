#include <cstdio>

#include "tools/qorvio/InputJson.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Arrow.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

struct ReadOptions {
  std::vector<std::string> names;
  std::string radix;
};

Report reportOf(const std::vector<Signal>& signals, const std::vector<Sample>& samples, const Radix* radix) {
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  Table table({"NAME", "VALUE", "ACTIVITY", "SYNC"});
  Bytes value;
  for (const Signal& each : signals) {
    const Sample& sample = samples[each.core];
    extract(each, sample.values(each.port), value);
    const Activity activity = activityOf(each, sample);
    const bool moved = activity.up || activity.down;
    table.add({each.name, shown(each, value, radix),
               Cell(arrow(activity.up, activity.down), moved ? Color::green : Color::dim),
               each.port == Port::syncIn ? arrow(activity.syncUp, activity.syncDown) : ""});
    json.push_back(jsonOf(each, sample, radix));
  }
  return {table.text(), json};
}

void read(Context& context, const ReadOptions& options) {
  Radix radix{};
  if (!options.radix.empty()) radix = radixNamed(options.radix);
  const std::vector<Signal> signals = context.signals().select(options.names, Direction::input);
  const Frame frame = context.board().read(signals);
  print(reportOf(signals, frame.samples(), options.radix.empty() ? nullptr : &radix), context.settings.json);
}

}  // namespace

void addRead(CLI::App& app, Context& context) {
  auto options = std::make_shared<ReadOptions>();
  CLI::App* command =
      app.add_subcommand("read", "values of inputs, and what they did since they were last asked for");
  command->add_option("INPUT", options->names,
                      "inputs; without a name all of them. NAME[7:4] is a part of one");
  command->add_option("--radix", options->radix, "instead of the radix that the signals file gives")
      ->type_name("hex|bin|dec|signed");
  command->footer("Example:\n  qorvio --core 1.1.0 read --radix dec async_in_data sync_in_data[3:0]");
  command->callback([&context, options] { read(context, *options); });
}

}  // namespace qor::tool
