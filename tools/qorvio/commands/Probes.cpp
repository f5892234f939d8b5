// Adapters that are plugged in.
#include <cstdio>

#include "board/model/Errors.h"
#include "os/UsbDevices.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

struct Driver {
  const char* name;
  const char* vendor;   ///< empty: any
  const char* product;  ///< empty: any
  const char* text;     ///< that its own name has in it; empty: any
  const char* lines;    ///< of its configuration, after the driver's name
};

constexpr const char* ftdiLines =
    "ftdi channel 0\nftdi layout_init 0x0088 0x008b        ;# yours: the pins that switch the adapter's "
    "buffers on\n";

constexpr Driver drivers[] = {
    {"cmsis-dap", "", "", "CMSIS-DAP", ""},
    {"ftdi", "0403", "6010", "", ftdiLines},
    {"ftdi", "0403", "6011", "", ftdiLines},
    {"ftdi", "0403", "6014", "", ftdiLines},
};

struct Probe {
  os::UsbDevice device;
  const Driver* driver;
};

bool isDrivenBy(const Driver& driver, const os::UsbDevice& device) {
  const auto fits = [](const std::string& wanted, const std::string& is) {
    return wanted.empty() || wanted == is;
  };
  return fits(driver.vendor, device.vendor) && fits(driver.product, device.product) &&
         device.name.find(driver.text) != device.name.npos;
}

std::vector<Probe> probesIn(const std::string& folder) {
  std::vector<Probe> probes;
  for (const os::UsbDevice& device : os::usbDevices(folder)) {
    for (const Driver& driver : drivers) {
      if (!isDrivenBy(driver, device)) continue;
      probes.push_back({device, &driver});
      break;
    }
  }
  return probes;
}

Report listed(const std::vector<Probe>& probes) {
  Table table({"USB", "DRIVER", "NAME", "SERIAL"});
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  for (const auto& [device, driver] : probes) {
    table.add({device.vendor + ":" + device.product, driver->name, device.name, device.serial});
    json.push_back({{"vendor", device.vendor},
                    {"product", device.product},
                    {"driver", driver->name},
                    {"name", device.name},
                    {"serial", device.serial}});
  }
  return {table.text(), json};
}

// Serial numbers go into a Tcl program: only what is no Tcl.
bool isPlain(const std::string& text) {
  return !text.empty() &&
         text.find_first_not_of("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789-_.") ==
             text.npos;
}

std::string configuration(const Probe& probe) {
  const std::string name = probe.driver->name,
                    ids = "0x" + probe.device.vendor + " 0x" + probe.device.product;
  std::string text =
      "# A first OpenOCD configuration. What is marked \"yours\" is in the manual of the FPGA or of the\n"
      "# adapter.\nadapter driver " +
      name + "\n";
  text += (name == "ftdi" ? "ftdi vid_pid " : "cmsis_dap_vid_pid ") + ids + "\n" + probe.driver->lines;
  if (isPlain(probe.device.serial)) text += "adapter serial " + probe.device.serial + "\n";
  return text +
         "transport select jtag\nadapter speed 1000                    ;# kHz of TCK; more when doctor sees "
         "no flipped "
         "bits\n\n# From the device nearest to TDO to the one nearest to TDI.\n"
         "jtag newtap fpga tap -irlen 6         ;# yours: the length of the IR\n";
}

void probes(Context& context, const std::string& folder, bool isInit) {
  const std::vector<Probe> found = probesIn(folder);
  if (!isInit) return print(listed(found), context.settings.json);
  if (found.size() != 1)
    throw Failure("a configuration needs one adapter that this tool knows, plugged in are: " +
                  std::to_string(found.size()));
  std::printf("%s", configuration(found.front()).c_str());
}

}  // namespace

void addProbes(CLI::App& app, Context& context) {
  struct Options {
    std::string folder = os::usbFolder;
    bool isInit = false;
  };
  auto options = std::make_shared<Options>();
  CLI::App* command =
      app.add_subcommand("probes", "adapters that are plugged in, and how OpenOCD could drive them");
  command->add_flag("--init", options->isInit, "writes a first configuration for the one that is plugged in");
  command->add_option("--sysfs", options->folder, "where the system shows USB devices")
      ->type_name("FOLDER")
      ->capture_default_str();
  command->footer(
      "Known are CMSIS-DAP probes and adapters with an FT2232H, FT4232H or FT232H chip; OpenOCD drives "
      "more.\n\n"
      "Example:\n  qorvio probes --init > my.cfg\n  qorvio --cable 'openocd:?config=my.cfg' scan");
  command->callback([&context, options] { probes(context, options->folder, options->isInit); });
}

}  // namespace qor::tool
