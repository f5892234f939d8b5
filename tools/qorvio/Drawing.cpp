#include "tools/qorvio/Drawing.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <set>

#include "board/model/Errors.h"
#include "platform/jtag/cable/Qor_Spelling.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

// In pixels.
constexpr double width = 960, margin = 16, laneHeight = 22, laneGap = 12, letterWidth = 7.3;

constexpr const char* missedPolls = "missed_polls";

constexpr const char* style = R"svg(<style>
svg { font: 12px ui-monospace, Menlo, Consolas, 'DejaVu Sans Mono', monospace }
.card { fill: #ffffff; stroke: #d0d7de } .text { fill: #1f2328 } .faint { fill: #59636e }
.grid { stroke: #d8dee4 } .wave { fill: none; stroke: #0a6ebd; stroke-width: 1.5 }
.value { fill: #ddf0ff; stroke: #0a6ebd } .hatch { stroke: #cf222e; stroke-width: 1.5 }
@media (prefers-color-scheme: dark) {
.card { fill: #0d1117; stroke: #3d444d } .text { fill: #e6edf3 } .faint { fill: #9198a1 }
.grid { stroke: #2a3038 } .wave { stroke: #58a6ff } .value { fill: #12283f; stroke: #58a6ff }
.hatch { stroke: #ff7b72 } }
</style>
<defs><pattern id="unknown" width="6" height="6" patternUnits="userSpaceOnUse" patternTransform="rotate(45)"><path class="hatch" d="M0 0V6"/></pattern></defs>
)svg";

std::string decimal(double number) {
  char text[40];
  std::snprintf(text, sizeof text, "%.1f", number);
  const std::string digits = text;
  return digits.size() > 2 && digits.substr(digits.size() - 2) == ".0" ? digits.substr(0, digits.size() - 2)
                                                                       : digits;
}

// Neither markup nor anything that XML does not allow.
std::string escaped(const std::string& text) {
  std::string safe;
  for (const char letter : printable(text)) {
    safe += letter == '&'    ? "&amp;"
            : letter == '<'  ? "&lt;"
            : letter == '>'  ? "&gt;"
            : letter == '"'  ? "&quot;"
            : letter == '\'' ? "&apos;"
                             : std::string(1, letter);
  }
  return safe;
}

// As a recording spells the names of signals.
std::string dumpName(std::string name) {
  std::replace_if(
      name.begin(), name.end(),
      [](char letter) { return std::string("[].:").find(letter) != std::string::npos; }, '_');
  return name;
}

std::string hexadecimal(const std::string& binary, unsigned bits) {
  std::string padded = std::string((bits + 3) / 4 * 4 - binary.size(), '0') + binary;
  std::string text;
  for (std::size_t i = 0; i < padded.size(); i += 4) {
    unsigned digit = 0;
    for (std::size_t k = i; k < i + 4; ++k) digit = 2 * digit + (padded[k] == '1' ? 1U : 0U);
    text += "0123456789ABCDEF"[digit];
  }
  return text;
}

// 1, 2 or 5 times a power of ten.
double roundAbove(double number) {
  const double power = std::pow(10, std::floor(std::log10(number)));
  for (const double factor : {1.0, 2.0, 5.0})
    if (number <= factor * power) return factor * power;
  return 10 * power;
}

class Drawing {
 public:
  Drawing(const VcdDump& dump, const DrawingOptions& options)
      : dump_(dump), options_(options), lanes_(chosenLanes()) {
    std::size_t longest = 0;
    for (const VcdVariable* lane : lanes_) longest = std::max(longest, columnsOf(printable(lane->name)));
    left_ = margin + static_cast<double>(longest) * letterWidth + margin;
    bottom_ = margin + static_cast<double>(lanes_.size()) * (laneHeight + laneGap);
  }

  std::string svg() {
    head();
    axis();
    for (std::size_t i = 0; i < lanes_.size(); ++i)
      lane(*lanes_[i], margin + static_cast<double>(i) * (laneHeight + laneGap) + laneGap / 2);
    missed();
    return text_ + "</svg>\n";
  }

 private:
  // A value between two changes, within what is drawn.
  struct Span {
    double from, to;  // places on the page
    const std::string* value;
  };

  const VcdVariable& variableNamed(const std::string& name) const {
    std::vector<std::string_view> known;
    for (const VcdVariable& each : dump_.variables) {
      if (each.name == name || each.name == dumpName(name)) return each;
      known.push_back(each.name);
    }
    throw WrongUse("no signal of that name" + QorRT::didYouMean(name, known) + ": " + name);
  }

  std::vector<const VcdVariable*> chosenLanes() const {
    std::vector<const VcdVariable*> lanes;
    for (const std::string& name : options_.names) lanes.push_back(&variableNamed(name));
    if (!lanes.empty()) return lanes;
    std::set<std::string> names;
    for (const VcdVariable& each : dump_.variables) names.insert(each.name + "_moved");
    for (const VcdVariable& each : dump_.variables)
      if (each.name != missedPolls && names.count(each.name) == 0) lanes.push_back(&each);
    return lanes;
  }

  double at(double time) const {
    const auto begin = static_cast<double>(options_.begin), end = static_cast<double>(options_.end);
    return left_ + (time - begin) / (end - begin) * (width - margin - left_);
  }

  // Those too narrow to be seen are left out: a page has room for so many.
  std::vector<Span> spansOf(const VcdVariable& variable) const {
    static const std::string unknown = "x";
    std::vector<Span> spans;
    std::uint64_t from = options_.begin;
    const std::string* value = &unknown;
    const auto add = [&](std::uint64_t until) {
      const Span span{at(static_cast<double>(from)), at(static_cast<double>(until)), value};
      if (span.to - span.from >= 0.1) spans.push_back(span);
    };
    for (const VcdChange& change : dump_.signals[variable.signal]) {
      if (change.time >= options_.end) break;
      if (change.time > from) add(change.time);
      from = std::max(from, change.time);
      value = &change.value;
    }
    add(options_.end);
    return spans;
  }

  void head() {
    const std::string w = decimal(width), h = decimal(bottom_ + 34);
    text_ = "<svg xmlns=\"http://www.w3.org/2000/svg\" viewBox=\"0 0 " + w + " " + h + "\" width=\"" + w +
            "\" height=\"" + h + "\" role=\"img\">\n" + style +
            "<rect class=\"card\" x=\"0.5\" y=\"0.5\" width=\"" + decimal(width - 1) + "\" height=\"" +
            decimal(bottom_ + 33) + "\" rx=\"6\"/>\n";
  }

  // About eight marks, at round times.
  void axis() {
    const double begin = static_cast<double>(options_.begin) * dump_.stepSeconds,
                 end = static_cast<double>(options_.end) * dump_.stepSeconds;
    const double mark = roundAbove((end - begin) / 8);
    const auto [unit, seconds] = unitFor(end - begin);
    for (int n = 0; n <= 9; ++n) {
      const double time = (std::ceil(begin / mark - 1e-9) + n) * mark;
      if (time > end + (end - begin) * 1e-9) return;
      char shown[60];
      std::snprintf(shown, sizeof shown, "%.6g%s", time / seconds, time == 0 ? "" : unit);
      const std::string x = decimal(at(time / dump_.stepSeconds));
      text_ +=
          "<path class=\"grid\" d=\"M" + x + " " + decimal(margin) + "V" + decimal(bottom_ + 4) + "\"/>\n";
      label("faint", x, bottom_ + 20, "middle", shown);
    }
  }

  static std::pair<const char*, double> unitFor(double span) {
    if (span >= 2) return {" s", 1};
    if (span >= 2e-3) return {" ms", 1e-3};
    return span >= 2e-6 ? std::pair<const char*, double>{" µs", 1e-6}
                        : std::pair<const char*, double>{" ns", 1e-9};
  }

  void label(const char* kind, const std::string& x, double y, const char* anchor, const std::string& text) {
    text_ += std::string("<text class=\"") + kind + "\" x=\"" + x + "\" y=\"" + decimal(y) +
             "\" text-anchor=\"" + anchor + "\">" + escaped(text) + "</text>\n";
  }

  void lane(const VcdVariable& variable, double y) {
    label("text", decimal(left_ - margin / 2), y + 15, "end", variable.name);
    std::string wave;
    double pen = -1;
    for (const Span& span : spansOf(variable)) {
      if (span.value->find_first_of("xz") != std::string::npos) {
        hatched(span, y, laneHeight, "");
      } else if (variable.width == 1 && span.value->size() == 1) {
        const std::string level = decimal(y + (*span.value == "1" ? 0 : laneHeight));
        wave += (span.from <= pen + 0.1 && pen >= 0 ? "V" + level : "M" + decimal(span.from) + " " + level) +
                "H" + decimal(span.to);
        pen = span.to;
      } else {
        bus(span, y, variable.width);
      }
    }
    if (!wave.empty()) text_ += "<path class=\"wave\" d=\"" + wave + "\"/>\n";
  }

  void hatched(const Span& span, double y, double height, const std::string& title) {
    text_ += "<rect fill=\"url(#unknown)\"" + std::string(title.empty() ? "" : " opacity=\"0.6\"") + " x=\"" +
             decimal(span.from) + "\" y=\"" + decimal(y) + "\" width=\"" + decimal(span.to - span.from) +
             "\" height=\"" + decimal(height) +
             (title.empty() ? "\"/>\n" : "\"><title>" + title + "</title></rect>\n");
  }

  void bus(const Span& span, double y, unsigned bits) {
    const double slope = std::min(4.0, (span.to - span.from) / 2);
    const std::string middle = decimal(y + laneHeight / 2), left = decimal(span.from + slope),
                      right = decimal(span.to - slope);
    text_ += "<path class=\"value\" d=\"M" + decimal(span.from) + " " + middle + "L" + left + " " +
             decimal(y) + "H" + right + "L" + decimal(span.to) + " " + middle + "L" + right + " " +
             decimal(y + laneHeight) + "H" + left + "Z\"/>\n";
    const bool isBinary =
        span.value->find_first_not_of("01") == std::string::npos && span.value->size() <= bits;
    const std::size_t letters = isBinary ? (bits + 3) / 4 : span.value->size();
    if (static_cast<double>(letters) * letterWidth <= span.to - span.from - slope)
      label("text", decimal((span.from + span.to) / 2), y + 15, "middle",
            isBinary ? hexadecimal(*span.value, bits) : *span.value);
  }

  void missed() {
    for (const VcdVariable& variable : dump_.variables) {
      if (variable.name != missedPolls || dump_.signals[variable.signal].empty()) continue;
      const std::uint64_t first = dump_.signals[variable.signal].front().time;
      for (const Span& span : spansOf(variable))
        if (span.value->find('x') != std::string::npos && span.to > at(static_cast<double>(first)))
          hatched(span, margin, bottom_ - margin, "polls missed");
      return;
    }
  }

  const VcdDump& dump_;
  const DrawingOptions& options_;
  std::vector<const VcdVariable*> lanes_;
  double left_ = 0;
  double bottom_ = 0;
  std::string text_;
};

}  // namespace

std::string drawing(const VcdDump& dump, const DrawingOptions& options) {
  return Drawing(dump, options).svg();
}

}  // namespace qor::tool
