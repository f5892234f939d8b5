#include "bench/TableReporter.h"

#include <cstdio>
#include <initializer_list>

namespace bench {

void TableReporter::ReportRuns(const std::vector<Run>& runs) {
  ConsoleReporter::ReportRuns(runs);
  for (const Run& run : runs) {
    if (run.run_type != Run::RT_Iteration || run.error_occurred) continue;
    const double seconds = run.cpu_accumulated_time / static_cast<double>(run.iterations);
    results_[run.run_name.function_name + '/' + run.run_name.args] = {seconds * 1e6, run.counters};
  }
}

void TableReporter::Finalize() {
  printTransfers();
  printNames();
}

void TableReporter::printTransfers() const {
  std::printf("\nWhole ports, all four of one width; wire: the same bits at 30 MHz TCK\n");
  std::printf("%-16s %6s %10s %12s %8s %11s %10s %15s\n", "", "width", "us", "us on wire", "% wire",
              "plain way x", "exchanges", "bytes/port bit");
  for (const char* name : {"writeWholePorts", "readWholePorts"}) {
    for (int width : {32, 256, 4096, 65535}) {
      const auto own = results_.find(name + ('/' + std::to_string(width)));
      const auto plain = results_.find(std::string("plain_") + name + '/' + std::to_string(width));
      if (own == results_.end() || plain == results_.end()) continue;
      const double wire = own->second.counters.at("wire_us");
      std::printf(
          "%-16s %6d %10.2f %12.1f %8.2f %11.1f %10.0f %15.1f\n", name, width, own->second.microseconds, wire,
          100 * own->second.microseconds / wire, plain->second.microseconds / own->second.microseconds,
          own->second.counters.at("exchanges").value, own->second.counters.at("bytes_per_port_bit").value);
    }
  }
}

void TableReporter::printNames() const {
  std::printf("\nReads by name, each of one bit\n%8s %10s %10s %10s\n", "names", "us", "ns a name",
              "exchanges");
  for (int names : {10, 1000, 10000}) {
    const auto result = results_.find("readNames/" + std::to_string(names));
    if (result == results_.end()) continue;
    std::printf("%8d %10.1f %10.1f %10.0f\n", names, result->second.microseconds,
                1000 * result->second.microseconds / names, result->second.counters.at("exchanges").value);
  }
}

}  // namespace bench
