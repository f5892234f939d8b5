#include "board/model/Condition.h"

#include <algorithm>
#include <cmath>
#include <optional>

#include "board/model/Errors.h"
#include "board/model/Letters.h"

namespace qor {

struct Condition::Node {
  virtual ~Node() = default;
  virtual bool isTrue(const std::vector<Sample>& samples) const = 0;
};

namespace {

using Node = Condition::Node;
using NodePtr = std::shared_ptr<const Node>;

constexpr const char* relationTexts[] = {"==", "!=", "<", ">", "<=", ">="};
constexpr const char* edgeTexts[] = {"rises", "falls", "moves"};

template <class Number>
bool relates(Relation relation, Number a, Number b) {
  switch (relation) {
    case Relation::equal:
      return a == b;
    case Relation::notEqual:
      return a != b;
    case Relation::less:
      return a < b;
    case Relation::greater:
      return a > b;
    case Relation::lessOrEqual:
      return a <= b;
    case Relation::greaterOrEqual:
      break;
  }
  return a >= b;
}

template <class Number>
int order(Number a, Number b) {
  return a < b ? -1 : a > b ? 1 : 0;
}

bool isTopSet(const Bytes& value, unsigned width) {
  return bitAt(value, width - 1) != 0;
}

int orderOfBits(const Bytes& a, const Bytes& b) {
  for (std::size_t i = a.size(); i-- > 0;)
    if (a[i] != b[i]) return order(a[i], b[i]);
  return 0;
}

// A value against a fixed one: in whole bits, or in steps of the scale, which may lie between two values.
class Comparison : public Node {
 public:
  Comparison(const Signal& signal, Relation relation, const Value& value)
      : signal_(signal), relation_(relation), steps_(value.stepsFor(signal)) {
    if (steps_ && std::isnan(*steps_)) throw WrongUse("not a value for " + signal.name + ": " + value.text());
    if (!steps_) wanted_ = value.bitsFor(signal);
  }

  bool isTrue(const std::vector<Sample>& samples) const override {
    const Bytes& image = samples[signal_.core].values(signal_.port);
    return relates(relation_, signal_.width() <= 64 ? orderOfNumber(image) : orderOfWide(image), 0);
  }

 private:
  bool isSigned() const { return signal_.radix == Radix::signedDec; }

  std::int64_t extended(std::uint64_t bits) const {
    const unsigned unused = 64 - signal_.width();
    return static_cast<std::int64_t>(bits << unused) >> unused;
  }

  int orderOfNumber(const Bytes& image) const {
    const std::uint64_t bits = lowBits(signal_, image);
    if (steps_)
      return order(isSigned() ? static_cast<double>(extended(bits)) : static_cast<double>(bits), *steps_);
    std::uint64_t wanted = 0;
    for (auto byte = wanted_.rbegin(); byte != wanted_.rend(); ++byte) wanted = wanted << 8 | *byte;
    return isSigned() ? order(extended(bits), extended(wanted)) : order(bits, wanted);
  }

  int orderOfWide(const Bytes& image) const {
    Bytes value;
    extract(signal_, image, value);
    if (steps_) return order(numberIn(signal_, value), *steps_);
    const unsigned width = signal_.width();
    const bool isBelow = isSigned() && isTopSet(value, width),
               isOtherBelow = isSigned() && isTopSet(wanted_, width);
    return isBelow == isOtherBelow ? orderOfBits(value, wanted_) : isBelow ? -1 : 1;
  }

  Signal signal_;
  Relation relation_;
  std::optional<double> steps_;
  Bytes wanted_;
};

class EdgeNode : public Node {
 public:
  EdgeNode(Signal signal, Edge edge) : signal_(std::move(signal)), edge_(edge) {}

  bool isTrue(const std::vector<Sample>& samples) const override {
    const Sample& sample = samples[signal_.core];
    return (edge_ != Edge::falls && anyOf(signal_, sample.up(signal_.port))) ||
           (edge_ != Edge::rises && anyOf(signal_, sample.down(signal_.port)));
  }

 private:
  Signal signal_;
  Edge edge_;
};

class NotZero : public Node {
 public:
  explicit NotZero(Signal signal) : signal_(std::move(signal)) {}

