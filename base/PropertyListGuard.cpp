#include "base/PropertyListGuard.h"

#include <algorithm>
#include <cstdint>
#include <numeric>
#include <optional>
#include <string_view>
#include <vector>

#include "base/PropertyListText.h"

namespace varnel {

namespace {

constexpr std::string_view binaryMagic = "bplist00";

/// Walks over the markup of an XML list. Where the parser could read it differently, this walk is stricter:
/// each token must end at its first terminator, even inside quotes.
class XmlScan {
 public:
  XmlScan(ByteView bytes, const PropertyListLimits& limits)
      : _rest(reinterpret_cast<const char*>(bytes.data()), bytes.size()),
        _depth(limits.depth),
        _nodes(limits.expandedNodes),
        _keyPairs(limits.keyPairs),
        _entityMoves(limits.entityMoves),
        _pathBytes(limits.pathBytes) {}

  bool passes() {
    // The parser takes U+0000 as the end of a name or a text.
    if (_rest.find('\0') != std::string_view::npos) return false;
    while (passText()) {
      if (_rest.empty()) return _containers.empty();
      if (!passMarkup()) return false;
    }
    return false;
  }

 private:
  // For each entity the parser moves the rest of the text.
  bool passText() {
    const std::string_view text = _rest.substr(0, _rest.find('<'));
    _rest.remove_prefix(text.size());
    const auto entities = static_cast<std::size_t>(std::count(text.begin(), text.end(), '&'));
    return _entityMoves.take(entities * text.size());
  }

  bool passMarkup() {
    if (takePrefix("<!--")) return takeUntil("-->").has_value();
    if (takePrefix("<![CDATA[")) return takeUntil("]]>").has_value();
    if (takePrefix("<?")) return passUnquoted(takeUntil("?>"));
    if (takePrefix("<!DOCTYPE")) {
      const auto declaration = takeUntil(">");
      return passUnquoted(declaration) && declaration->find('[') == std::string_view::npos;
    }
    if (_keyText) endKey();
    _rest.remove_prefix(1);
    const auto tag = takeUntil(">");
    return passUnquoted(tag) && passTag(*tag);
  }

  bool passTag(std::string_view tag) {
    const bool isEmpty = tag.ends_with('/');
    if (isEmpty) tag.remove_suffix(1);
    if (tag.starts_with('/')) return !isContainer(tag.substr(1)) || leave();
    if (!_nodes.take(1)) return false;
    if (isNamed(tag, "key")) return passKey();
    return _pathBytes.take(pathHere()) && (!isContainer(tag) || enter(isEmpty));
  }

  static bool isContainer(std::string_view tag) { return isNamed(tag, "dict") || isNamed(tag, "array"); }

  static bool isNamed(std::string_view tag, std::string_view name) {
    constexpr std::string_view space = " \t\r\n";
    return tag.starts_with(name) &&
           (tag.size() == name.size() || space.find(tag[name.size()]) != std::string_view::npos);
  }

  bool enter(bool isEmpty) {
    if (_containers.size() == _depth) return false;
    if (!isEmpty) _containers.push_back({.path = pathHere()});
    return true;
  }

  bool leave() {
    if (_containers.empty()) return false;
    _containers.pop_back();
    return true;
  }

  // Adds the difference between the squares of the old and the new number of keys.
  bool passKey() {
    _keyText = _rest.data();
    return _containers.empty() || _keyPairs.take(2 * _containers.back().keyCount++ + 1);
  }

  // A key ends with the next tag. Its entities and sections count as written, which is longer than their
  // text.
  void endKey() {
    const auto length = static_cast<std::size_t>(_rest.data() - *_keyText);
    if (!_containers.empty()) _containers.back().key = length;
    _keyText.reset();
  }

  // The length of the path of a value at this place.
  std::size_t pathHere() const {
    return _containers.empty() ? 0 : _containers.back().path + _containers.back().key + 1;
  }

  bool takePrefix(std::string_view prefix) {
    if (!_rest.starts_with(prefix)) return false;
    _rest.remove_prefix(prefix.size());
    return true;
  }

  // Takes the terminator and all before it; yields what was before it.
  std::optional<std::string_view> takeUntil(std::string_view terminator) {
    const std::size_t length = _rest.find(terminator);
    if (length == std::string_view::npos) return std::nullopt;
    const std::string_view taken = _rest.substr(0, length);
    _rest.remove_prefix(length + terminator.size());
    return taken;
  }

