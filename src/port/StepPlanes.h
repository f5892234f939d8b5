// The 16 values of every synchronous output, turned from one string a step into one string a bit.
#pragma once

#include <array>
#include <string>

#include "QorVIO_Command.h"

namespace QorRT {

/// Values at each step of some bits of a port: character i of plane s belongs to the i-th of them at step s.
using StepPlanes = std::array<std::string, QorVIO_Command::stepCount>;

/// Makes room for the planes of a port, so that staging it allocates nothing.
void reservePlanes(StepPlanes& planes, unsigned width);

/// Gives every bit of a port its pulse train, from 16 port images of `width` bits that follow one after
/// another in `stepBits`. Works through the port piece by piece, so that the pieces stay in the nearest
/// cache; `planes` is room for one, which a caller may keep for the next time.
void stagePulseTrains(const unsigned char* stepBits, unsigned width, StepPlanes& planes,
                      QorVIO_Command& command);

}  // namespace QorRT
