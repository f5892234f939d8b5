// What users and others write for the command line. Input: the kind, a line, and then the file or, a line each, the words
// before a TAB. Whatever is wrong in a file is said with its name, and with the line where there is one.
#include <filesystem>
#include <fstream>
#include <regex>

#include "Sim.h"
#include "board/model/SignalFile.h"
#include "board/record/VcdReader.h"
#include "tests/fuzz/Fuzz.h"
#include "tools/qorvio/CommandLine.h"
#include "tools/qorvio/Completion.h"
#include "tools/qorvio/Drawing.h"

namespace {

void runBoard(const std::string& file) {
  const auto cable = qorsim::boardFile(file).cable();
  cable->scanIr(0, 1);
  cable->captured(cable->scanDr(0, {1, 0}, 16, true));
  require(!cable->devices().empty(), "a device");
}

void draw(const std::string& file) {
  const qor::VcdDump dump = qor::readVcd(file);
  if (dump.begin >= dump.end) return;
  const std::string picture = qor::tool::drawing(dump, {{}, dump.begin, dump.end});
  require(std::regex_search(picture, std::regex("^<svg [^<]*<")), "a picture");
  require(picture.find("<script") == picture.npos && picture.size() < (64 << 20), "no more than a picture");
}

void complete(const std::string& text) {
  CLI::App app;
  qor::tool::Context context;
  qor::tool::addCommands(app, context);
  for (const std::string& word : qor::tool::completions(app, {}, split(text, '\n')))
    require(word.find_first_of("$`;|&<>(){}'\"\\ \t\n*?!#~") == word.npos, "a word for a shell: " + word);
}

void use(const std::string& kind, const std::string& file, const std::string& text) {
  if (kind == "board.toml") runBoard(file);
  if (kind == "recording.vcd") draw(file);
  if (kind == "signals.toml") qor::readSignalFile(file);
  if (kind == "qorvio.toml") qor::tool::Settings().complete();
  if (kind == "words") complete(text);
}

}  // namespace

void fuzz(std::string_view input) {
  static const std::string folder = [] {
    std::string name = std::filesystem::temp_directory_path() / "fuzz.XXXXXX";
    require(mkdtemp(name.data()) != nullptr, "a folder");
    return name;
  }();
  const std::string kind(input.substr(0, input.find('\n')));
  const std::string text = grown(input.substr(std::min(kind.size() + 1, input.size())));
  if (kind.empty() || kind[0] == '.' || kind.find_first_not_of("abcdefghijklmnopqrstuvwxyz.") != kind.npos)
    return;
  const auto before = std::filesystem::current_path();  // inputs may be named relative to it
  std::filesystem::current_path(folder);
  std::ofstream(kind) << text;
  const std::string wrong = thrownBy([&] { use(kind, kind, text); });
  std::filesystem::remove(kind);
  std::filesystem::current_path(before);
  require(wrong.empty() || kind == "words" || wrong.find(kind) != wrong.npos, wrong);
}
