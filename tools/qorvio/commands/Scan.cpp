#include <cstdio>

#include <nlohmann/json.hpp>

#include "board/model/CoreAddress.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

using json = nlohmann::ordered_json;

std::string idcodeOf(const QorRT::Qor_Device& device) {
  return device.idcode == 0 ? "none" : QorRT::idcodeText(device.idcode);
}

json jsonOf(const FoundCore& core) {
  json entry{{"core", refText(core.ref)}};
  for (const QorRT::QorVIO_CoreField& field : QorRT::QorVIO_coreFields) {
    if (!core.isVio() && !field.isGeneric) break;
    entry[field.name] = core.info.*field.member;
  }
  return entry;
}

json jsonOf(const std::vector<QorRT::Qor_Device>& devices, const std::vector<FoundCore>& cores) {
  json chain = json::array();
  for (unsigned device = 0; device < devices.size(); ++device) {
    json found = json::array();
    for (const FoundCore& core : cores)
      if (core.ref.device_index == device) found.push_back(jsonOf(core));
    chain.push_back({{"device", device},
                     {"idcode", idcodeOf(devices[device])},
                     {"name", devices[device].name},
                     {"ir_length", devices[device].irLength},
                     {"cores", found}});
  }
  return {{"devices", chain}};
}

std::vector<Cell> row(const FoundCore& core) {
  const QORVIO_CORE_INFO& info = core.info;
  const auto number = [&](unsigned width) { return core.isVio() ? std::to_string(width) : "-"; };
  return {refText(core.ref),
          core.isVio() ? "VIO" : "type " + std::to_string(info.core_type),
          std::to_string(info.core_major_version) + "." + std::to_string(info.core_minor_version),
          number(info.async_output_count),
          number(info.sync_output_count),
          number(info.async_input_count),
          number(info.sync_input_count)};
}

std::string tablesOf(const std::vector<QorRT::Qor_Device>& devices, const std::vector<FoundCore>& cores) {
  Table chain({"DEVICE", "IDCODE", "NAME", "IR"});
  for (unsigned device = 0; device < devices.size(); ++device) {
    chain.add({std::to_string(device), idcodeOf(devices[device]),
               devices[device].name.empty() ? "-" : devices[device].name,
               std::to_string(devices[device].irLength)});
  }
  Table found({"CORE", "TYPE", "VERSION", "ASYNC OUT", "SYNC OUT", "ASYNC IN", "SYNC IN"});
  for (const FoundCore& core : cores) found.add(row(core));
  return chain.text() + "\n" + found.text();
}

}  // namespace

void addScan(CLI::App& app, Context& context) {
  CLI::App* command = app.add_subcommand("scan", "the chain: devices, and every core of every user chain");
  command->footer("Example:\n  qorvio --cable sim: scan");
  command->callback([&context] {
    const std::vector<QorRT::Qor_Device> devices = context.link().devices();
    const std::vector<FoundCore> cores = findCores(context.link());
    print({tablesOf(devices, cores), jsonOf(devices, cores)}, context.settings.json);
    for (const CoreFoundTwice& each : coresFoundTwice(context.link(), cores))
      std::fprintf(stderr, "qorvio: %s, see qorvio doctor\n", foundTwiceText(each).c_str());
  });
}

}  // namespace qor::tool
