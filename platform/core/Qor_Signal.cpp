#include "QorCore.h"

namespace QorRT {

Qor_SignalBase::Qor_SignalBase(unsigned type, const std::string& name) : type_(type), name_(name) {}
Qor_SignalBase::Qor_SignalBase(const Qor_SignalBase&) = default;
Qor_SignalBase::~Qor_SignalBase() = default;

Qor_SignalBase& Qor_SignalBase::operator=(const Qor_SignalBase& other) {
  std::string name(other.name_);
  std::map<std::string, std::string> properties(other.properties_);
  type_ = other.type_;
  name_.swap(name);
  properties_.swap(properties);
  return *this;
}

std::string Qor_SignalBase::getProperty(const std::string& name) const {
  const auto entry = properties_.find(name);
  return entry == properties_.end() ? std::string() : entry->second;
}

void Qor_SignalBase::setProperty(const char* name, const char* value) {
  properties_.insert_or_assign(std::string(name), std::string(value));
}

void Qor_SignalBase::setProperty(std::string& name, std::string& value) {
  properties_.insert_or_assign(name, std::string(value));
}

Qor_Signal::Qor_Signal(unsigned type, unsigned unit, unsigned position, const std::string& name)
    : Qor_SignalBase(type, name), unit_(unit), position_(position) {}

Qor_SignalGroup::Qor_SignalGroup(unsigned type, unsigned /*unit*/, std::vector<unsigned>& positions,
                                 const std::string& name)
    : Qor_SignalBase(type | SIGNAL_TYPE_GROUP, name), positions_(positions) {}

Qor_SignalGroup& Qor_SignalGroup::operator=(const Qor_SignalGroup& other) {
  std::vector<unsigned> positions(other.positions_);
  Qor_SignalBase::operator=(other);
  positions_.swap(positions);
  return *this;
}

}  // namespace QorRT
