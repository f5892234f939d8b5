// Recordings as pictures.
#include <algorithm>
#include <cmath>
#include <cstdio>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "board/record/VcdReader.h"
#include "os/Files.h"
#include "tools/qorvio/Drawing.h"
#include "tools/qorvio/commands/Commands.h"

namespace qor::tool {
namespace {

struct RenderOptions {
  std::string dump;
  std::string picture;
  std::vector<std::string> names;
  std::string from;
  std::string to;
};

std::uint64_t stepsOf(const VcdDump& dump, const std::string& time) {
  const double seconds = std::chrono::duration<double>(parseDuration(time)).count();
  return static_cast<std::uint64_t>(std::llround(std::min(seconds / dump.stepSeconds, 0x1p53)));
}

std::string pictureFor(const RenderOptions& options) {
  if (!options.picture.empty()) return options.picture;
  const std::string ending = ".vcd";
  const std::size_t size = options.dump.size();
  const bool hasEnding = size > ending.size() && options.dump.substr(size - ending.size()) == ending;
  return options.dump.substr(0, hasEnding ? size - ending.size() : size) + ".svg";
}

void render(const RenderOptions& options) {
  const VcdDump dump = readVcd(options.dump);
  const DrawingOptions what{options.names, options.from.empty() ? dump.begin : stepsOf(dump, options.from),
                            options.to.empty() ? dump.end : stepsOf(dump, options.to)};
  if (what.begin >= what.end)
    throw WrongUse("nothing to draw between these times: steps " + std::to_string(what.begin) + " to " +
                   std::to_string(what.end));
  os::replaceFile(pictureFor(options), drawing(dump, what));
}

}  // namespace

void addRender(CLI::App& app, Context&) {
  auto options = std::make_shared<RenderOptions>();
  CLI::App* command = app.add_subcommand("render", "draws a .vcd recording as SVG");
  command->add_option("FILE.vcd", options->dump, "the recording, or any other value change dump")->required();
  command->add_option("FILE.svg", options->picture,
                      "the picture; without a name that of the recording, with .svg");
  command->add_option("--only", options->names, "what to draw, from top to bottom; without names everything")
      ->delimiter(',')
      ->type_name("NAME,NAME,...");
  command->add_option("--from", options->from, "where to begin, such as 250us or 1.5s")->type_name("TIME");
  command->add_option("--to", options->to, "where to end")->type_name("TIME");
  command->footer(
      "Bits are waves, wider signals hexadecimal values; what is unknown, and where polls were missed, is "
      "hatched.\n\nExample:\n  qorvio render counter.vcd --only async_in_data --to 1ms");
  command->callback([options] { render(*options); });
}

}  // namespace qor::tool
