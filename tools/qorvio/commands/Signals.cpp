#include <cstdio>
#include <optional>
#include <system_error>

#include <nlohmann/json.hpp>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/model/NetlistSignals.h"
#include "os/Files.h"
#include "os/Program.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/Stubs.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

nlohmann::ordered_json jsonOf(const Signal& signal) {
  nlohmann::ordered_json names = nlohmann::ordered_json::object();
  for (const auto& [name, value] : signal.names) names[name] = value;
  const nlohmann::ordered_json scale = signal.scale != 0 ? nlohmann::ordered_json(signal.scale) : nullptr;
  return {{"name", signal.name},
          {"port", portName(signal.port)},
          {"width", signal.width()},
          {"bits", std::vector<unsigned>(signal.bits.rbegin(), signal.bits.rend())},
          {"radix", radixName(signal.radix)},
          {"enum", names},
          {"scale", scale},
          {"unit", signal.unit},
          {"description", signal.description}};
}

Report listed(const std::vector<Signal>& signals) {
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  Table table({"NAME", "PORT", "WIDTH", "BITS", "RADIX", "DESCRIPTION"});
  for (const Signal& each : signals) {
    json.push_back(jsonOf(each));
    table.add({each.name, portName(each.port), std::to_string(each.width()), bitsText(each.bits),
               radixName(each.radix), each.description});
  }
  return {table.text(), json};
}

std::string coresOf(Context& context) {
  std::string text = refText(context.coreRef());
  for (std::size_t i = 1; i < context.file().cores().size(); ++i)
    text += ", " + refText(context.file().cores()[i]);
  return text;
}

void check(Context& context) {
  if (context.settings.signals.empty()) throw WrongUse("no signals file to check: use --signals FILE");
  std::vector<QORVIO_CORE_INFO> infos{readInfo(context.link(), context.coreRef())};
  for (std::size_t i = 1; i < context.file().cores().size(); ++i)
    infos.push_back(readInfo(context.link(), context.file().cores()[i]));
  const std::string cores = coresOf(context);
  const std::vector<std::string> wrong = signalsOutsideCore(context.file(), infos);
  Report report{{}, {{"signals", context.file().fileSignals()}, {"outside", wrong}}};
  for (const std::string& each : wrong) report.text += printable(each) + "\n";
  if (wrong.empty() && !context.settings.quiet)
    report.text = counted(context.file().fileSignals(), "signal") + ", all fit core " + cores + "\n";
  print(report, context.settings.json);
  if (!wrong.empty())
    throw WrongUse("signals do not fit core " + cores + ": " + std::to_string(wrong.size()) + " of " +
                   std::to_string(context.file().fileSignals()));
}

struct FromOptions {
  std::vector<std::string> files;
  NetlistPlace place;
};

constexpr std::size_t largestNetlist = std::size_t{1} << 30;

std::string readNetlist(const std::string& file) {
  try {
    return os::readFile(file, largestNetlist);
  } catch (const std::system_error& error) {
    throw WrongUse(error.what());
  }
}

// The netlist of Verilog files, by yosys.
std::string netlistOf(const std::vector<std::string>& files) {
  const os::TemporaryFolder folder;
  const std::string netlist = folder.path() + "/netlist.json";
  std::vector<std::string> words{"yosys", "-q", "-f", "verilog", "-p", "proc", "-o", netlist};
  words.insert(words.end(), files.begin(), files.end());
  int status = 0;
  try {
    status = os::runProgram(words);
  } catch (const std::system_error& error) {
    throw Failure(std::string(error.what()) +
                  ": it reads Verilog; a netlist of write_json can be given instead");
  }
  if (status != 0) throw WrongUse("yosys cannot read the Verilog, see above: " + files.front());
  return os::readFile(netlist, largestNetlist);
}

void from(Context& context, const FromOptions& options) {
  const std::string& first = options.files.front();
  const bool isNetlist = first.size() > 5 && first.substr(first.size() - 5) == ".json";
  for (const std::string& each : options.files)
    if (!each.empty() && each[0] == '-') throw WrongUse("not a file name: " + each);
  const std::string netlist = isNetlist ? readNetlist(first) : netlistOf(options.files);
  std::optional<QOR_CORE_REF> core;
  if (!context.settings.core.empty()) core = parseRef(context.settings.core);
  std::printf("%s", signalFileText(core, netlistSignals(netlist, first, options.place)).c_str());
}

void addFrom(CLI::App& command, Context& context) {
  auto options = std::make_shared<FromOptions>();
  CLI::App* derive =
      command.add_subcommand("from", "writes a signals file with the names that a design uses");
  derive
      ->add_option("FILE", options->files, "Verilog files, for which yosys is needed, or its netlist, .json")
      ->required();
  derive
      ->add_option("--instance", options->place.instance,
                   "which instance of qor_vio, where there are several")
      ->type_name("NAME");
  derive->add_option("--module", options->place.module, "the ports of that module instead")
      ->type_name("NAME");
  derive->footer(
      "The names are those of the nets that the qor_vio instance is connected to; in a design without one, "
      "those of a "
      "module's\nports: its outputs are inputs of the core. Opens no cable.\n\n"
      "Example:\n  qorvio --core 0.1.0 signals from top.v > lab.toml");
  derive->callback([&context, options] { from(context, *options); });
}

void addStubs(CLI::App& command) {
  auto file = std::make_shared<std::string>();
  CLI::App* stubs =
      command.add_subcommand("stubs", "writes types of the names of a signals file, for Python editors");
  stubs->add_option("FILE", *file, "the signals file; needs no board")->required();
  stubs->footer("Example:\n  qorvio signals stubs bench.toml > bench.pyi");
  stubs->callback([file] { std::printf("%s", stubsOf(readSignalFile(*file)).c_str()); });
}

}  // namespace

void addSignals(CLI::App& app, Context& context) {
  CLI::App* command = app.add_subcommand("signals", "the names known, their port, width and bits");
  command->footer(
      "Example:\n  qorvio signals init > bench.toml\n  qorvio --signals bench.toml signals check");
  command->require_subcommand(0, 1);
  auto namesOnly = std::make_shared<bool>(false);
  command->add_flag("--names", *namesOnly, "the names alone, one per line");
  command->add_subcommand("check", "checks the signals file against the core")
      ->footer("Example:\n  qorvio --signals bench.toml signals check")
      ->callback([&context] { check(context); });
  command->add_subcommand("init", "writes a first signals file for the core")
      ->footer("Example:\n  qorvio signals init > bench.toml")
      ->callback([&context] {
        std::printf("%s", firstSignalFile(context.core().ref(), context.core().info()).c_str());
      });
  addStubs(*command);
  addFrom(*command, context);
  command->callback([&context, command, namesOnly] {
    if (!command->get_subcommands().empty()) return;
    const std::vector<Signal>& signals = context.signals().signals();
    if (!*namesOnly) return print(listed(signals), context.settings.json);
    for (const Signal& each : signals) std::printf("%s\n", printable(each.name).c_str());
  });
}

}  // namespace qor::tool
