// Checks from the cable up, each with what was seen and what to try next.
#include <algorithm>
#include <cstdio>
#include <functional>
#include <optional>

#include <nlohmann/json.hpp>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "os/Stop.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

struct Check {
  const char* name;
  const char* next;                  // what to try when it fails
  std::function<std::string()> run;  // returns what was seen, or throws what is wrong
};

/// What to try for a failure that says what it is.
struct Cure {
  const char* seen;
  const char* next;
};

constexpr Cure cures[] = {
    {"no debug hub",
     "is the design with the core loaded, and its hub on a user register? Without a board file the opcodes "
     "of USER1 "
     "to USER4 are taken to be 0x02 to 0x05. For others add ?board=FILE to the cable; in it one [[device]] "
     "for each, "
     "the one nearest to TDO first, and for this one the line user_opcodes = [0x02, 0x03]"},
    {"did not answer the frame",
     "does TDI reach the hub? If it is late there, and other devices are before it: LATE_TDI of the wrapper. "
     "If only "
     "writes fail so: the widths of the status word are not those of the core"},
    {"CRC of the answer does not hold",
     "the widths of the status word are not those of the core (below version 6.2 at most 255 bits a port), "
     "or the line "
     "is noisy: a slower TCK, shorter wires"},
    {"design clock stopped", "the clock of the core, clk, does not run, or is very slow"},
    {"two cores have this index", "give each core of the hub an INDEX of its own"},
    {"are the same core",
     "compare user_opcodes and ir_length in the board file with the data sheet of the device: its hub "
     "answers at both "
     "addresses"},
    {"were last given is not known", "give them values by qorvio write first, or --force"},
};

const char* nextFor(const std::string& seen, const Check& check) {
  for (const Cure& cure : cures)
    if (seen.find(cure.seen) != std::string::npos) return cure.next;
  return check.next;
}

std::string idcodes(const std::vector<QorRT::Qor_Device>& devices) {
  std::string text;
  for (const QorRT::Qor_Device& each : devices) {
    // Bit 0 of an IDCODE is always 1: it differs from a BYPASS register.
    if (each.idcode != 0 && (each.idcode & 1) == 0)
      throw Failure("bit 0 is not 1: " + QorRT::idcodeText(each.idcode));
    if (each.idcode == 0xFFFFFFFF) throw Failure("TDO is stuck at 1: FFFFFFFF");
    text += (text.empty() ? "" : ", ") + (each.idcode != 0 ? QorRT::idcodeText(each.idcode) : "none");
  }
  return text;
}

// The first 16 bits that a user register delivers. A hub's are a 1, two TCKs late at most, and zeros.
unsigned helloBehind(QorRT::Qor_Cable& cable, unsigned device, unsigned userChain) {
  cable.scanIr(device, userChain);
  const std::size_t scan = cable.scanDr(device, Bytes(4, 0xFF), 32, true);
  const Bytes& bits = cable.captured(scan);
  return bits[0] | static_cast<unsigned>(bits[1]) << 8;
}

std::string hubs(QorRT::Qor_Cable& cable) {
  std::string found, seen;
  for (unsigned device = 0; device < cable.devices().size(); ++device) {
    for (unsigned chain = 1; chain <= QorRT::Qor_Cable::userChainCount; ++chain) {
      const unsigned hello = helloBehind(cable, device, chain);
      const std::string place = std::to_string(device) + "." + std::to_string(chain);
      const bool isHub = hello == 1 || hello == 2 || hello == 4;
      if (isHub) found += (found.empty() ? "" : ", ") + place;
      if (!isHub && hello != 0) seen += ", " + place + " delivers " + QorRT::idcodeText(hello).substr(4);
    }
  }
  if (found.empty())
    throw Failure("no debug hub at any user register" + (seen.empty() ? ": all zeros" : seen));
  return "hubs at " + found + seen;
}

QorJtag_Statistics statisticsOf(const Link& link) {
  QorJtag_Statistics statistics;
  QorJtag_session_getStatistics(link.session(), statistics);
  return statistics;
}

