// Whole ports as raw bits.
#include <cstdio>

#include <nlohmann/json.hpp>

#include "board/model/Errors.h"
#include "tools/qorvio/Assignments.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

struct SetOptions {
  std::string port;
  std::string value;
  std::string mask;
};

Signal wholePort(const QORVIO_CORE_INFO& info, const std::string& name, Direction direction) {
  SignalTable ports;
  ports.addWholePorts(info);
  for (const Signal& each : ports.signals())
    if (name == portName(each.port) && isInput(each.port) == (direction == Direction::input)) return each;
  throw WrongUse(std::string("not an ") + (direction == Direction::input ? "input" : "output") +
                 " port of this core: " + name);
}

// The bits of the port that the mask lets through.
Assignment masked(const Signal& port, const Bytes& value, const Bytes& mask) {
  Signal chosen{port.name, port.port};
  Bytes bits;
  for (unsigned bit = 0; bit < port.width(); ++bit) {
    if (bitAt(mask.data(), bit) == 0) continue;
    if (chosen.width() % 8 == 0) bits.push_back(0);
    setBit(bits, chosen.width(), bitAt(value.data(), bit));
    chosen.bits.push_back(bit);
  }
  return level(chosen, bits);
}

void set(Context& context, const SetOptions& options) {
  const Signal port = wholePort(context.core().info(), options.port, Direction::output);
  const Bytes value = parseValue(port, options.value);
  if (options.mask.empty()) {
    context.board().give({level(port, value)});
  } else {
    context.board().give({masked(port, value, parseValue(port, options.mask))});
  }
}

void get(Context& context, const std::string& name) {
  const QORVIO_CORE_INFO& info = context.core().info();
  std::vector<Signal> ports;
  if (!name.empty()) ports.push_back(wholePort(info, name, Direction::input));
  SignalTable all;
  all.addWholePorts(info);
  if (name.empty()) ports = all.select({}, Direction::input);
  const Sample sample = context.board().read(ports).samples().front();
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  Table table({"PORT", "WIDTH", "VALUE", "UP", "DOWN", "SYNC UP", "SYNC DOWN"});
  for (const Signal& port : ports) {
    const auto digits = [&](const Bytes& bits) { return hexText(bits, port.width()); };
    const bool isSynchronous = port.port == Port::syncIn;
    const std::string value = digits(sample.values(port.port)), up = digits(sample.up(port.port)),
                      down = digits(sample.down(port.port));
    const std::string syncUp = isSynchronous ? digits(sample.syncSyncUp) : "",
                      syncDown = isSynchronous ? digits(sample.syncSyncDown) : "";
    table.add({portName(port.port), std::to_string(port.width()), value, up, down, syncUp, syncDown});
    json.push_back({{"port", portName(port.port)},
                    {"width", port.width()},
                    {"value", value},
                    {"activity_up", up},
                    {"activity_down", down}});
    if (isSynchronous) json.back().update({{"sync_activity_up", syncUp}, {"sync_activity_down", syncDown}});
  }
  print({table.text(), json}, context.settings.json);
}

}  // namespace

void addPort(CLI::App& app, Context& context) {
  CLI::App* command = app.add_subcommand("port", "whole ports as raw bits");
  command->footer("Example:\n  qorvio port get\n  qorvio port set async_out 5A --mask F0");
  command->require_subcommand(1);
  auto name = std::make_shared<std::string>();
  CLI::App* getCommand = command->add_subcommand("get", "values and activity flags of the input ports");
  getCommand->add_option("PORT", *name, "the port; without a name both")->type_name("async_in|sync_in");
  getCommand->footer("Example:\n  qorvio port get sync_in");
  getCommand->callback([&context, name] { get(context, *name); });
  auto options = std::make_shared<SetOptions>();
  CLI::App* setCommand =
      command->add_subcommand("set", "an output port; with a mask, only the bits that it has set");
  setCommand->add_option("PORT", options->port, "the port")->type_name("async_out|sync_out")->required();
  setCommand->add_option("VALUE", options->value, "hexadecimal, or with 0x, 0b, 0d")->required();
  setCommand->add_option("--mask", options->mask, "the bits to drive; the others keep what they have");
  setCommand->footer("Example:\n  qorvio port set async_out 5A --mask F0");
  setCommand->callback([&context, options] { set(context, *options); });
}

}  // namespace qor::tool
