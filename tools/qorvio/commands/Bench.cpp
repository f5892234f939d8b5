// How fast the board can be polled, and what a poll costs on the wire.
#include <algorithm>
#include <chrono>
#include <cstdio>

#include <nlohmann/json.hpp>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/session/CountingCable.h"
#include "tools/qorvio/Number.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Table.h"

namespace qor::tool {
namespace {

using Clock = std::chrono::steady_clock;

struct Figures {
  std::vector<double> latencies;  // microseconds, in ascending order
  double seconds = 0;
  Traffic traffic;
};

Figures measure(Core& core, unsigned polls, Traffic& traffic) {
  Sample sample = emptySample(core.info());
  core.read(sample);  // what a first read sets up is not a poll's
  traffic = {};
  Figures figures;
  figures.latencies.reserve(polls);
  const Clock::time_point begin = Clock::now();
  Clock::time_point last = begin;
  for (unsigned i = 0; i < polls; ++i) {
    core.read(sample);
    const Clock::time_point now = Clock::now();
    figures.latencies.push_back(std::chrono::duration<double, std::micro>(now - last).count());
    last = now;
  }
  figures.seconds = std::chrono::duration<double>(last - begin).count();
  figures.traffic = traffic;
  std::sort(figures.latencies.begin(), figures.latencies.end());
  return figures;
}

double percentile(const std::vector<double>& sorted, double part) {
  return sorted[static_cast<std::size_t>(part * static_cast<double>(sorted.size() - 1))];
}

std::string decimals(double number, int digits) {
  char text[64];
  std::snprintf(text, sizeof text, "%.*f", digits, number);
  return text;
}

Report reportOf(const Figures& figures) {
  const auto polls = static_cast<double>(figures.latencies.size());
  const auto each = [&](std::uint64_t count) { return static_cast<double>(count) / polls; };
  const double rate = polls / figures.seconds, median = percentile(figures.latencies, 0.5),
               worst = percentile(figures.latencies, 0.99);
  const nlohmann::ordered_json json{{"polls", figures.latencies.size()},
                                    {"polls_per_second", rate},
                                    {"median_us", median},
                                    {"percentile_99_us", worst},
                                    {"exchanges_per_poll", each(figures.traffic.exchanges)},
                                    {"scans_per_poll", each(figures.traffic.scans)},
                                    {"bits_per_poll", each(figures.traffic.bits)},
                                    {"idle_tcks_per_poll", each(figures.traffic.idle)}};
  Table table({"FIGURE", "VALUE"});
  table.add({"polls per second", decimals(rate, 0)});
  table.add({"median latency", decimals(median, 1) + " us"});
  table.add({"99th percentile", decimals(worst, 1) + " us"});
  table.add({"exchanges per poll", decimals(each(figures.traffic.exchanges), 2)});
  table.add({"scans per poll", decimals(each(figures.traffic.scans), 2)});
  table.add({"bits on the wire per poll", decimals(each(figures.traffic.bits), 1)});
  table.add({"idle TCKs per poll", decimals(each(figures.traffic.idle), 1)});
  return {table.text(), json};
}

void bench(Context& context, unsigned polls) {
  Traffic traffic;
  context.countTraffic(traffic);
  Core& core = context.core();
  if (core.info().async_input_count == 0 && core.info().sync_input_count == 0)
    throw WrongUse("this core has no inputs to poll: " + refText(core.ref()));
  print(reportOf(measure(core, polls, traffic)), context.settings.json);
}

}  // namespace

void addBench(CLI::App& app, Context& context) {
  auto polls = std::make_shared<unsigned>(1000);
  CLI::App* command =
      app.add_subcommand("bench", "polls per second, their latency, and what each costs on the wire");
  command->add_option("--polls", *polls, "how many reads to measure")
      ->capture_default_str()
      ->check(wholeNumber(1, 1'000'000'000));
  command->footer("Example:\n  qorvio bench --polls 10000");
  command->callback([&context, polls] { bench(context, *polls); });
}

}  // namespace qor::tool
