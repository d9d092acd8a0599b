#include "base/Value.h"

#include <cmath>

#include "base/Dictionary.h"

namespace varnel {

Value::Value(ArrayRef array) {
  if (array) _content = std::move(array);
}

Value::Value(DictionaryRef dictionary) {
  if (dictionary) _content = std::move(dictionary);
}

Value Value::ofDictionary() { return Value(std::make_shared<Dictionary>()); }

const Bytes* Value::data() const {
  const DataRef* found = std::get_if<DataRef>(&_content);
  return found ? found->get() : nullptr;
}

Array* Value::array() const {
  const ArrayRef* found = std::get_if<ArrayRef>(&_content);
  return found ? found->get() : nullptr;
}

Dictionary* Value::dictionary() const {
  const DictionaryRef* found = std::get_if<DictionaryRef>(&_content);
  return found ? found->get() : nullptr;
}

bool Value::sharesDictionary() const {
  const DictionaryRef* found = std::get_if<DictionaryRef>(&_content);
  return found && found->use_count() > 1;
}

std::optional<std::int32_t> Value::int32() const {
  if (const auto whole = integer()) return static_cast<std::int32_t>(*whole);
  const auto number = real();
  if (!number) return std::nullopt;
  if (!std::isfinite(*number)) return 0;
  const double wrapped = std::fmod(std::trunc(*number), 4294967296.0);
  return static_cast<std::int32_t>(static_cast<std::int64_t>(wrapped));
}

void Value::assignText(std::string_view text) {
  if (auto* present = std::get_if<std::string>(&_content)) {
    present->assign(text);
  } else {
    _content.emplace<std::string>(text);
  }
}

Value Value::shallowCopy() const {
  if (const Array* elements = array()) return ofArray(*elements);
  if (const Dictionary* entries = dictionary()) return Value(std::make_shared<Dictionary>(*entries));
  return *this;
}

Value Value::deepCopy() const {
  if (const Array* elements = array()) {
    Array copies;
    copies.reserve(elements->size());
    for (const Value& element : *elements) copies.push_back(element.deepCopy());
    return ofArray(std::move(copies));
  }
  if (const Dictionary* entries = dictionary()) {
    Value copy = ofDictionary();
    copy.dictionary()->reserve(entries->size());
    for (const Dictionary::Entry& entry : *entries) copy.dictionary()->set(entry.key, entry.value.deepCopy());
    return copy;
  }
  return *this;
}

}  // namespace varnel
