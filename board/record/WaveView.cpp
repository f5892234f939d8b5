#include "board/record/WaveView.h"

#include <filesystem>

#include "board/model/Errors.h"
#include "board/model/Value.h"
#include "board/record/OutputFile.h"
#include "board/record/Writers.h"

namespace qor {
namespace {

constexpr unsigned widestScaled = 12;

// "HEX text" lines; empty when the viewer shows the values well enough.
std::string labelsOf(const Signal& signal) {
  std::string text;
  Bytes value(byteCount(signal.width()));
  const auto add = [&](std::uint64_t number) {
    for (std::size_t i = 0; i < value.size(); ++i)
      value[i] = static_cast<unsigned char>(i < sizeof number ? number >> 8 * i : 0);
    text += hexText(value, signal.width()) + " " + shown(signal, value) + "\n";
  };
  const bool isScaled = signal.scale != 0 && signal.width() <= widestScaled;
  for (std::uint64_t number = 0; isScaled && number < std::uint64_t{1} << signal.width(); ++number)
    add(number);
  for (const auto& [name, number] : signal.names)
    if (!isScaled) add(number);
  return text;
}

void write(const std::string& path, const std::string& text) {
  OutputFile file(path);
  file.text() = text;
  file.close();
}

// Flags of the save file: how a trace is shown.
const char* flagsOf(const Signal& signal, bool isTranslated) {
  if (isTranslated) return "@2022\n";  // by its translate file, from hexadecimal digits, to the right
  switch (signal.radix) {
    case Radix::bin:
      return "@28\n";
    case Radix::dec:
      return "@24\n";
    case Radix::signedDec:
      return "@420\n";
    case Radix::hex:
      break;
  }
  return "@22\n";
}

}  // namespace

std::string writeWaveView(const std::string& vcdPath, const std::vector<Signal>& signals,
                          const std::vector<QOR_CORE_REF>& cores) {
  const std::filesystem::path dump(vcdPath);
  if (dump.extension() != ".vcd") throw WrongUse("a wave viewer's files belong to a .vcd file: " + vcdPath);
  std::string save = "[dumpfile] \"" + std::filesystem::absolute(dump).string() + "\"\n";
  for (const Signal& each : signals) {
    const std::string labels = labelsOf(each), name = vcdName(each.name);
    const std::filesystem::path file =
        std::filesystem::path(dump).replace_extension("." + vcdScope(cores[each.core]) + "." + name + ".txt");
    if (!labels.empty()) write(file.string(), labels);
    save += flagsOf(each, !labels.empty());
    if (!labels.empty()) save += "^1 " + std::filesystem::absolute(file).string() + "\n";
    save += vcdScope(cores[each.core]) + "." + name;
    save += each.width() == 1 ? "\n" : "[" + std::to_string(each.width() - 1) + ":0]\n";
  }
  std::string path = std::filesystem::path(dump).replace_extension(".gtkw").string();
  write(path, save);
  return path;
}

}  // namespace qor
