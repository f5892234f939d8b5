// What watch formats and writes: only what changed.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "board/Board.h"
#include "tools/qorvio/InputWatch.h"
#include "tools/qorvio/terminal/Screen.h"
#include "tools/qorvio/terminal/Table.h"

namespace {

using qor::Direction;
using testing::ElementsAre;
using testing::IsEmpty;
using Lines = std::vector<std::string>;

struct ScreenCase {
  const char* what;
  std::size_t rows;
  Lines body;
  Lines foot;
  std::ptrdiff_t scrolled;
  std::string written;
};

TEST(Screen, WritesTheLinesThatDiffer) {
  const std::string changedTwo = "\033[2;1H\033[Ktwo!";
  const ScreenCase steps[] = {
      {"all at first",
       5,
       {"one", "two"},
       {"q"},
       0,
       "\033[2J\033[1;1H\033[Kone\033[2;1H\033[Ktwo\033[3;1H\033[Kq"},
      {"nothing", 5, {"one", "two"}, {"q"}, 0, ""},
      {"one line", 5, {"one", "two!"}, {"q"}, 0, changedTwo},
      {"fewer lines", 5, {"one"}, {"q"}, 0, "\033[2;1H\033[Kq\033[3;1H\033[K"},
      {"as many as there is room for",
       3,
       {"1", "2", "3"},
       {},
       0,
       "\033[2J\033[1;1H\033[K1\033[2;1H\033[K2\033[3;1H\033[K3"},
      {"one more",
       3,
       {"1", "2", "3", "4"},
       {},
       0,
       "\033[3;1H\033[K2 lines not shown, 0 above and 2 below: arrows, PgUp, PgDn scroll"},
      {"scrolled too far",
       3,
       {"1", "2", "3", "4"},
       {},
       9,
       "\033[1;1H\033[K3\033[2;1H\033[K4\033[3;1H\033[K2 lines not shown, 2 above and 0 below: arrows, PgUp, "
       "PgDn "
       "scroll"},
      {"hardly any room", 2, {"1", "2", "3"}, {"q"}, -9, "\033[2J\033[1;1H\033[K1\033[2;1H\033[Kq"},
  };
  qor::tool::Screen screen;
  for (const ScreenCase& step : steps) {
    screen.scroll(step.scrolled);
    EXPECT_EQ(screen.update(step.rows, {&step.body}, step.foot), step.written) << step.what;
  }
}

TEST(Table, LaysOutAgainWhatWasSetOrAllWhenAColumnGrows) {
  qor::tool::Table table({"A", "B"});
  table.add({"x", "1"});
  table.add({"y", "2"});
  EXPECT_THAT(table.lines(), ElementsAre("A  B", "x  1", "y  2"));
  table.set(2, {"y", "3"});
  EXPECT_THAT(table.lines(), ElementsAre("A  B", "x  1", "y  3"));
  table.set(1, {"long", "1"});
  EXPECT_THAT(table.lines(), ElementsAre("A     B", "long  1", "y     3"));
  table.set(1, {"0x00000000010000000000", "日本"});
  EXPECT_THAT(table.lines(19), ElementsAre("A              B", "0x00…≠0…00000  日本", "y              3"));
  EXPECT_THAT(table.lines(8), ElementsAre("A", "0…≠0…00", "y"));
}

// The demo board loops the outputs of its first core back.
TEST(InputWatch, NamesTheInputsThatLookDifferent) {
  qor::Board board("sim:");
  const qor::SignalTable& signals = board.signals();
  const auto write = [&](const char* output, unsigned char value) { board.write({{output, value}}); };
  qor::tool::InputWatch watch(board.poller(), {signals.find("async_in_data[0]", Direction::input),
                                               signals.find("async_in_data[1]", Direction::input),
                                               signals.find("sync_in_data", Direction::input)});
  watch.poll();
  EXPECT_THAT(watch.takeChanged(), ElementsAre(0, 1, 2));
  watch.poll();
  EXPECT_THAT(watch.takeChanged(), IsEmpty());
  write("async_out_data[1]", 1);
  watch.poll();
  EXPECT_THAT(watch.takeChanged(), ElementsAre(1));
  write("sync_out_data", 0x80);
  watch.poll();  // the activity of the bit before is over
  EXPECT_THAT(watch.takeChanged(), ElementsAre(1, 2));
  watch.poll();
  EXPECT_THAT(watch.takeChanged(), ElementsAre(2));
  watch.poll();
  EXPECT_THAT(watch.takeChanged(), IsEmpty());
  EXPECT_EQ(watch.sinceStart(watch.inputs()[2]).asyncUp[0], 2);
  EXPECT_EQ(watch.sinceStart(watch.inputs()[2]).syncUp[0], 0x80);
  watch.clear();
  EXPECT_EQ(watch.sinceStart(watch.inputs()[2]).asyncUp[0], 0);
  EXPECT_THAT(watch.takeChanged(), ElementsAre(0, 1, 2));
}

}  // namespace
