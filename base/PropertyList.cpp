#include "base/PropertyList.h"

#include <plist/plist.h>

#include <cstdint>
#include <cstdlib>
#include <limits>
#include <memory>
#include <string_view>

#include "base/Dictionary.h"
#include "base/PropertyListGuard.h"
#include "base/PropertyListText.h"

namespace varnel {

namespace {

struct FreeNode {
  void operator()(plist_t node) const { plist_free(node); }
};
using Node = std::unique_ptr<void, FreeNode>;

// Frees memory that the library allocated.
struct Free {
  void operator()(void* memory) const { std::free(memory); }
};

Value readNode(plist_t node, Encoding encoding);

// The guard has checked the texts of a binary list before the parser saw them. A text of an XML list can get
// any character from an entity.
bool isFit(std::string_view text, Encoding encoding) {
  return encoding == Encoding::Binary || canHold(encoding, text);
}

Value readText(plist_t node, Encoding encoding) {
  std::uint64_t length = 0;
  const char* text = plist_get_string_ptr(node, &length);
  const std::string_view view(text, length);
  return isFit(view, encoding) ? Value(view) : Value();
}

// The library reports the second before 2001 and the second after it alike. The sign is only in the bytes
// that it writes of a date: a header, a marker, and the seconds as a real number, high byte first.
bool isBefore2001(plist_t date) {
  constexpr std::uint32_t signOffset = std::string_view("bplist00\x33").size();
  char* bytes = nullptr;
  std::uint32_t length = 0;
  plist_to_bin(date, &bytes, &length);
  const std::unique_ptr<char, Free> bytesOwner(bytes);
  return length > signOffset && (static_cast<unsigned char>(bytes[signOffset]) & 0x80U) != 0;
}

Value readDate(plist_t node) {
  Date date;
  plist_get_date_val(node, &date.seconds, &date.microseconds);
  // The library reports a date out of range as the least number, with meaningless microseconds.
  if (date.seconds == std::numeric_limits<std::int32_t>::min()) return Value::ofDate({date.seconds, 0});
  // The library cuts toward 2001 and gives microseconds without their sign.
  if (date.microseconds > 0 && (date.seconds < 0 || (date.seconds == 0 && isBefore2001(node))))
    return Value::ofDate({date.seconds - 1, 1000000 - date.microseconds});
  return Value::ofDate(date);
}

Value readData(plist_t node) {
  std::uint64_t length = 0;
  const char* bytes = plist_get_data_ptr(node, &length);
  return Value::ofData(Bytes(bytes, bytes + length));
}

Value readArray(plist_t node, Encoding encoding) {
  Array elements;
  elements.reserve(plist_array_get_size(node));
  plist_array_iter position = nullptr;
  plist_array_new_iter(node, &position);
  const std::unique_ptr<void, Free> positionOwner(position);
  for (;;) {
    plist_t element = nullptr;
    plist_array_next_item(node, position, &element);
    if (!element) return Value::ofArray(std::move(elements));
    elements.push_back(readNode(element, encoding));
    if (elements.back().isAbsent()) return {};
  }
}

Value readDictionary(plist_t node, Encoding encoding) {
  const auto dictionary = std::make_shared<Dictionary>();
  dictionary->reserve(plist_dict_get_size(node));
  plist_dict_iter position = nullptr;
  plist_dict_new_iter(node, &position);
  const std::unique_ptr<void, Free> positionOwner(position);
  for (;;) {
    char* text = nullptr;
    plist_t item = nullptr;
    plist_dict_next_item(node, position, &text, &item);
    if (!item) return Value(dictionary);
    const std::unique_ptr<char, Free> textOwner(text);
    const std::string_view key = text;
    Value value = readNode(item, encoding);
    if (value.isAbsent() || !isFit(key, encoding)) return {};
    dictionary->set(key, std::move(value));
  }
}

// The absent value for a node of an unsupported kind.
Value readNode(plist_t node, Encoding encoding) {
  switch (plist_get_node_type(node)) {
    case PLIST_STRING:
      return readText(node, encoding);
    case PLIST_UINT: {
      std::uint64_t number = 0;
      plist_get_uint_val(node, &number);
      return Value::ofInteger(static_cast<std::int64_t>(number));
    }
    case PLIST_REAL: {
      double number = 0;
      plist_get_real_val(node, &number);
      return Value::ofReal(number);
    }
    case PLIST_BOOLEAN: {
      std::uint8_t truth = 0;
      plist_get_bool_val(node, &truth);
      return Value::ofBoolean(truth != 0);
    }
    case PLIST_DATE:
      return readDate(node);
    case PLIST_DATA:
      return readData(node);
    case PLIST_ARRAY:
      return readArray(node, encoding);
    case PLIST_DICT:
      return readDictionary(node, encoding);
    default:
      return {};
  }
}

/// Checks whether an encoding can hold a value, before any node is built.
class WriteCheck {
 public:
  explicit WriteCheck(Encoding encoding) : _encoding(encoding) {}

