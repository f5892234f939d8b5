#include "board/record/Poller.h"

#include <algorithm>
#include <cstring>
#include <numeric>

namespace qor {
namespace {

using Image = Bytes Sample::*;

constexpr Image valueImages[] = {&Sample::asyncIn, &Sample::syncIn};
constexpr Image flagImages[] = {&Sample::asyncUp,  &Sample::asyncDown,  &Sample::syncUp,
                                &Sample::syncDown, &Sample::syncSyncUp, &Sample::syncSyncDown};

// Eight bytes of an image, fewer at its end; bit i of the word is bit i of the image from `byte` on.
std::uint64_t wordAt(const Bytes& image, std::size_t byte) {
  std::uint64_t word = 0;
  if (image.size() - byte >= sizeof word) {
    std::memcpy(&word, image.data() + byte, sizeof word);
    return word;
  }
  for (std::size_t i = byte; i < image.size(); ++i) word |= std::uint64_t{image[i]} << 8 * (i - byte);
  return word;
}

// The bits of a word whose flags are not the same in both.
std::uint64_t flagsDiffer(const Sample& now, const Sample& before, Port port, std::size_t byte) {
  const auto differ = [&](const Bytes& a, const Bytes& b) { return wordAt(a, byte) ^ wordAt(b, byte); };
  const std::uint64_t word =
      differ(now.up(port), before.up(port)) | differ(now.down(port), before.down(port));
  if (port == Port::asyncIn) return word;
  return word | differ(now.syncSyncUp, before.syncSyncUp) | differ(now.syncSyncDown, before.syncSyncDown);
}

void addFlags(Bytes& image, const Bytes& more) {
  for (std::size_t i = 0; i < image.size(); ++i) image[i] = static_cast<unsigned char>(image[i] | more[i]);
}

}  // namespace

Poller::Poller(std::vector<Core*> cores) {
  for (Core* each : cores) cores_.push_back({each, emptySample(each->info()), {}, 0});
}

void Poller::poll() {
  for (std::size_t core = 0; core < cores_.size(); ++core)
    if (cores_[core].watched != 0) read(core);
  ++polls_;
}

void Poller::pollAll() {
  for (std::size_t core = 0; core < cores_.size(); ++core) read(core);
  ++polls_;
}

void Poller::poll(std::size_t core) {
  read(core);
  ++polls_;
}

void Poller::read(std::size_t core) {
  PolledCore& each = cores_[core];
  each.core->read(each.sample);
  for (Subscription* subscription : each.subscriptions) subscription->take(core, each.sample);
}

std::vector<QOR_CORE_REF> Poller::cores() const {
  std::vector<QOR_CORE_REF> refs;
  for (const PolledCore& each : cores_) refs.push_back(each.core->ref());
  return refs;
}

Subscription::Subscription(Poller& poller, std::vector<Signal> inputs)
    : poller_(poller), inputs_(std::move(inputs)), isMarked_(inputs_.size()) {
  for (const Signal& each : inputs_)
    if (std::find(cores_.begin(), cores_.end(), each.core) == cores_.end()) cores_.push_back(each.core);
  subscribe();
  index();
}

Subscription::Subscription(Poller& poller) : poller_(poller), cores_(poller.cores_.size()) {
  std::iota(cores_.begin(), cores_.end(), std::size_t{0});
  subscribe();
}

Subscription::Subscription(const Subscription& other)
    : poller_(other.poller_), inputs_(other.inputs_), cores_(other.cores_), isMarked_(inputs_.size()) {
  subscribe();
  pending_ = other.pending_;
  taken_ = other.taken_;
  isFresh_ = other.isFresh_;
  index();
}

Subscription::~Subscription() {
  for (std::size_t core : cores_) {
    Poller::PolledCore& polled = poller_.cores_[core];
    auto& all = polled.subscriptions;
    all.erase(std::remove(all.begin(), all.end(), this), all.end());
    polled.watched -= inputs_.empty() ? 0 : 1;
  }
}

void Subscription::subscribe() {
  pending_.resize(poller_.cores_.size());
  isFresh_.assign(pending_.size(), 1);
  for (std::size_t core : cores_) {
    pending_[core] = emptySample(poller_.cores_[core].core->info());
    poller_.cores_[core].subscriptions.push_back(this);
    poller_.cores_[core].watched += inputs_.empty() ? 0 : 1;
  }
  taken_ = pending_;
}

void Subscription::index() {
  indexes_.resize(2 * pending_.size());
  marked_.reserve(inputs_.size());
  for (std::size_t i = 0; i < indexes_.size(); ++i) {
    const Port port = i % 2 == 0 ? Port::asyncIn : Port::syncIn;
    std::vector<std::vector<std::size_t>> users(8 * pending_[i / 2].values(port).size());
    for (std::size_t input = 0; input < inputs_.size(); ++input)
      for (unsigned bit : inputs_[input].bits)
        if (inputs_[input].core == i / 2 && inputs_[input].port == port) users.at(bit).push_back(input);
    for (const auto& each : users) {
      indexes_[i].first.push_back(indexes_[i].users.size());
      indexes_[i].users.insert(indexes_[i].users.end(), each.begin(), each.end());
    }
    indexes_[i].first.push_back(indexes_[i].users.size());
  }
}

void Subscription::take(std::size_t core, const Sample& sample) {
  Sample& mine = pending_[core];
  for (Image image : valueImages) mine.*image = sample.*image;
  const bool isFirst = isFresh_[core] != 0;
  for (Image image : flagImages)
    isFirst ? void(mine.*image = sample.*image) : addFlags(mine.*image, sample.*image);
  isFresh_[core] = 0;
}

const std::vector<Sample>& Subscription::look() {
  std::swap(pending_, taken_);
  for (std::size_t core : cores_) {
    if (isFresh_[core] != 0) {  // nothing was read: the values of the look before, and no activity
      for (Image image : valueImages) taken_[core].*image = pending_[core].*image;
      for (Image image : flagImages) std::fill((taken_[core].*image).begin(), (taken_[core].*image).end(), 0);
    }
    isFresh_[core] = 1;
  }
  looks_ = std::min(looks_ + 1, 2U);
  return taken_;
}

// Marks the inputs of the bits in which `differing(now, before, byte)` has a 1.
template <class Differing>
void Subscription::mark(std::size_t core, Port port, Differing differing) {
  const Sample &now = taken_[core], &before = pending_[core];
  const BitIndex& index = indexes_[2 * core + (port == Port::asyncIn ? 0 : 1)];
  for (std::size_t byte = 0; byte < now.values(port).size(); byte += sizeof(std::uint64_t)) {
    std::size_t bit = 8 * byte;
    for (std::uint64_t word = differing(now, before, byte); word != 0; word >>= 1, ++bit) {
      if ((word & 1) == 0) continue;
      for (std::size_t i = index.first[bit]; i < index.first[bit + 1]; ++i) {
        const std::size_t input = index.users[i];
        if (isMarked_[input] != 0) continue;
        isMarked_[input] = 1;
        marked_.push_back(input);
      }
    }
  }
}

template <class Differing>
const std::vector<std::size_t>& Subscription::find(Differing differing) {
  for (std::size_t input : marked_) isMarked_[input] = 0;
  marked_.clear();
  if (looks_ < 2) {
    marked_.resize(inputs_.size());
    std::iota(marked_.begin(), marked_.end(), std::size_t{0});
    return marked_;
  }
  for (std::size_t core : cores_) {
    for (Port port : {Port::asyncIn, Port::syncIn}) {
      mark(core, port, [&](const Sample& now, const Sample& before, std::size_t byte) {
        return differing(now, before, port, byte);
      });
    }
  }
  return marked_;
}

const std::vector<std::size_t>& Subscription::changedValues() {
  return find([](const Sample& now, const Sample& before, Port port, std::size_t byte) {
    return wordAt(now.values(port), byte) ^ wordAt(before.values(port), byte);
  });
}

const std::vector<std::size_t>& Subscription::changedMoves() {
  // A bit that moved otherwise than before need not be the only one of its input.
  return find(flagsDiffer);
}

const std::vector<std::size_t>& Subscription::changed() {
  return find([](const Sample& now, const Sample& before, Port port, std::size_t byte) {
    return (wordAt(now.values(port), byte) ^ wordAt(before.values(port), byte)) |
           flagsDiffer(now, before, port, byte);
  });
}

}  // namespace qor
