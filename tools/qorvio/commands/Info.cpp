#include <cstdio>

#include <nlohmann/json.hpp>

#include "board/model/CoreAddress.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

Report reportOf(const QORVIO_CORE_INFO& info, QOR_CORE_REF ref) {
  nlohmann::ordered_json json{{"core", refText(ref)}};
  Table table({"FIELD", refText(ref)});
  for (const QorRT::QorVIO_CoreField& field : QorRT::QorVIO_coreFields) {
    json[field.name] = info.*field.member;
    table.add({field.name, std::to_string(info.*field.member)});
  }
  return {table.text(), json};
}

}  // namespace

void addInfo(CLI::App& app, Context& context) {
  CLI::App* command = app.add_subcommand("info", "what a core says of itself: versions and port widths");
  command->footer("Example:\n  qorvio --core 1.1.0 info");
  command->callback([&context] {
    const QOR_CORE_REF ref = context.coreRef();
    print(reportOf(readInfo(context.link(), ref), ref), context.settings.json);
  });
}

}  // namespace qor::tool
