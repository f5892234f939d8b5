/// @file
/// The design around a simulated VIO core: what drives its inputs and uses its outputs.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string>

#include "Qor_Cable.h"

namespace qorsim {

/// The bits of one port, one element (0 or 1) a bit. A view: valid during the call that was given it.
template <class Element>
class PortBits {
 public:
  /// `size` elements from `first` on, which stay the caller's.
  PortBits(Element* first, std::size_t size) : first_(first), size_(size) {}

  /// The port's width, and its bits in order.
  /// @{
  std::size_t size() const { return size_; }
  Element* begin() const { return first_; }
  Element* end() const { return first_ + size_; }
  /// @}

  /// Throws out_of_range for a bit that the port does not have.
  Element& operator[](std::size_t bit) const {
    if (bit >= size_)
      throw std::out_of_range("There is no bit " + std::to_string(bit) + " in a port of " +
                              std::to_string(size_) + " bits");
    return first_[bit];
  }

 private:
  Element* first_;
  std::size_t size_;
};

/// The ports of a core, named as the host names them: outputs go to the design, inputs come from it. An input
/// keeps its value until the design changes it.
struct Ports {
  /// One port each.
  /// @{
  PortBits<const unsigned char> asyncOut;
  PortBits<const unsigned char> syncOut;
  PortBits<unsigned char> asyncIn;
  PortBits<unsigned char> syncIn;
  /// @}

  /// 1 where the input has pulsed; see glitchAsyncIn().
  /// @{
  PortBits<unsigned char> asyncInGlitches;
  PortBits<unsigned char> syncInGlitches;
  /// @}

  /// A pulse on an input that is over before the design clock samples it. Throws out_of_range for a bit that
  /// the port does not have.
  /// @{
  void glitchAsyncIn(std::size_t bit) { asyncInGlitches[bit] = 1; }
  void glitchSyncIn(std::size_t bit) { syncInGlitches[bit] = 1; }
  /// @}
};

/// What a core is connected to. What it throws comes out of the flush() that ran the clock.
class QOR_API Design {
 public:
  virtual ~Design();

  /// Sets the inputs as they are at power-up. They start at 0, and cause no activity.
  virtual void start(Ports& ports);

  /// One design clock: the outputs of this clock are in place, and the inputs are sampled afterwards.
  virtual void clock(Ports& ports) = 0;
};

/// Each input follows the output of the same kind and position; those without one stay 0.
QOR_API std::shared_ptr<Design> loopback();

/// Both input ports show how many design clocks there have been, bit 0 the lowest.
QOR_API std::shared_ptr<Design> counter();

/// Every input bit changes with every design clock.
QOR_API std::shared_ptr<Design> toggle();

/// All inputs stay 0.
QOR_API std::shared_ptr<Design> idle();

/// Calls `clock` once a design clock, and `start`, unless it is empty, at power-up.
QOR_API std::shared_ptr<Design> callback(std::function<void(Ports&)> clock,
                                         std::function<void(Ports&)> start = {});

}  // namespace qorsim
