#include "programs/varnel-telephonyd/live/LiveFeed.h"

#include <algorithm>

#include "base/PropertyList.h"
#include "programs/varnel-telephonyd/simulation/PacketWriter.h"

namespace varnel {

namespace {

constexpr std::uint32_t firstCode = 0xFF0000;
// Each packet is a picture of its moment, so a viewer that does not read misses little.
constexpr std::size_t mostWaiting = 256;

}  // namespace

// The packets for one viewer that it has not taken yet.
class LiveFeed::Source final : public MessageSource {
 public:
  explicit Source(LiveFeed& feed) : _feed(feed), _startedAt(feed._setup.uptime()) {
    for (const Packet& packet : _feed._last)
      if (!packet.message.empty()) push(packet);
    _feed._sources.push_back(this);
  }
  Source(const Source&) = delete;
  Source& operator=(const Source&) = delete;
  ~Source() override {
    _feed._sources.remove(this);
    if (!_feed.hasViewers() && _feed._setup.viewersChanged) _feed._setup.viewersChanged();
  }

  std::optional<StreamMessage> next() override {
    if (_waiting.empty()) return std::nullopt;
    StreamMessage message = std::move(_waiting.front().message);
    _waiting.pop_front();
    return message;
  }
  bool isWaiting() const override { return true; }
  void setNewsHandler(std::function<void()> handler) override { _handler = std::move(handler); }
  std::string waitNote() const override { return _feed._note; }
  std::string nameOfLast() const override { return "A packet of " + _feed._setup.name; }
  // A packet that is dropped may never come again, so that a viewer that reads again must get it.
  Lateness lateness() const override { return Lateness::Waits; }
  std::uint64_t takeLost() override { return std::exchange(_lost, 0); }
  std::size_t waiting() const override { return _waiting.size(); }

  void push(const Packet& packet) {
    _waiting.push_back({&packet, {_feed._setup.uptime() - _startedAt, packet.message}});
    if (_waiting.size() <= mostWaiting) return;
    // One of them at least has a newer one of its kind behind it, for there are few kinds.
    _waiting.erase(std::ranges::find_if(_waiting, [this](const Waiting& one) { return isOutdated(one); }));
    ++_lost;
  }
  void callHandler() const {
    if (_handler) _handler();
  }

 private:
  struct Waiting {
    const Packet* kind;  // the place of the last packet of this kind
    StreamMessage message;
  };

  bool isOutdated(const Waiting& one) const {
    const auto isOfItsKind = [&](const Waiting& other) { return other.kind == one.kind; };
    return &*std::ranges::find_if(_waiting.rbegin(), _waiting.rend(), isOfItsKind) != &one;
  }

  LiveFeed& _feed;
  const std::chrono::milliseconds _startedAt;
  std::deque<Waiting> _waiting;
  std::uint64_t _lost = 0;
  std::function<void()> _handler;
};

std::unique_ptr<MessageSource> LiveFeed::makeSource() {
  const bool isFirst = !hasViewers();
  auto source = std::make_unique<Source>(*this);
  if (isFirst && _setup.viewersChanged) _setup.viewersChanged();
  return source;
}

void LiveFeed::send(std::uint32_t logCode, const Value& payload, Repetition repetition) {
  Packet& last = _last.at(logCode - firstCode);
  auto bytes = writeBinaryPropertyList(payload);
  if (!bytes || (repetition == Repetition::IsLeftOut && *bytes == last.payload)) return;
  last.payload = *std::move(bytes);
  last.message = simulation::serverMessage(static_cast<std::uint16_t>(logCode - firstCode), _setup.uptime(),
                                           last.payload);
  ++_sent;
  for (Source* const source : _sources) source->push(last);
  // A handler may end its channel, and so its source.
  const auto sources = _sources;
  for (const Source* const source : sources)
    if (std::ranges::find(_sources, source) != _sources.end()) source->callHandler();
}

void LiveFeed::setNote(const std::string& note) {
  if (note == _note) return;
  _note = note;
  for (const Source* const source : std::list(_sources))
    if (std::ranges::find(_sources, source) != _sources.end()) source->callHandler();
}

}  // namespace varnel