  bool isTrue(const std::vector<Sample>& samples) const override {
    return anyOf(signal_, samples[signal_.core].values(signal_.port));
  }

 private:
  Signal signal_;
};

class Not : public Node {
 public:
  explicit Not(NodePtr inner) : inner_(std::move(inner)) {}
  bool isTrue(const std::vector<Sample>& samples) const override { return !inner_->isTrue(samples); }

 private:
  NodePtr inner_;
};

class Pair : public Node {
 public:
  Pair(NodePtr a, NodePtr b, bool isAnd) : a_(std::move(a)), b_(std::move(b)), isAnd_(isAnd) {}
  bool isTrue(const std::vector<Sample>& samples) const override {
    return isAnd_ ? a_->isTrue(samples) && b_->isTrue(samples) : a_->isTrue(samples) || b_->isTrue(samples);
  }

 private:
  NodePtr a_, b_;
  bool isAnd_;
};

std::vector<Signal> joined(std::vector<Signal> signals, const std::vector<Signal>& more) {
  for (const Signal& each : more) {
    const bool isThere = std::any_of(signals.begin(), signals.end(),
                                     [&](const Signal& other) { return other.name == each.name; });
    if (!isThere) signals.push_back(each);
  }
  return signals;
}

// In parentheses unless it is a name alone.
std::string enclosed(const Condition& condition) {
  const bool isName = condition.text().find_first_of(" !") == std::string::npos;
  return isName ? condition.text() : "(" + condition.text() + ")";
}

constexpr std::string_view operators = "()&|!=<>";

class Parser {
 public:
  Parser(std::string_view text, const SignalTable& signals) : text_(text), signals_(signals) {}

  Condition parse() {
    Condition condition = anyOfThem();
    if (!atEnd()) fail("& or | is expected here, not", text_.substr(at_));
    return condition;
  }

 private:
  static constexpr unsigned deepest = 200;

  // What the action returns; its failure is at that place.
  template <class Action>
  auto at(std::size_t place, Action action) -> decltype(action()) {
    try {
      return action();
    } catch (const UnknownSignal& error) {
      throw UnknownSignal(column(place) + error.what());
    } catch (const WrongUse& error) {
      throw WrongUse(column(place) + error.what());
    }
  }

  static std::string column(std::size_t place) { return "column " + std::to_string(place + 1) + ": "; }

  // NOLINTNEXTLINE(misc-no-recursion): bounded by `deepest`
  Condition anyOfThem() {
    Condition condition = allOfThem();
    while (take("||") || take("|")) condition = condition || allOfThem();
    return condition;
  }

  // NOLINTNEXTLINE(misc-no-recursion)
  Condition allOfThem() {
    Condition condition = negation();
    while (take("&&") || take("&")) condition = condition && negation();
    return condition;
  }

  // NOLINTNEXTLINE(misc-no-recursion)
  Condition negation() {
    if (++depth_ > deepest) fail("too many parentheses", {});
    Condition condition = take("!") ? !negation() : take("(") ? inParentheses() : simple();
    --depth_;
    return condition;
  }

  // NOLINTNEXTLINE(misc-no-recursion)
  Condition inParentheses() {
    Condition condition = anyOfThem();
    if (!take(")")) fail("a ) is missing", {});
    return condition;
  }

  Condition simple() {
    skipBlanks();
    const std::size_t begin = at_;
    const std::string_view name = takeName();
    if (name.empty()) fail("a signal is expected here", text_.substr(at_, 1));
    const Signal signal = at(begin, [&] { return signals_.find(name, Direction::input); });
    for (std::size_t i = 0; i < std::size(edgeTexts); ++i)
      if (takeWord(edgeTexts[i])) return Condition::edge(signal, static_cast<Edge>(i));
    // The longer ones first, since they begin with the shorter ones.
    for (std::size_t i : {4U, 5U, 0U, 1U, 2U, 3U})
      if (take(relationTexts[i])) return comparison(signal, static_cast<Relation>(i));
    return Condition::isNotZero(signal);
  }

