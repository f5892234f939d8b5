// Signals and conditions as Python objects.
#pragma once

#include <memory>

#include "bindings/python/Session.h"
#include "board/model/Condition.h"

namespace qor::python {

/// A condition, and the board whose signals it is about.
struct BoardCondition {
  Condition condition;
  std::shared_ptr<Names> names;
};

/// A signal of a board: what is read, what is written, or both under one name. One of them is null otherwise.
struct BoardSignal {
  std::shared_ptr<Session> session;
  const Field* input;
  const Field* output;

  const Signal& signal() const { return (input != nullptr ? input : output)->signal; }

  /// Throws WrongUse where there is none.
  /// @{
  const Field& forReading() const;
  const Field& forWriting() const;
  /// @}

  BoardCondition condition(Condition condition) const {
    return {std::move(condition), session->sharedNames()};
  }
};

/// A condition of that board from a BoardCondition, or from a signal, which is true unless it is 0. Throws WrongUse for
/// one of another board, and TypeError for anything else.
Condition conditionFrom(py::handle object, const std::shared_ptr<Names>& names);

void bindSignals(py::module_& module);
void bindConditions(py::module_& module);

}  // namespace qor::python
