#include "tools/qorvio/LiveWatch.h"

#include <utility>

#include "board/model/Errors.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

constexpr std::ptrdiff_t farAway = 1'000'000;
constexpr os::Key backspace = 0x08, erase = 0x7F, eraseAll = 0x15;
constexpr const char* help = "   j k choose, space toggle, = value, p pulse, h history, c clear, q quit";

}  // namespace

std::string LiveWatch::update(os::TerminalSize size) {
  std::vector<std::string> foot = {
      printable(isTyping_ ? outputs_.chosen() + " = " + typed_ + "_   Enter gives it, empty leaves it"
                          : status_),
      "frame " + std::to_string(watch_.frames()) + help};
  for (std::string& line : foot) line = shortened(line, size.columns);
  const auto &inputs = inputs_.lines(watch_, size.columns), &outputs = outputs_.lines(size.columns);
  return screen_.update(size.rows, {&inputs, &between_, &outputs}, std::move(foot), chosenLine());
}

void LiveWatch::press(os::Key key) {
  status_.clear();
  try {
    isTyping() ? type(key) : obey(key);
  } catch (const WrongUse& error) {
    status_ = error.what();
  }
}

std::string LiveWatch::shown() const {
  std::string text;
  for (const std::string& line : screen_.shown()) text += line + '\n';
  return text.erase(text.find_last_not_of('\n') + 1) + '\n';
}

void LiveWatch::choose(const std::string& output) {
  outputs_.choose(output);
  screen_.reveal(chosenLine());
}

void LiveWatch::type(os::Key key) {
  if (key == '\n' || key == '\r') {
    isTyping_ = false;
    const std::string text = std::exchange(typed_, {});
    if (!text.empty()) outputs_.giveChosen(text);
  } else if (key == backspace || key == erase) {
    if (!typed_.empty()) typed_.pop_back();
  } else if (key == eraseAll) {
    typed_.clear();
  } else if (key >= ' ' && key <= 0xFF) {
    typed_ += static_cast<char>(key);
  }
}

void LiveWatch::obey(os::Key key) {
  switch (key) {
    case 'j':
    case 'k':
      key == 'j' ? outputs_.chooseNext() : outputs_.chooseBefore();
      return screen_.reveal(chosenLine());
    case ' ':
      return outputs_.toggleChosen();
    case 'p':
      return outputs_.pulseChosen();
    case '=':
    case '\n':
    case '\r':
      isTyping_ = !outputs_.chosen().empty();
      return;
    case 'h':
      return inputs_.showHistory(!inputs_.showsHistory());
    case 'c':
      return watch_.clear();
    case os::keyUp:
    case os::keyDown:
      return screen_.scroll(key == os::keyUp ? -1 : 1);
    case os::keyHome:
    case os::keyEnd:
      return screen_.scroll(key == os::keyHome ? -farAway : farAway);
    case os::keyPageUp:
    case os::keyPageDown:
      return screen_.scrollPages(key == os::keyPageUp ? -1 : 1);
    default:
      return;
  }
}

}  // namespace qor::tool
