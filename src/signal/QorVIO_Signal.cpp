#include "QorVIO_Signal.h"

namespace QorRT {

QorVIO_Signal::QorVIO_Signal(unsigned type, unsigned unit, unsigned position, const std::string& name)
    : Qor_Signal(type, unit, position, name) {
  setDefaultParameters();
}

QorVIO_Signal::QorVIO_Signal(const QorVIO_Signal& other) = default;

QorVIO_Signal& QorVIO_Signal::operator=(const QorVIO_Signal& other) = default;

QorVIO_Signal::~QorVIO_Signal() = default;

void QorVIO_Signal::setDefaultParameters() {
  setProperty("format", (getName() + ":%b %a'").c_str());
  setProperty("reset_value", "0");
  setProperty("low_value", "0");
  setProperty("high_value", "1");
}

}  // namespace QorRT
