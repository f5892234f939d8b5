/// @file
/// The one reader of a board's inputs, and those who look at what it read.
///
/// A read of a core takes its activity flags with it, so that two readers would take them from each other. A Poller reads
/// once for all its subscriptions and keeps for each of them what moved since that one looked: a slow one loses no flag.
#pragma once

#include <cstdint>
#include <vector>

#include "board/Export.h"
#include "board/model/Sample.h"
#include "board/session/Core.h"

namespace qor {

class Subscription;

class QORBOARD_API Poller {
 public:
  /// The cores, as Signal::core counts them, must outlive it.
  explicit Poller(std::vector<Core*> cores);
  Poller(const Poller&) = delete;
  Poller& operator=(const Poller&) = delete;

  /// Reads every core that a subscription to inputs looks at, in one exchange each. Allocates nothing. Throws Failure; the
  /// cores before the one that failed have been read, and nothing of them is lost.
  void poll();

  /// The same of every core.
  void pollAll();

  /// The same of one core, as Signal::core counts them.
  void poll(std::size_t core);

  std::vector<QOR_CORE_REF> cores() const;

  /// How many polls there were that did not fail.
  std::uint64_t polls() const { return polls_; }

 private:
  friend class Subscription;

  struct PolledCore {
    Core* core;
    Sample sample;
    std::vector<Subscription*> subscriptions;
    unsigned watched;  ///< how many of them are to inputs
  };

  void read(std::size_t core);

  std::vector<PolledCore> cores_;
  std::uint64_t polls_ = 0;
};

/// What one of them sees. Used by the thread that polls.
class QORBOARD_API Subscription {
 public:
  /// Looks at the cores of these inputs. The poller must outlive it. An input may be named twice.
  Subscription(Poller& poller, std::vector<Signal> inputs);

  /// Looks at all cores, at no input in particular: poll() reads none for it, but what others have read counts.
  explicit Subscription(Poller& poller);

  /// Goes on from where another one is: what that one has not looked at, this one has not either.
  Subscription(const Subscription& other);

  Subscription& operator=(const Subscription&) = delete;
  ~Subscription();

  const std::vector<Signal>& inputs() const { return inputs_; }

  /// The newest values, and what moved since the look before; one element per core, empty for cores that it does not look
  /// at. Allocates nothing. Valid until the next look.
  const std::vector<Sample>& look();

  /// The same without a look: valid until the next poll.
  const std::vector<Sample>& pending() const { return pending_; }

  /// Which inputs differ between the last two looks: in value; in any activity flag; in either.
  /// All of them after the first look. To be asked for before the next poll; valid until the next of these calls.
  /// @{
  const std::vector<std::size_t>& changedValues();
  const std::vector<std::size_t>& changedMoves();
  const std::vector<std::size_t>& changed();
  /// @}

 private:
  friend class Poller;

  /// The inputs of each bit of a port: those of bit i are users[first[i]] to users[first[i + 1]].
  struct BitIndex {
    std::vector<std::size_t> first, users;
  };

  void subscribe();
  void index();
  void take(std::size_t core, const Sample& sample);
  template <class Differing>
  const std::vector<std::size_t>& find(Differing differing);
  template <class Differing>
  void mark(std::size_t core, Port port, Differing differing);

  Poller& poller_;
  std::vector<Signal> inputs_;
  std::vector<std::size_t> cores_;
  std::vector<Sample> pending_, taken_;
  std::vector<unsigned char> isFresh_;  // of a core: nothing was read since the look
  std::vector<BitIndex> indexes_;       // two per core: async, sync
  unsigned looks_ = 0;                  // no more than two are counted
  std::vector<std::size_t> marked_;
  std::vector<unsigned char> isMarked_;
};

}  // namespace qor
