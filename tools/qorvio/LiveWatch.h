// The tables of watch on a terminal, and what the keys do to them.
#pragma once

#include <string>
#include <vector>

#include "os/Terminal.h"
#include "tools/qorvio/InputWatch.h"
#include "tools/qorvio/terminal/Screen.h"
#include "tools/qorvio/terminal/WatchTables.h"

namespace qor::tool {

class LiveWatch {
 public:
  /// The watch must outlive it.
  LiveWatch(InputWatch& watch, OutputTable outputs)
      : watch_(watch), inputs_(watch), outputs_(std::move(outputs)) {}

  /// What to write to a terminal of that size.
  std::string update(os::TerminalSize size);

  /// Keeps the newest frame for the history.
  void keep() { inputs_.keep(watch_); }

  /// Obeys a key; what is wrong with it is said in a line of its own, which is always there.
  void press(os::Key key);

  /// Says something in that line.
  void say(std::string text) { status_ = std::move(text); }

  /// Whether a value is being typed, so that keys are letters.
  bool isTyping() const { return isTyping_; }

  void redraw() { screen_.forget(); }

  /// The lines that are on the terminal.
  std::string shown() const;

  /// What is remembered from day to day.
  /// @{
  std::string chosen() const { return outputs_.chosen(); }
  void choose(const std::string& output);
  bool showsHistory() const { return inputs_.showsHistory(); }
  void showHistory(bool isShown) { inputs_.showHistory(isShown); }
  /// @}

 private:
  std::size_t chosenLine() const { return watch_.inputs().size() + 2 + outputs_.chosenLine(); }
  void obey(os::Key key);
  void type(os::Key key);

  InputWatch& watch_;
  InputTable inputs_;
  OutputTable outputs_;
  const std::vector<std::string> between_{""};
  std::string status_;
  bool isTyping_ = false;
  std::string typed_;
  Screen screen_;
};

}  // namespace qor::tool
