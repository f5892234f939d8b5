#include "tools/qorvio/Settings.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <system_error>

#include "board/model/Errors.h"
#include "board/model/TomlPlace.h"
#include "os/Files.h"

namespace qor::tool {
namespace {

namespace fs = std::filesystem;

void fill(std::string& value, const std::string& name, const std::string& text) {
  if (text.empty()) throw WrongUse("must not be empty: " + name);
  value = text;
}

void fillFromEnvironment(std::string& value, const char* variable) {
  const char* const text = std::getenv(variable);
  if (value.empty() && text != nullptr) fill(value, variable, text);
}

// Empty when there is none.
fs::path nearestFile() {
  std::error_code failed;
  fs::path name = "qorvio.toml";
  if (fs::exists(name, failed)) return name;
  for (fs::path folder = fs::current_path(failed); folder.has_relative_path();) {
    folder = folder.parent_path();
    if (fs::exists(folder / name, failed)) return folder / name;
  }
  return {};
}

void requireTrust(const std::string& settingsFile, const std::string& named) {
  std::error_code failed;
  if (!fs::exists(named, failed)) return;  // whoever opens it says so
  const std::string reason = os::distrust(named);
  if (!reason.empty())
    throw WrongUse(settingsFile + " is not used, because it could start programs of others: " + reason);
}

// As the cable reads it: %26 is &.
std::string percentDecoded(const std::string& text) {
  std::string decoded;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const std::string digits = text[i] == '%' ? text.substr(i + 1, 2) : "";
    const bool isCode =
        digits.size() == 2 && digits.find_first_not_of("0123456789abcdefABCDEF") == digits.npos;
    decoded += isCode ? static_cast<char>(std::stoi(digits, nullptr, 16)) : text[i];
    if (isCode) i += 2;
  }
  return decoded;
}

using Edit = std::function<std::string(const std::string& file)>;

// The URL with each of the files that it names replaced.
std::string withFiles(const std::string& url, const Edit& edit) {
  const std::string simulated = "sim:";
  if (url.rfind(simulated, 0) == 0)
    return url.size() == simulated.size() ? url : simulated + edit(url.substr(simulated.size()));
  std::string text;
  for (std::size_t begin = 0; begin < url.size();) {
    const std::size_t end = std::min(url.find_first_of("?&", begin), url.size() - 1) + 1;
    const std::string part = url.substr(begin, end - begin);
    const bool namesFile = part.rfind("config=", 0) == 0 || part.rfind("board=", 0) == 0;
    const std::size_t value = namesFile ? part.find('=') + 1 : part.size();
    const std::size_t valueEnd = part.size() - (part.back() == '&' || part.back() == '?' ? 1 : 0);
    text += namesFile
                ? part.substr(0, value) + edit(part.substr(value, valueEnd - value)) + part.substr(valueEnd)
                : part;
    begin = end;
  }
  return text;
}

// A qorvio.toml and what is in it. Names in it are relative to its folder.
class SettingsFile {
 public:
  explicit SettingsFile(const fs::path& path) : path_(path.string()), folder_(path.parent_path()) {
    requireTrust(path_, path_);
    table_ = readToml(path_);
  }

  void fill(Settings& settings) const {
    const TomlPlace root(path_, table_, "");
    root.requireKeys({"cable", "core", "signals"});
    const auto take = [&](std::string& value, const char* key, const Edit& edit) {
      if (root.has(key) && value.empty()) value = edit(root.at(key).text());
    };
    take(settings.cable, "cable", [this](const std::string& url) {
      return withFiles(url, [this](const std::string& file) { return trusted(file, percentEncoded()); });
    });
    take(settings.core, "core", [](const std::string& text) { return text; });
    take(settings.signals, "signals",
         [this](const std::string& file) { return trusted(file, folder_.string()); });
  }

 private:
  std::string trusted(const std::string& file, const std::string& folder) const {
    requireTrust(path_, folder_ / file);
    requireTrust(path_, folder_ / percentDecoded(file));
    return folder.empty() || fs::path(file).is_absolute() ? file : folder + "/" + file;
  }

  std::string percentEncoded() const {
    std::string text;
    for (const char letter : folder_.string())
      text += letter == '&' ? "%26" : letter == '%' ? "%25" : std::string(1, letter);
    return text;
  }

  std::string path_;
  fs::path folder_;
  toml::table table_;
};

}  // namespace

void Settings::addOptions(CLI::App& app) {
  const auto add = [&app](const std::string& name, std::string& value, const char* help) {
    return app.add_option_function<std::string>(
        name, [name, &value](const std::string& text) { qor::tool::fill(value, name, text); }, help);
  };
  add("--cable", cable,
      "the board: sim:, sim:BOARD.toml, rbb:HOST:PORT, openocd:HOST:PORT or openocd:?config=FILE "
      "(QORVIO_CABLE)")
      ->type_name("URL");
  add("--core", core, "the core; without it that of the signals file, or the first VIO core (QORVIO_CORE)")
      ->type_name("DEVICE.CHAIN.INDEX");
  add("--signals", signals, "names for its bits (QORVIO_SIGNALS)")->type_name("FILE");
  app.add_flag("--force-core", forceCore, "use --core though the signals file is for another core");
  app.add_flag("--share", share,
               "read a core though another program does: both miss activity that the other one took");
  app.add_option("--log", log,
                 "writes down each exchange with the board: time, scans, bits, the server's warnings")
      ->type_name("FILE");
  app.add_flag("-v,--verbose", verbose, "the same on standard error");
  app.add_flag("--json", json, "results as JSON");
  app.add_flag("--quiet", quiet, "no progress, no remarks");
}

void Settings::complete() {
  fillFromEnvironment(cable, "QORVIO_CABLE");
  fillFromEnvironment(core, "QORVIO_CORE");
  fillFromEnvironment(signals, "QORVIO_SIGNALS");
  const fs::path file = nearestFile();
  if (!file.empty()) SettingsFile(file).fill(*this);
}

}  // namespace qor::tool