  // The parser ignores terminators inside quotes. This walk refuses a token that ends inside quotes, so both
  // see the same end.
  static bool passUnquoted(std::optional<std::string_view> token) {
    return token && std::count(token->begin(), token->end(), '"') % 2 == 0 &&
           token->find('<') == std::string_view::npos;
  }

  struct Container {
    std::size_t path;          // the length of its own path
    std::size_t keyCount = 0;  // so far
    std::size_t key = 0;       // at least the length of the last one
  };

  std::string_view _rest;
  std::size_t _depth;
  Allowance _nodes, _keyPairs, _entityMoves, _pathBytes;
  std::vector<Container> _containers;   // those that are open
  std::optional<const char*> _keyText;  // inside a key: where its text begins
};

/// Walks over the objects of a binary list as the parser does: from the root along every reference, so it
/// visits an object as often as others refer to it. The limits end the walk. A cycle ends when it exceeds the
/// depth.
class BinaryWalk {
 public:
  BinaryWalk(ByteView bytes, const PropertyListLimits& limits)
      : _bytes(bytes),
        _depth(limits.depth),
        _nodes(limits.expandedNodes),
        _textBytes(limits.expandedBytes),
        _keyPairs(limits.keyPairs),
        _pathBytes(limits.pathBytes) {}

  bool passes() {
    constexpr std::size_t trailerSize = 32;
    if (_bytes.size() < binaryMagic.size() + trailerSize) return false;
    const std::size_t trailer = _bytes.size() - trailerSize;
    _offsetSize = _bytes[trailer + 6];
    _referenceSize = _bytes[trailer + 7];
    _objectCount = number(trailer + 8, 8);
    const std::uint64_t root = number(trailer + 16, 8);
    const std::uint64_t table = number(trailer + 24, 8);
    if (_offsetSize < 1 || _offsetSize > 8 || _referenceSize < 1 || _referenceSize > 8) return false;
    if (table < binaryMagic.size() || table > trailer) return false;
    _table = table;
    return _objectCount <= (trailer - _table) / _offsetSize && passValue(root, {});
  }

 private:
  // The parts of an object: its kind and size from the marker, and where its content begins.
  struct Object {
    unsigned kind;
    std::uint64_t size;
    std::size_t content;
  };

  // Where a value stands.
  struct Place {
    std::size_t depth = 0;  // the containers around it
    std::size_t path = 0;   // at least the length of its path

    Place below(std::size_t key) const { return {depth + 1, path + key + 1}; }
  };

  bool passValue(std::uint64_t index, Place place) {
    const auto object = objectAt(index);
    return object && _pathBytes.take(place.path) && passObject(*object, place);
  }

  bool passObject(const Object& object, Place place) {
    if (!_nodes.take(1)) return false;
    const auto [kind, size, content] = object;
    switch (kind) {
      case 0x0:
        return size == 8 || size == 9;  // false and true
      case 0x1:
        return size <= 4 && holds(content, std::size_t{1} << size);
      case 0x2:
        return (size == 2 || size == 3) && holds(content, std::size_t{1} << size);
      case 0x3:
        return size == 3 && holds(content, 8);
      case 0x4:
        return holds(content, size) && _textBytes.take(size);
      case 0x5:
        return holds(content, size) && _textBytes.take(size) &&
               canHold(Encoding::Binary, text(content, size));
      case 0x6:
        return size <= contentLeft(content) / 2 && _textBytes.take(2 * size) && isUtf16(content, size);
      case 0xA:
        return place.depth < _depth && passArray(content, size, place);
      case 0xD:
        return place.depth < _depth && passDictionary(content, size, place);
      default:
        return false;
    }
  }

  bool passArray(std::size_t content, std::uint64_t size, Place place) {
    if (size > contentLeft(content) / _referenceSize) return false;
    for (std::size_t i = 0; i < size; ++i) {
      if (!passValue(reference(content, i), place.below(0))) return false;
    }
    return true;
  }

  // A dictionary has all its keys first, then all its values.
  bool passDictionary(std::size_t content, std::uint64_t size, Place place) {
    if (size > contentLeft(content) / _referenceSize / 2 || !_keyPairs.take(size * size)) return false;
    for (std::size_t i = 0; i < size; ++i) {
      const auto key = objectAt(reference(content, i));
      if (!key || (key->kind != 0x5 && key->kind != 0x6) || !passObject(*key, place)) return false;
      // A unit of UTF-16 is at most three bytes of UTF-8.
      const std::size_t length = key->kind == 0x6 ? 3 * key->size : key->size;
      if (!passValue(reference(content, size + i), place.below(length))) return false;
    }
    return true;
  }

