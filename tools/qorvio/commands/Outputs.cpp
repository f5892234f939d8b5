// What outputs were given.
#include "os/Process.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

void outputs(Context& context, const std::vector<std::string>& names) {
  Table table({"NAME", "LAST GIVEN", "AT", "BY"});
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  for (const Signal& each : context.signals().select(names, Direction::output)) {
    const std::optional<Bytes> value = context.board().lastGiven(each);
    const std::optional<Gift> gift = context.board().core(each.core).lastGift(each);
    const std::string time = gift ? os::localTime(gift->at) : "";
    table.add({each.name, value ? shown(each, *value) : "unknown", time, gift ? gift->by : ""});
    json.push_back({{"name", each.name}, {"width", each.width()}, {"last_given", nullptr}});
    if (value) json.back()["last_given"] = hexText(*value, each.width());
    if (gift) json.back().update({{"at", time}, {"by", gift->by}});
  }
  print({table.text(), json}, context.settings.json);
}

}  // namespace

void addOutputs(CLI::App& app, Context& context) {
  auto names = std::make_shared<std::vector<std::string>>();
  CLI::App* command =
      app.add_subcommand("outputs", "what outputs were last given, as far as this tool knows");
  command->add_option("OUTPUT", *names, "outputs; without a name all of them");
  command->footer("Outputs cannot be read back.\n\nExample:\n  qorvio outputs");
  command->callback([&context, names] { outputs(context, *names); });
}

}  // namespace qor::tool
