#include "QorVIO_SignalGroup.h"

namespace QorRT {

QorVIO_SignalGroup::QorVIO_SignalGroup(QorVIO_Command* ownCommand, unsigned type,
                                       std::vector<unsigned>& positions, const std::string& name,
                                       const std::string& ownKeyName)
    : Qor_SignalGroup(type, 0, positions, name), keyName(ownKeyName), command(ownCommand) {}

QorVIO_SignalGroup::QorVIO_SignalGroup(const QorVIO_SignalGroup& other) = default;

QorVIO_SignalGroup& QorVIO_SignalGroup::operator=(const QorVIO_SignalGroup& other) {
  if (this == &other) return *this;
  std::string otherKeyName = other.keyName;
  Qor_SignalGroup::operator=(other);
  keyName.swap(otherKeyName);
  command = other.command;
  return *this;
}

QorVIO_SignalGroup::~QorVIO_SignalGroup() = default;

unsigned QorVIO_SignalGroup::size() const {
  return static_cast<unsigned>(getPositionVector().size());
}

}  // namespace QorRT
