// After the lines of Google Benchmark, the table that they are for.
#pragma once

#include <benchmark/benchmark.h>

#include <map>
#include <string>

namespace bench {

class TableReporter : public benchmark::ConsoleReporter {
 public:
  TableReporter() : ConsoleReporter(OO_Tabular) {}

  void ReportRuns(const std::vector<Run>& runs) override;
  void Finalize() override;

 private:
  struct Result {
    double microseconds = 0;
    benchmark::UserCounters counters;
  };

  void printTransfers() const;
  void printNames() const;

  /// By benchmark and argument, such as "writeWholePorts/32".
  std::map<std::string, Result> results_;
};

}  // namespace bench
