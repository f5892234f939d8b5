#include "tools/qorvio/serve/Metrics.h"

#include <algorithm>
#include <charconv>

#include "board/model/Frame.h"

namespace qor::tool {
namespace {

std::string numberText(double number) {
  char text[32];
  return {text, std::to_chars(text, text + sizeof text, number).ptr};
}

std::string labelText(const std::string& value) {
  std::string text;
  for (const char letter : value)
    text += letter == '\\' || letter == '"' ? std::string("\\") + letter
            : letter == '\n'                ? std::string("\\n")
                                            : std::string(1, letter);
  return '"' + text + '"';
}

void head(std::string& text, const std::string& name, const char* type, const char* help) {
  text += "# HELP " + name + " " + help + "\n# TYPE " + name + " " + type + "\n";
}

void single(std::string& text, const std::string& name, const char* type, const char* help,
            std::uint64_t number) {
  head(text, name, type, help);
  text += name + " " + std::to_string(number) + "\n";
}

void linkErrors(std::string& text, const QorJtag_Statistics& link) {
  const std::string name = "qorvio_link_errors_total";
  head(text, name, "counter", "Answers that were damaged or late, and repeated.");
  const std::pair<const char*, std::uint64_t> kinds[] = {{"no_hub", link.repeatsNoHub},
                                                         {"no_head", link.repeatsNoHead},
                                                         {"bad_crc", link.repeatsBadCrc},
                                                         {"slow", link.repeatsSlow},
                                                         {"refused", link.repeatsRefused}};
  for (const auto& [kind, count] : kinds)
    text += name + "{kind=\"" + kind + "\"} " + std::to_string(count) + "\n";
}

void inputValues(std::string& text, const std::vector<Signal>& signals, const std::vector<Sample>& samples) {
  bool isFirst = true;
  for (const Signal& each : signals) {
    if (!isInput(each.port) || (each.scale == 0 && each.unit.empty())) continue;
    if (isFirst) head(text, "qorvio_input", "gauge", "An input, in its unit.");
    isFirst = false;
    text += "qorvio_input{signal=" + labelText(each.name) + ",unit=" + labelText(each.unit) + "} " +
            numberText(Reading(each, samples[each.core]).scaled()) + "\n";
  }
}

}  // namespace

void Histogram::add(double seconds) {
  const auto bucket = std::lower_bound(bounds.begin(), bounds.end(), seconds);
  if (bucket != bounds.end()) ++counts_[static_cast<std::size_t>(bucket - bounds.begin())];
  ++count_;
  sum_ += seconds;
}

void Histogram::append(std::string& text, const std::string& name) const {
  std::uint64_t below = 0;
  for (std::size_t i = 0; i < bounds.size(); ++i)
    text +=
        name + "_bucket{le=\"" + numberText(bounds[i]) + "\"} " + std::to_string(below += counts_[i]) + "\n";
  text += name + "_bucket{le=\"+Inf\"} " + std::to_string(count_) + "\n";
  text += name + "_sum " + numberText(sum_) + "\n" + name + "_count " + std::to_string(count_) + "\n";
}

std::string metricsText(const Counts& counts, const Gauges& gauges, const std::vector<Signal>& signals,
                        const std::vector<Sample>& samples) {
  std::string text;
  single(text, "qorvio_link_up", "gauge", "Whether the last poll succeeded.", gauges.isUp ? 1 : 0);
  single(text, "qorvio_polls_total", "counter", "Polls of all cores.", counts.polls);
  single(text, "qorvio_polls_missed_total", "counter", "Polls that the link was too slow for.",
         counts.missed);
  single(text, "qorvio_polls_failed_total", "counter", "Polls that failed.", counts.failed);
  head(text, "qorvio_poll_seconds", "histogram", "How long a poll of all cores took.");
  counts.latency.append(text, "qorvio_poll_seconds");
  linkErrors(text, gauges.link);
  single(text, "qorvio_transfers_total", "counter", "Transfers over the link, repeats among them.",
         gauges.link.transfers);
  single(text, "qorvio_writes_total", "counter", "Writes of clients.", counts.writes);
  single(text, "qorvio_clients", "gauge", "Clients that are connected.", gauges.clients);
  single(text, "qorvio_outputs_claimed", "gauge", "Outputs that belong to a client.", gauges.claimed);
  single(text, "qorvio_recordings", "gauge", "Recordings that are kept.", gauges.recordings);
  single(text, "qorvio_frames_total", "counter", "Frames sent to clients.", counts.frames);
  single(text, "qorvio_snapshots_total", "counter", "Frames that were whole.", counts.snapshots);
  single(text, "qorvio_refused_total", "counter",
         "Connections and requests without a good token, Host or Origin.", counts.refused);
  inputValues(text, signals, samples);
  return text;
}

}  // namespace qor::tool