  bool passes(const Value& value, std::size_t depth = 0) {
    if (!_nodes.take(1)) return false;
    switch (value.kind()) {
      case Value::Kind::Absent:
        return false;
      case Value::Kind::String:
        return passesText(*value.string());
      case Value::Kind::Data:
        return _bytes.take(value.data()->size());
      case Value::Kind::Array:
        return depth < fileLimits.depth && passesElements(*value.array(), depth + 1);
      case Value::Kind::Dictionary:
        return depth < fileLimits.depth && passesEntries(*value.dictionary(), depth + 1);
      default:
        return true;
    }
  }

 private:
  bool passesText(const std::string& text) { return _bytes.take(text.size()) && canHold(_encoding, text); }

  bool passesElements(const Array& elements, std::size_t depth) {
    for (const Value& element : elements) {
      if (!passes(element, depth)) return false;
    }
    return true;
  }

  bool passesEntries(const Dictionary& entries, std::size_t depth) {
    for (const auto& [key, value] : entries) {
      if (!_nodes.take(1) || !passesText(key) || !passes(value, depth)) return false;
    }
    return true;
  }

  Encoding _encoding;
  Allowance _nodes{fileLimits.expandedNodes};
  Allowance _bytes{fileLimits.expandedBytes};
};

// The caller owns the node until it puts it into another one.
plist_t makeNode(const Value& value) {
  switch (value.kind()) {
    case Value::Kind::Absent:
      return nullptr;
    case Value::Kind::String:
      return plist_new_string(value.string()->c_str());
    case Value::Kind::Integer:
      return plist_new_uint(static_cast<std::uint64_t>(*value.integer()));
    case Value::Kind::Real:
      return plist_new_real(*value.real());
    case Value::Kind::Boolean:
      return plist_new_bool(*value.boolean() ? 1 : 0);
    case Value::Kind::Date:
      return plist_new_date(value.date()->seconds, value.date()->microseconds);
    case Value::Kind::Data: {
      const std::string_view bytes(reinterpret_cast<const char*>(value.data()->data()), value.data()->size());
      return plist_new_data(bytes.empty() ? "" : bytes.data(), bytes.size());
    }
    case Value::Kind::Array: {
      plist_t node = plist_new_array();
      for (const Value& element : *value.array()) plist_array_append_item(node, makeNode(element));
      return node;
    }
    case Value::Kind::Dictionary: {
      plist_t node = plist_new_dict();
      for (const auto& [key, entry] : *value.dictionary())
        plist_dict_set_item(node, key.c_str(), makeNode(entry));
      return node;
    }
  }
  return nullptr;
}

// The library does not escape a carriage return, and readers of XML would turn it into a newline.
Bytes withCarriageReturnsEscaped(std::string_view xml) {
  constexpr std::string_view escaped = "&#13;";
  Bytes result;
  result.reserve(xml.size());
  for (;;) {
    const std::size_t length = xml.find('\r');
    const std::string_view text = xml.substr(0, length);
    result.insert(result.end(), text.begin(), text.end());
    if (length == std::string_view::npos) return result;
    result.insert(result.end(), escaped.begin(), escaped.end());
    xml.remove_prefix(length + 1);
  }
}

}  // namespace

std::optional<Value> readPropertyList(ByteView bytes, const PropertyListLimits& limits) {
  if (!isSafeToParse(bytes, limits)) return std::nullopt;
  plist_t parsed = nullptr;
  plist_from_memory(reinterpret_cast<const char*>(bytes.data()), static_cast<std::uint32_t>(bytes.size()),
                    &parsed);
  const Node root(parsed);
  if (!root) return std::nullopt;
  Value value = readNode(root.get(), isBinaryPropertyList(bytes) ? Encoding::Binary : Encoding::Xml);
  if (value.isAbsent()) return std::nullopt;
  return value;
}

std::optional<Bytes> writeXmlPropertyList(const Value& value) {
  if (!WriteCheck(Encoding::Xml).passes(value)) return std::nullopt;
  const Node root(makeNode(value));
  char* text = nullptr;
  std::uint32_t length = 0;
  plist_to_xml(root.get(), &text, &length);
  const std::unique_ptr<char, Free> textOwner(text);
  if (!text) return std::nullopt;
  return withCarriageReturnsEscaped({text, length});
}

std::optional<Bytes> writeBinaryPropertyList(const Value& value) {
  if (!WriteCheck(Encoding::Binary).passes(value)) return std::nullopt;
  const Node root(makeNode(value));
  char* bytes = nullptr;
  std::uint32_t length = 0;
  plist_to_bin(root.get(), &bytes, &length);
  const std::unique_ptr<char, Free> bytesOwner(bytes);
  if (!bytes) return std::nullopt;
  return Bytes(bytes, bytes + length);
}

}  // namespace varnel
