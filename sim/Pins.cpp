#include "Pins.h"

namespace qorsim {

Pins::~Pins() = default;

}  // namespace qorsim