  std::optional<Object> objectAt(std::uint64_t index) const {
    if (index >= _objectCount) return std::nullopt;
    const std::uint64_t offset = number(_table + index * _offsetSize, _offsetSize);
    if (offset < binaryMagic.size() || offset >= _table) return std::nullopt;
    const unsigned marker = _bytes[offset];
    const Object object{marker >> 4U, marker & 15U, static_cast<std::size_t>(offset) + 1};
    return object.kind >= 0x4 && object.size == 15 ? withLongSize(object) : object;
  }

  // A size of 15 or more follows the marker as an integer object.
  std::optional<Object> withLongSize(const Object& object) const {
    if (!holds(object.content, 1)) return std::nullopt;
    const unsigned marker = _bytes[object.content];
    const std::size_t width = std::size_t{1} << (marker & 15U);
    if (marker >> 4U != 0x1 || width > 8 || !holds(object.content + 1, width)) return std::nullopt;
    return Object{object.kind, number(object.content + 1, width), object.content + 1 + width};
  }

  std::string_view text(std::size_t content, std::size_t size) const {
    return {reinterpret_cast<const char*>(_bytes.data()) + content, size};
  }

  // True when every surrogate has its other half and no unit is U+0000.
  bool isUtf16(std::size_t content, std::size_t size) const {
    bool awaitsTrail = false;
    for (std::size_t i = 0; i < size; ++i) {
      const std::uint64_t unit = number(content + 2 * i, 2);
      const bool isTrail = unit >= 0xDC00 && unit <= 0xDFFF;
      if (unit == 0 || isTrail != awaitsTrail) return false;
      awaitsTrail = unit >= 0xD800 && unit <= 0xDBFF;
    }
    return !awaitsTrail;
  }

  std::uint64_t reference(std::size_t content, std::size_t position) const {
    return number(content + position * _referenceSize, _referenceSize);
  }

  // An unsigned big-endian number. Nearly all have one or two bytes.
  std::uint64_t number(std::size_t offset, std::size_t width) const {
    const std::uint8_t* bytes = _bytes.data() + offset;
    if (width == 1) return bytes[0];
    if (width == 2) return std::uint64_t{bytes[0]} << 8U | bytes[1];
    return std::accumulate(bytes, bytes + width, std::uint64_t{0},
                           [](std::uint64_t high, std::uint8_t byte) { return high << 8U | byte; });
  }

  // Objects end where the table of their offsets begins.
  std::size_t contentLeft(std::size_t content) const { return _table - content; }
  bool holds(std::size_t content, std::uint64_t size) const { return size <= contentLeft(content); }

  ByteView _bytes;
  std::size_t _depth;
  Allowance _nodes, _textBytes, _keyPairs, _pathBytes;
  std::size_t _table = 0;
  std::size_t _offsetSize = 0, _referenceSize = 0;
  std::uint64_t _objectCount = 0;
};

// Writers share equal texts, so texts expand. No writer shares containers.
PropertyListLimits limitsForSize(PropertyListLimits limits, std::size_t size) {
  if (limits.expansion == PropertyListLimits::Expansion::Allowed) return limits;
  constexpr std::size_t nodesPerByte = 1, bytesPerByte = 64, pathBytesPerByte = 1024;
  const auto lower = [size](std::size_t& bound, std::size_t ofMessages, std::size_t perByte) {
    bound = std::min(bound, ofMessages + perByte * size);
  };
  lower(limits.expandedNodes, messageLimits.expandedNodes, nodesPerByte);
  lower(limits.expandedBytes, messageLimits.expandedBytes, bytesPerByte);
  lower(limits.pathBytes, 4 * messageLimits.pathBytes, pathBytesPerByte);
  return limits;
}

}  // namespace

bool isBinaryPropertyList(ByteView bytes) {
  return bytes.size() >= binaryMagic.size() &&
         std::equal(binaryMagic.begin(), binaryMagic.end(), bytes.begin());
}

bool isSafeToParse(ByteView bytes, const PropertyListLimits& widest) {
  if (bytes.size() > widest.size) return false;
  const PropertyListLimits limits = limitsForSize(widest, bytes.size());
  return isBinaryPropertyList(bytes) ? BinaryWalk(bytes, limits).passes() : XmlScan(bytes, limits).passes();
}

}  // namespace varnel