  Condition comparison(const Signal& signal, Relation relation) {
    skipBlanks();
    const std::size_t begin = at_;
    std::string value(takeValue());
    if (value.empty()) fail("a value is expected here", text_.substr(at_, 1));
    if (!signal.unit.empty() && take(signal.unit)) value += signal.unit;
    return at(begin, [&] { return Condition::compare(signal, relation, Value(std::move(value))); });
  }

  std::string_view takeName() {
    const std::size_t begin = at_;
    while (at_ < text_.size() && (isNameByte(text_[at_]) || text_[at_] == '.')) ++at_;
    if (at_ != begin && at_ < text_.size() && text_[at_] == '[')
      at_ = std::min(text_.find(']', at_), text_.size() - 1) + 1;
    return text_.substr(begin, at_ - begin);
  }

  std::string_view takeValue() {
    if (at_ < text_.size() && (text_[at_] == '"' || text_[at_] == '\'')) return takeQuoted(text_[at_]);
    const std::size_t begin = at_;
    while (at_ < text_.size() && text_[at_] != ' ' && operators.find(text_[at_]) == operators.npos) ++at_;
    return text_.substr(begin, at_ - begin);
  }

  std::string_view takeQuoted(char quote) {
    const std::size_t begin = at_ + 1, end = text_.find(quote, begin);
    if (end == text_.npos) fail("the quote has no end", text_.substr(at_));
    at_ = end + 1;
    return text_.substr(begin, end - begin);
  }

  bool take(std::string_view token) {
    skipBlanks();
    if (text_.substr(at_, token.size()) != token) return false;
    at_ += token.size();
    return true;
  }

  bool takeWord(std::string_view word) {
    const std::size_t before = at_;
    if (take(word) && (at_ == text_.size() || !isNameByte(text_[at_]))) return true;
    at_ = before;
    return false;
  }

  void skipBlanks() {
    while (at_ < text_.size() && text_[at_] == ' ') ++at_;
  }

  bool atEnd() {
    skipBlanks();
    return at_ == text_.size();
  }

  [[noreturn]] void fail(const std::string& problem, std::string_view found) const {
    throw WrongUse(column(at_) + problem + (found.empty() ? "" : ": ") + std::string(found));
  }

  std::string_view text_;
  const SignalTable& signals_;
  std::size_t at_ = 0;
  unsigned depth_ = 0;
};

}  // namespace

Condition::Condition(std::shared_ptr<const Node> node, std::vector<Signal> signals, std::string text)
    : node_(std::move(node)), signals_(std::move(signals)), text_(std::move(text)) {}

Condition Condition::parse(std::string_view text, const SignalTable& signals) {
  constexpr std::size_t longest = 4096;
  if (text.size() > longest)
    throw WrongUse("a condition has 4096 characters at most, not " + std::to_string(text.size()));
  Condition condition = Parser(text, signals).parse();
  condition.text_ = text;
  return condition;
}

Condition Condition::compare(const Signal& signal, Relation relation, const Value& value) {
  return {std::make_shared<Comparison>(signal, relation, value),
          {signal},
          signal.name + " " + relationTexts[static_cast<std::size_t>(relation)] + " " + value.text()};
}

Condition Condition::edge(const Signal& signal, Edge edge) {
  return {std::make_shared<EdgeNode>(signal, edge),
          {signal},
          signal.name + " " + edgeTexts[static_cast<std::size_t>(edge)]};
}

Condition Condition::isNotZero(const Signal& signal) {
  return {std::make_shared<NotZero>(signal), {signal}, signal.name};
}

Condition operator&&(const Condition& a, const Condition& b) {
  return {std::make_shared<Pair>(a.node_, b.node_, true), joined(a.signals_, b.signals_),
          enclosed(a) + " && " + enclosed(b)};
}

Condition operator||(const Condition& a, const Condition& b) {
  return {std::make_shared<Pair>(a.node_, b.node_, false), joined(a.signals_, b.signals_),
          enclosed(a) + " || " + enclosed(b)};
}

Condition operator!(const Condition& a) {
  return {std::make_shared<Not>(a.node_), a.signals_, "!" + enclosed(a)};
}

bool Condition::isTrue(const std::vector<Sample>& samples) const {
  return node_->isTrue(samples);
}

}  // namespace qor
