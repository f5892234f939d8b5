// The inside of a Stream, for the few sources that work on sockets.
#pragma once

#include <boost/asio/generic/stream_protocol.hpp>
#include <boost/asio/io_context.hpp>

#include "os/Descriptor.h"
#include "platform/jtag/cable/wire/Stream.h"

namespace QorRT {

using Socket = boost::asio::generic::stream_protocol::socket;

struct Stream::Link {
  boost::asio::io_context io{1};
  Socket socket{io};
};

/// Moves a socket that was just made into one that no other program inherits.
template <class Other>
void keepPrivate(Socket& socket, Other& made, const typename Other::protocol_type& protocol) {
  socket.assign(protocol, os::keptPrivate(made.release()));
}

}  // namespace QorRT
