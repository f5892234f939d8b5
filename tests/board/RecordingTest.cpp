// Recordings over links that are lost or late: what was recorded stays, and says what is missing.
#include "board/record/Recording.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>
#include <thread>

#include "FaultyCable.h"
#include "Sim.h"
#include "board/model/Errors.h"
#include "board/session/LocalCore.h"

namespace {

using std::chrono::milliseconds;
using std::chrono::nanoseconds;

struct FileKind {
  const char* ending;
  const char* whole;   ///< five samples
  const char* missed;  ///< how many polls are missed, in the base
  int base;
  bool isRunningSum;
};

constexpr FileKind kinds[] = {
    {"vcd",
     R"([^]*\$var wire 8 ! counter \$end\n\$var wire 1 " counter_moved \$end\n)"
     R"(\$var wire 32 # missed_polls \$end\n\$upscope \$end\n\$enddefinitions \$end\n(#\d+\nb[01]{8} !\n(1"\nb0{32} #\n)?){5}#\d+\n)",
     R"(\nbx #\n#\d+\n(?:b[01]{8} !\n)?(?:[01]"\n)?b([01]{32}) #)", 2, true},
    {"csv", R"(time_s,missed,counter,counter moved\n(\d+\.\d{9},0,0x[0-9A-F]{2},[0-3]\n){5})", R"(,(\d+),)",
     10, false},
    {"jsonl",
     R"(\{"signals":\[\{"name":"counter","core":"1.1.0","width":8\}\]\}\n)"
     R"((\{"time_s":\d+\.\d{9},"missed":0,"counter":"0x[0-9A-F]{2}","moved":\{"counter":[0-3]\}\}\n){5})",
     R"("missed":(\d+))", 10, false},
};

/// A counter on a link that fails by a script, recorded into a file of its own.
class Recording : public testing::TestWithParam<FileKind> {
 protected:
  ~Recording() override { std::filesystem::remove(path_); }

  // Between two samples there was time for the polls that were missed between them.
  qor::Recorded record(const qor::Limits& limits) {
    const qor::Signal counter{"counter", qor::Port::asyncIn, {0, 1, 2, 3, 4, 5, 6, 7}};
    return qor::recordTo(
        path_, poller_, {counter}, limits, {}, [&](const qor::Recorded& so, nanoseconds now) {
          EXPECT_GE(now - last_, static_cast<std::int64_t>(so.missed - missed_) * limits.period);
          last_ = now;
          missed_ = so.missed;
        });
  }

  std::string text() const {
    std::ifstream file(path_);
    return {std::istreambuf_iterator<char>(file), {}};
  }

  const std::string path_ = std::filesystem::temp_directory_path() /
                            ("recording" + std::to_string(getpid()) + '.' + GetParam().ending);
  qorsim::FaultyCable* const link_ = new qorsim::FaultyCable(qorsim::demoBoard().cable());
  qor::Link session_{std::unique_ptr<QorRT::Qor_Cable>(link_)};
  qor::LocalCore core_{session_, {1, 1, 0}};
  qor::Poller poller_{{&core_}};
  nanoseconds last_{0};
  std::uint64_t missed_ = 0;
};

TEST_P(Recording, IsWholeUpToThePollThatLostTheLink) {
  for (int poll = 0; poll < 5; ++poll) link_->next({});
  link_->next(qorsim::failAt(1));
  qor::Limits limits;
  limits.samples = 100;
  std::string said;
  try {
    record(limits);
  } catch (const qor::Failure& failure) {
    said = failure.what();
  }
  EXPECT_EQ(said, "device 1, user chain 1, core 0: the link failed at scan 1; kept 5 samples in " + path_);
  EXPECT_TRUE(std::regex_match(text(), std::regex(GetParam().whole))) << text();
}

TEST_P(Recording, MarksThePollsThatItMissed) {
  for (int poll = 0; poll < 3; ++poll) link_->next({});
  link_->next({[](qorsim::PassingExchange&) { std::this_thread::sleep_for(milliseconds(11)); }});
  link_->next({[](qorsim::PassingExchange&) { std::this_thread::sleep_for(milliseconds(50)); }});
  qor::Limits limits;
  limits.time = milliseconds(40);
  limits.period = milliseconds(2);
  const qor::Recorded recorded = record(limits);
  EXPECT_LT(last_, limits.time);
  EXPECT_GE(recorded.missed, 4U);
  EXPECT_EQ(recorded.samples + recorded.missed, 20U);
  const std::string text = this->text();
  const std::regex mark(GetParam().missed);
  std::uint64_t told = 0;
  std::ptrdiff_t marks = 0;
  for (std::sregex_iterator each(text.begin(), text.end(), mark); each != std::sregex_iterator();
       ++each, ++marks)
    told = (GetParam().isRunningSum ? 0 : told) + std::stoul((*each)[1], nullptr, GetParam().base);
  EXPECT_EQ(told, recorded.missed) << text;
  const std::regex sum(R"(\nb[01]{32} #)");  // each but the first comes after a gap
  if (GetParam().isRunningSum) {
    EXPECT_EQ(std::distance(std::sregex_iterator(text.begin(), text.end(), sum), {}), marks + 1) << text;
  }
}

INSTANTIATE_TEST_SUITE_P(Files, Recording, testing::ValuesIn(kinds),
                         [](const auto& each) { return std::string(each.param.ending); });

}  // namespace
