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
using Lines = std::vector<std::string>;

TEST(Screen, WritesTheLinesThatDiffer) {
  const struct {
    std::size_t rows;
    Lines body;
    std::ptrdiff_t scrolled;
    std::string written;
  } steps[] = {
      {5, {"one", "two"}, 0, "\033[2J\033[1;1H\033[Kone\033[2;1H\033[Ktwo\033[3;1H\033[Kq"},
      {5, {"one", "two"}, 0, ""},
      {5, {"one", "two!"}, 0, "\033[2;1H\033[Ktwo!"},
      {5, {"one"}, 0, "\033[2;1H\033[Kq\033[3;1H\033[K"},
      {4, {"1", "2", "3"}, 0, "\033[2J\033[1;1H\033[K1\033[2;1H\033[K2\033[3;1H\033[K3\033[4;1H\033[Kq"},
      {4,
       {"1", "2", "3", "4"},
       9,  // too far
       "\033[1;1H\033[K3\033[2;1H\033[K4\033[3;1H\033[Kq\033[4;1H\033[K2 lines not shown, 2 above and 0 "
       "below: arrows, PgUp, "
       "PgDn "
       "scroll"},
      {2, {"1", "2", "3"}, -9, "\033[2J\033[1;1H\033[K1\033[2;1H\033[Kq"},
  };
  qor::tool::Screen screen;
  for (const auto& step : steps) {
    screen.scroll(step.scrolled);
    EXPECT_EQ(screen.update(step.rows, {&step.body}, {"q"}), step.written);
  }
}

TEST(Table, LaysOutAgainWhatWasSetOrAllWhenAColumnGrows) {
  qor::tool::Table table({"A", "B"});
  table.add({"x", "1"});
  table.add({"y", "2"});
  EXPECT_THAT(table.lines(), ElementsAre("A  B", "x  1", "y  2"));
  table.set(1, {"long", "1"});
  EXPECT_THAT(table.lines(), ElementsAre("A     B", "long  1", "y     2"));
  table.set(1, {"0x00000000010000000000", "日本"});
  EXPECT_THAT(table.lines(19), ElementsAre("A              B", "0x00…≠0…00000  日本", "y              2"));
  EXPECT_THAT(table.lines(8), ElementsAre("A", "0…≠0…00", "y"));
}

// The demo board loops the outputs of its first core back.
TEST(InputWatch, NamesTheInputsThatLookDifferent) {
  qor::Board board("sim:");
  const char* const names[] = {"async_in_data[0]", "async_in_data[1]", "sync_in_data"};
  std::vector<qor::Signal> inputs;
  for (const char* name : names) inputs.push_back(board.signals().find(name, Direction::input));
  qor::tool::InputWatch watch(board.poller(), inputs);
  const std::pair<const char*, std::vector<std::size_t>> steps[] = {
      {"", {0, 1, 2}},
      {"", {}},
      {"async_out_data[1]", {1}},
      {"sync_out_data[7]", {1, 2}},  // the bit's activity is over
      {"", {2}},
      {"", {}}};
  for (const auto& [output, changed] : steps) {
    if (*output != '\0') board.write({{output, 1}});
    watch.poll();
    EXPECT_EQ(watch.takeChanged(), changed);
  }
  EXPECT_EQ(watch.sinceStart(watch.inputs()[2]).syncUp[0], 0x80);
  watch.clear();
  EXPECT_EQ(watch.sinceStart(watch.inputs()[2]).syncUp[0], 0);
  EXPECT_THAT(watch.takeChanged(), ElementsAre(0, 1, 2));
}

}  // namespace
