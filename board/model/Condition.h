/// @file
/// Conditions on inputs: "state == RUN && level > 3 V", "fault rises || !ready".
///
///     or:     and { ("|" | "||") and }
///     and:    not { ("&" | "&&") not }
///     not:    "!" not | "(" or ")" | NAME [ relation VALUE | "rises" | "falls" | "moves" ]
///
/// A relation is == != < > <= >=. A name is an input or a slice of one, "leds[3]"; alone it is true unless its value is 0.
/// A value is what write takes for that signal: a name of its enumeration, a number with or without its unit, digits in
/// its radix; in single or double quotes where it has blanks or operators in it. Signals whose radix is signedDec compare
/// with their sign. rises, falls and moves are true when any bit did so since the poll before.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "board/Export.h"
#include "board/model/Sample.h"
#include "board/model/SignalTable.h"
#include "board/model/Value.h"

namespace qor {

enum class Relation { equal, notEqual, less, greater, lessOrEqual, greaterOrEqual };
enum class Edge { rises, falls, moves };

class QORBOARD_API Condition {
 public:
  /// Throws WrongUse, "column N: what is wrong".
  static Condition parse(std::string_view text, const SignalTable& signals);

  /// Parts of a condition as objects. Throw WrongUse for a value that the signal cannot have.
  /// @{
  static Condition compare(const Signal& signal, Relation relation, const Value& value);
  static Condition edge(const Signal& signal, Edge edge);
  static Condition isNotZero(const Signal& signal);
  friend QORBOARD_API Condition operator&&(const Condition& a, const Condition& b);
  friend QORBOARD_API Condition operator||(const Condition& a, const Condition& b);
  friend QORBOARD_API Condition operator!(const Condition& a);
  /// @}

  /// Whether it is true of the samples, one per core of the table. Allocates nothing, but for values of more than 64 bits.
  bool isTrue(const std::vector<Sample>& samples) const;

  /// The inputs that it looks at, each once, in order.
  const std::vector<Signal>& signals() const { return signals_; }

  /// As it was parsed, or built.
  const std::string& text() const { return text_; }

  struct Node;

 private:
  Condition(std::shared_ptr<const Node> node, std::vector<Signal> signals, std::string text);

  std::shared_ptr<const Node> node_;
  std::vector<Signal> signals_;
  std::string text_;
};

}  // namespace qor