std::string lateBy(const char* line, unsigned tcks) {
  return tcks == 0 ? "" : std::string(", ") + line + " " + counted(tcks, "TCK") + " late";
}

std::string cores(Link& link) {
  const std::vector<FoundCore> all = findCores(link);
  if (const auto twice = coresFoundTwice(link, all); !twice.empty())
    throw Failure(foundTwiceText(twice.front()));
  std::string found = counted(all.size(), "core");
  std::vector<QorJtag_Hub> hubs;
  QorJtag_session_getHubs(link.session(), hubs);
  for (const QorJtag_Hub& hub : hubs) {
    if (hub.late() == 0) continue;
    found += "; hub " + std::to_string(hub.device_index) + "." + std::to_string(hub.user_chain_number) +
             lateBy("TDI", hub.lateTdi) + lateBy("TDO", hub.lateTdo);
  }
  return found;
}

std::string inputs(Link& link, Core& core) {
  const unsigned bits = core.info().async_input_count + core.info().sync_input_count;
  const std::uint64_t before = statisticsOf(link).repeatsSlow;
  Sample sample = emptySample(core.info());
  core.read(sample);
  if (bits == 0) return "this core has no inputs";
  const std::uint64_t repeats = statisticsOf(link).repeatsSlow - before;
  return counted(bits, "input") + " delivered, CRC right" +
         (repeats > 0 ? "; the design clock is slow: " + counted(repeats, "repeat") + " with more room" : "");
}

constexpr unsigned trials = 100;

std::string quality(Link& link, const Core& core) {
  const QorJtag_Statistics before = statisticsOf(link);
  for (unsigned i = 0; i < trials; ++i) readInfo(link, core.ref());
  const QorJtag_Statistics after = statisticsOf(link);
  const std::uint64_t noHub = after.repeatsNoHub - before.repeatsNoHub,
                      noHead = after.repeatsNoHead - before.repeatsNoHead,
                      badCrc = after.repeatsBadCrc - before.repeatsBadCrc;
  if (noHub + noHead + badCrc == 0) return counted(trials, "status word") + " read, none damaged";
  throw Failure("the line is noisy: " + counted(trials, "status word") + " took " +
                counted(noHub + noHead + badCrc, "repeat") + " (no hub's answer " + std::to_string(noHub) +
                ", frame not answered " + std::to_string(noHead) + ", wrong CRC " + std::to_string(badCrc) +
                ")");
}

std::string layout(Link& link, const Core& core) {
  const QORVIO_CORE_INFO again = readInfo(link, core.ref());
  const QORVIO_CORE_INFO& info = core.info();
  if (again.async_input_count != info.async_input_count || again.sync_input_count != info.sync_input_count ||
      again.async_output_count != info.async_output_count ||
      again.sync_output_count != info.sync_output_count)
    throw Failure("two reads of the status word differ");
  const unsigned key = info.core_major_version << 4 | info.core_minor_version;
  return std::string(key < 98    ? "oldest"
                     : key < 160 ? "middle"
                                 : "current") +
         " layout, outputs " + std::to_string(info.async_output_count) + " async " +
         std::to_string(info.sync_output_count) + " sync, inputs " + std::to_string(info.async_input_count) +
         " async " + std::to_string(info.sync_input_count) + " sync";
}

// Writes a pattern and its opposite, and gives the outputs again what they were last given.
std::string loop(Core& core, bool isForced) {
  const unsigned width = std::min(core.info().async_output_count, core.info().async_input_count);
  if (width == 0) return "nothing to compare: no asynchronous port in both directions";
  Signal outputs{"async_out_data", Port::asyncOut}, inputs{"async_in_data", Port::asyncIn};
  for (unsigned bit = 0; bit < width; ++bit) {
    outputs.bits.push_back(bit);
    inputs.bits.push_back(bit);
  }
  const std::optional<Bytes> known = core.lastGiven(outputs);
  if (!known && !isForced)
    throw Failure("what the outputs were last given is not known; --force drives them and leaves zeros");
  const Bytes before = known.value_or(Bytes(byteCount(width)));
  Sample sample = emptySample(core.info());
  Bytes pattern((width + 7) / 8), value;
  bool follows = true;
  const os::Stop stop;  // whoever interrupts it finds the outputs put back
  for (unsigned first : {0U, 1U}) {
    for (unsigned bit = 0; bit < width; ++bit) setBit(pattern, bit, (bit + first) % 2);
    core.write({level(outputs, pattern)});
    core.read(sample);
    extract(inputs, sample.asyncIn, value);
    follows = follows && value == pattern;
  }
  core.write({level(outputs, before)});
  return follows ? counted(width, "bit") + " written and read back"
                 : "the design does not loop its outputs back";
}

