#include "platform/jtag/cable/wire/Stream.h"

#include <algorithm>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/read.hpp>
#include <boost/asio/write.hpp>
#include <cmath>
#include <future>
#include <stdexcept>
#include <thread>
#include <utility>

#include "platform/jtag/cable/wire/StreamLink.h"

namespace QorRT {
namespace {

using boost::asio::ip::tcp;
using boost::system::error_code;

constexpr std::chrono::milliseconds stopInterval{100};
constexpr std::size_t blockBytes = 65536;

// With one decimal, rounded up.
std::string secondsText(Seconds seconds) {
  const long tenths = std::lround(std::ceil(seconds.count() * 10));
  const std::string decimal = tenths % 10 == 0 ? "" : "." + std::to_string(tenths % 10);
  return std::to_string(tenths / 10) + decimal + " s";
}

std::string countText(std::size_t count, std::size_t wanted) {
  return "gave " + std::to_string(count) + " of " + std::to_string(wanted) + " answers";
}

/// Operations that refer to variables of their caller: none outlives it, though that ends the connection.
struct Running {
  explicit Running(Stream::Link& itsLink) : link(itsLink) {}
  ~Running() {  // NOLINT(bugprone-exception-escape): nothing of what runs here throws
    error_code ignored;
    if (count > 0) link.socket.close(ignored);
    for (; count > 0; link.io.run_one()) link.io.restart();
  }
  Running(const Running&) = delete;
  Running& operator=(const Running&) = delete;

  Stream::Link& link;
  int count = 0;
};

}  // namespace

/// When an answer is whole, how long it may be, and what is said of one that is not.
struct Stream::Wanted {
  std::function<bool(const std::string& in)> isWhole;
  std::size_t most;
  std::function<std::string(std::size_t count)> seen;
};

/// What a name leads to.
struct Stream::Places {
  tcp::resolver::results_type all;
};

Stream::Stream(const Endpoint& endpoint, const Deadline& deadline, StopFunction stop)
    : Stream(std::make_unique<Link>(), endpoint.text(), std::move(stop)) {
  connect(endpoint, deadline);
  isSilent_ = true;
  link_->socket.set_option(tcp::no_delay(true));
}

Stream::Stream(std::unique_ptr<Link> link, std::string name, StopFunction stop)
    : link_(std::move(link)), name_(std::move(name)), stop_(std::move(stop)) {}

Stream::~Stream() = default;

void Stream::connect(const Endpoint& endpoint, const Deadline& deadline) {
  error_code error;
  for (const auto& each : find(endpoint, deadline).all) {
    tcp::socket made(link_->io, each.endpoint().protocol());
    keepPrivate(link_->socket, made, each.endpoint().protocol());
    Running running(*link_);
    running.count = 1;
    link_->socket.async_connect(each.endpoint(), [&](error_code result) {
      error = result;
      running.count = 0;
    });
    runUntil([&] { return running.count == 0; }, [] { return "could not be reached"; }, deadline);
    if (!error) return;
    link_->socket.close();
  }
  fail("cannot be reached: " + error.message());
}

// A look-up in the network ends when it likes: it has a thread of its own, which is left alone when it takes too long.
Stream::Places Stream::find(const Endpoint& endpoint, const Deadline& deadline) {
  error_code error;
  Places places{
      tcp::resolver(link_->io).resolve(endpoint.host, endpoint.port, tcp::resolver::numeric_host, error)};
  if (!error) return places;
  std::packaged_task<tcp::resolver::results_type()> task([endpoint] {
    boost::asio::io_context io;
    return tcp::resolver(io).resolve(endpoint.host, endpoint.port);
  });
  auto found = task.get_future();
  std::thread(std::move(task)).detach();
  while (found.wait_for(stopInterval) != std::future_status::ready)
    requireTime([] { return "could not be found"; }, deadline);
  try {
    return {found.get()};
  } catch (const boost::system::system_error& unknown) {
    fail("cannot be found: " + unknown.code().message());
  }
}

std::string Stream::exchange(std::string_view out, std::size_t count, const Deadline& deadline) {
  const auto isWhole = [count](const std::string& in) { return in.size() >= count; };
  const auto seen = [count](std::size_t got) { return countText(got, count); };
  std::string in = transfer(out, {isWhole, count + 1, seen}, deadline);
  if (in.size() > count) fail("gave more answers than the " + std::to_string(count) + " that were due");
  return in;
}

std::string Stream::ask(std::string_view out, char end, std::size_t most, const Deadline& deadline) {
  std::size_t place = 0;  // of the end, or where it is searched next
  const auto isWhole = [&place, end](const std::string& in) {
    place = std::min(in.find(end, place), in.size());
    return place < in.size();
  };
  std::string in = transfer(out, {isWhole, most + 1, [](std::size_t) { return "gave no answer"; }}, deadline);
  if (place == in.size()) fail("answered more than " + std::to_string(most) + " bytes");
  if (place + 1 != in.size()) fail("answered more than it was asked");
  in.pop_back();
  return in;
}

// Sends and receives at the same time: a server may answer before it has heard everything.
std::string Stream::transfer(std::string_view out, const Wanted& wanted, const Deadline& deadline) {
  std::string in;
  in.reserve(std::min(wanted.most, blockBytes));
  std::size_t got = 0;  // the text is longer meanwhile
  error_code error;
  Running running(*link_);
  const auto ended = [&](error_code result, std::size_t) {
    if (!error) error = result;
    --running.count;
  };
  running.count = 2;
  boost::asio::async_write(link_->socket, boost::asio::buffer(out), ended);
  boost::asio::async_read(
      link_->socket, boost::asio::dynamic_buffer(in, wanted.most),
      [&](error_code result, std::size_t count) {
        got = count;
        isSilent_ = isSilent_ && count == 0;
        return result || wanted.isWhole(in) ? 0 : blockBytes;
      },
      ended);
  const auto seen = [&] { return wanted.seen(got); };
  runUntil([&] { return running.count == 0 || error; }, seen, deadline);
  if (error == boost::asio::error::eof) fail(seen() + ", then closed the connection");
  if (error) fail(seen() + ", then broke the connection: " + error.message());
  return in;
}

void Stream::runUntil(const std::function<bool()>& done, const std::function<std::string()>& seen,
                      const Deadline& deadline) {
  while (!done()) {
    link_->io.restart();
    link_->io.run_one_until(std::min(deadline.end, Deadline::Clock::now() + stopInterval));
    if (done()) return;
    requireTime(seen, deadline);
  }
}

void Stream::requireTime(const std::function<std::string()>& seen, const Deadline& deadline) {
  if (stop_ && deadline.mayStop() && stop_()) fail(seen() + " before the host stopped the wait");
  if (Deadline::Clock::now() >= deadline.end)
    fail(seen() + " within " + secondsText(deadline.allowed) +
         (isSilent_ ? ": another program may be connected" : ""));
}

void Stream::fail(const std::string& seen) const {
  throw std::runtime_error(name_ + " " + seen);
}

}  // namespace QorRT
