#include "programs/shared/NumberStream.h"

#include <cstring>
#include <type_traits>

namespace varnel {

namespace {

constexpr char beginKind = 'B', rowKind = 'R', forgetKind = 'F', generationKind = 'G', eventKind = 'E',
               progressKind = 'P', endKind = 'Z';
constexpr std::size_t headerSize = 5;
constexpr std::size_t longestText = 1 << 16;

template <class T>
void put(std::string& body, const T& value) {
  static_assert(std::is_trivially_copyable_v<T>);
  body.append(reinterpret_cast<const char*>(&value), sizeof value);
}

void putText(std::string& body, std::string_view text) {
  text = text.substr(0, longestText);
  put(body, static_cast<std::uint32_t>(text.size()));
  body.append(text);
}

// Takes values from the front of a body. When they do not fit, all that follows fails too.
class Body {
 public:
  explicit Body(std::string_view bytes) : _bytes(bytes) {}

  template <class T>
  T get() {
    T value{};
    if (!holds(sizeof value)) return value;
    std::memcpy(&value, _bytes.data(), sizeof value);
    _bytes.remove_prefix(sizeof value);
    return value;
  }
  std::string_view text() {
    const auto length = get<std::uint32_t>();
    if (!holds(length)) return {};
    const std::string_view text = _bytes.substr(0, length);
    _bytes.remove_prefix(length);
    return text;
  }
  Time time() {
    const auto seconds = get<std::int64_t>();
    const auto nanoseconds = get<std::int32_t>();
    constexpr std::int32_t nanosecondsPerSecond = 1'000'000'000;
    _fits &= nanoseconds >= 0 && nanoseconds < nanosecondsPerSecond;
    return {seconds, nanoseconds};
  }

  bool fits() const { return _fits; }
  /// Whether everything fitted and nothing is left.
  bool isDone() const { return _fits && _bytes.empty(); }

 private:
  bool holds(std::size_t size) {
    _fits &= _bytes.size() >= size;
    return _fits;
  }

  std::string_view _bytes;
  bool _fits = true;
};

void putTime(std::string& body, Time time) {
  put(body, time.seconds);
  put(body, time.nanoseconds);
}

std::string piece(char kind, std::string_view body) {
  std::string bytes(1, kind);
  put(bytes, static_cast<std::uint32_t>(body.size()));
  return bytes.append(body);
}

}  // namespace

void NumberStreamWriter::begin(bool isDated) { _write(piece(beginKind, isDated ? "1" : "0")); }

std::uint32_t NumberStreamWriter::numberOf(const ValueHistory::Reading& reading) {
  // The unit of a row hardly ever changes. When it does, this is another row of the stream.
  std::string name(reading.key);
  name.append(1, '\0').append(reading.unit);
  const auto found = _rows.find(name);
  if (found != _rows.end()) return found->second;
  if (_rows.size() == NumberStreamReader::mostRows) {
    _rows.clear();
    _write(piece(forgetKind, {}));
  }
  const auto number = static_cast<std::uint32_t>(_rows.size());
  std::string body;
  put(body, static_cast<std::uint32_t>(reading.nameStart));
  put(body, static_cast<std::uint32_t>(reading.nameLength));
  putText(body, reading.key);
  putText(body, reading.unit);
  _write(piece(rowKind, body));
  _rows.emplace(std::move(name), number);
  return number;
}

void NumberStreamWriter::generation(Time time, std::span<const ValueHistory::Reading> readings) {
  // A display never has that many numbers. If it had, forgetting the rows amid it would mix them up.
  if (readings.size() > NumberStreamReader::mostRows / 2)
    readings = readings.first(NumberStreamReader::mostRows / 2);
  if (_rows.size() + readings.size() > NumberStreamReader::mostRows) {
    _rows.clear();
    _write(piece(forgetKind, {}));
  }
  _body.clear();
  putTime(_body, time);
  for (const auto& reading : readings) {
    put(_body, numberOf(reading));
    put(_body, reading.sample);
  }
  _write(piece(generationKind, _body));
}

void NumberStreamWriter::event(const DisplayEvent& event) {
  std::string body;
  putTime(body, event.time);
  put(body, event.kind);
  putText(body, event.section);
  putText(body, event.from);
  putText(body, event.to);
  _write(piece(eventKind, body));
}

void NumberStreamWriter::progress(double share) {
  std::string body;
  put(body, share);
  _write(piece(progressKind, body));
}

void NumberStreamWriter::end(std::string_view why) { _write(piece(endKind, why.substr(0, longestText))); }

bool NumberStreamReader::take(std::string_view bytes) {
  if (_isBroken) return false;
  _pending.append(bytes);
  std::string_view rest = _pending;
  while (rest.size() >= headerSize && !_isBroken) {
    std::uint32_t length = 0;
    std::memcpy(&length, rest.data() + 1, sizeof length);
    _isBroken = length > longestPiece;
    if (_isBroken || rest.size() - headerSize < length) break;
    _isBroken = !takePiece(rest.front(), rest.substr(headerSize, length));
    rest.remove_prefix(headerSize + length);
  }
  _pending.erase(0, _pending.size() - rest.size());
  return !_isBroken;
}

bool NumberStreamReader::takePiece(char kind, std::string_view body) {
  switch (kind) {
    case beginKind:
      _listener.begin(body == "1");
      return true;
    case rowKind:
      return takeRow(body);
    case forgetKind:
      _rows.clear();
      return true;
    case generationKind:
      return takeGeneration(body);
    case eventKind:
      return takeEvent(body);
    case progressKind: {
      Body values(body);
      const auto share = values.get<double>();
      if (!values.isDone() || !(share >= 0 && share <= 1)) return false;
      _listener.progress(share);
      return true;
    }
    case endKind:
      _listener.end(std::string(body));
      return true;
    default:
      return false;
  }
}

bool NumberStreamReader::takeRow(std::string_view body) {
  Body values(body);
  const auto nameStart = values.get<std::uint32_t>(), nameLength = values.get<std::uint32_t>();
  const std::string_view key = values.text(), unit = values.text();
  const bool isSound = values.isDone() && _rows.size() < mostRows && nameStart <= key.size() &&
                       nameLength <= key.size() - nameStart;
  if (isSound) _rows.push_back({std::string(key), std::string(unit), nameStart, nameLength});
  return isSound;
}

bool NumberStreamReader::takeGeneration(std::string_view body) {
  Body values(body);
  const Time time = values.time();
  constexpr std::size_t timeSize = 12, readingSize = sizeof(std::uint32_t) + sizeof(StoredSample);
  if (!values.fits() || (body.size() - timeSize) % readingSize != 0) return false;
  _readings.clear();
  for (std::size_t count = (body.size() - timeSize) / readingSize; count > 0; --count) {
    const auto number = values.get<std::uint32_t>();
    const auto sample = values.get<StoredSample>();
    if (number >= _rows.size()) return false;
    const Row& row = _rows[number];
    _readings.push_back({row.key, row.nameStart, row.nameLength, row.unit, sample});
  }
  _listener.generation(time, _readings);
  return true;
}

bool NumberStreamReader::takeEvent(std::string_view body) {
  Body values(body);
  DisplayEvent event{};
  event.time = values.time();
  const auto kind = values.get<std::uint8_t>();
  event.section = values.text();
  event.from = values.text();
  event.to = values.text();
  if (!values.isDone() || kind > static_cast<std::uint8_t>(EventKind::UnknownVersion)) return false;
  event.kind = static_cast<EventKind>(kind);
  _listener.event(std::move(event));
  return true;
}

}  // namespace varnel