struct DoctorOptions {
  bool mayWrite = false;
  bool isForced = false;
};

std::vector<Check> checksOf(Context& context, std::unique_ptr<QorRT::Qor_Cable>& cable,
                            const DoctorOptions& options) {
  std::vector<Check> checks{
      {"cable", "is the address right, the server running, the adapter plugged in, the board powered?",
       [&] {
         cable = openCable(context.cable());
         return context.cable();
       }},
      {"chain", "is the board powered, and TDO connected?",
       [&] {
         if (cable->devices().empty()) throw Failure("no device");
         return counted(cable->devices().size(), "device");
       }},
      {"idcodes", "compare with the data sheets; a slower TCK helps on long wires",
       [&] { return idcodes(cable->devices()); }},
      {"user registers", "is the design with the core loaded?", [&] { return hubs(*cable); }},
      {"cores", "a slower TCK helps on long wires",
       [&] {
         cable.reset();
         return cores(context.link());
       }},
      {"status word", "choose a VIO core with --core; qorvio scan shows them",
       [&] {
         return "core " + refText(context.core().ref()) + ", " + layout(context.link(), context.core());
       }},
      {"read", "is the clock of the design running?", [&] { return inputs(context.link(), context.core()); }},
  };
  if (options.mayWrite) {
    checks.push_back({"write and read back", "is the clock of the design running?",
                      [&] { return loop(context.core(), options.isForced); }});
  }
  checks.push_back({"line", "calls succeed by repeats; a slower TCK, shorter wires or a better ground help",
                    [&] { return quality(context.link(), context.core()); }});
  return checks;
}

void doctor(Context& context, const DoctorOptions& options) {
  std::unique_ptr<QorRT::Qor_Cable> cable;
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  std::string failed;
  for (const Check& check : checksOf(context, cable, options)) {
    std::string result = "ok", seen;
    try {
      if (failed.empty()) seen = check.run();
    } catch (const std::exception& error) {
      seen = error.what();
      result = "FAILED";
    }
    const bool isFailure = result == "FAILED";
    if (!failed.empty()) result = "skipped";
    if (isFailure) failed = check.name;
    const char* const next = isFailure ? nextFor(seen, check) : "";
    json.push_back({{"step", check.name}, {"result", result}, {"seen", seen}, {"next", next}});
    if (context.settings.json || (context.settings.quiet && !isFailure)) continue;
    const Color color = isFailure ? Color::red : result == "ok" ? Color::green : Color::dim;
    std::printf("%s  %-20s %s\n", colored(color, result + std::string(7 - result.size(), ' ')).c_str(),
                check.name, printable(seen).c_str());
    if (isFailure) std::printf("         %-20s %s\n", "", next);
  }
  if (context.settings.json) print({{}, json}, true);
  if (!failed.empty()) throw Failure("the check failed: " + failed);
}

}  // namespace

void addDoctor(CLI::App& app, Context& context) {
  auto options = std::make_shared<DoctorOptions>();
  CLI::App* command =
      app.add_subcommand("doctor", "checks everything from the cable up, and says what to try");
  command->add_flag("--write", options->mayWrite,
                    "drive the outputs for a moment, to see whether they are read back");
  command->add_flag("--force", options->isForced,
                    "drive them even if it is not known what they were last given");
  command->footer(
      "Outputs are left alone without --write; with it they get again what this tool last gave them.\n\n"
      "Example:\n  qorvio --cable sim:board.toml doctor");
  command->callback([&context, options] { doctor(context, *options); });
}

}  // namespace qor::tool
