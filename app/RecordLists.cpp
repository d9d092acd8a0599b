#include "app/RecordLists.h"

#include <algorithm>
#include <charconv>
#include <span>
#include <unordered_map>
#include <unordered_set>

#include "app/RecordIdentity.h"

namespace varnel {

namespace {

bool isList(const VarnelModelNode& node) {
  const auto* const inner = dynamic_cast<const VarnelModelTreeNode*>(&node);
  return inner && inner->origin() == VarnelModelTreeNode::Origin::Array;
}

// A number at the beginning of a text, alone or before a blank and a unit.
std::optional<double> leadingNumber(std::string_view text) {
  double number = 0;
  const auto [end, error] =
      std::from_chars(text.data(), text.data() + text.size(), number, std::chars_format::fixed);
  const bool isWhole = end == text.data() + text.size() || *end == ' ';
  return error == std::errc() && isWhole ? std::optional(number) : std::nullopt;
}

std::optional<double> numberIn(const std::string& text, std::span<const std::string> path,
                               const NumberFormats& formats) {
  const std::string_view number = formats.number(path, text);
  return leadingNumber(number.empty() ? text : number);
}

// A record that is about nothing is the same one as long as its texts are the same.
std::string identityIn(const VarnelModelNode& record, const VarnelModelNode& list,
                       const VarnelModelNode& around) {
  std::string identity = identityOfRecord(record, list, around).text;
  if (!identity.empty()) return identity;
  for (const auto& entry : *record.childNodes()) {
    if (entry->value())
      identity.append(entry->displayName()).append("=").append(*entry->value()).append("\n");
  }
  return identity;
}

class Reader {
 public:
  Reader(NamePath path, const NumberFormats& formats) : _path(std::move(path)), _formats(formats) {}

  void add(const VarnelModelNode& record, const VarnelModelNode& list, const VarnelModelNode& around) {
    RecordList::Record& row = _list.records.emplace_back();
    row.name = record.displayName();
    row.identity = uniqueIdentity(identityIn(record, list, around));
    _path.push_back(row.name);
    for (const auto& entry : *record.childNodes()) {
      if (entry->value()) addCell(row, *entry);
    }
    _path.pop_back();
  }

  RecordList list() {
    for (auto& record : _list.records) record.cells.resize(_list.columns.size());
    return std::move(_list);
  }

 private:
  std::string uniqueIdentity(const std::string& identity) {
    unsigned& count = _ofIdentity[identity];
    std::string unique = identity;
    while (!_taken.insert(unique).second) unique = identity + " (" + std::to_string(++count + 1) + ")";
    return unique;
  }

  void addCell(RecordList::Record& row, const VarnelModelNode& entry) {
    const auto column = std::ranges::find(_list.columns, entry.displayName());
    const auto index = static_cast<std::size_t>(column - _list.columns.begin());
    if (column == _list.columns.end()) _list.columns.push_back(entry.displayName());
    if (row.cells.size() <= index) row.cells.resize(index + 1);
    _path.push_back(entry.displayName());
    row.cells[index] = {*entry.value(), numberIn(*entry.value(), _path, _formats)};
    _path.pop_back();
  }

  NamePath _path;
  const NumberFormats& _formats;
  RecordList _list;
  std::unordered_map<std::string, unsigned> _ofIdentity;  // how many have it besides the first one
  std::unordered_set<std::string> _taken;
};

}  // namespace

bool isListOfRecords(const VarnelModelNode& node) {
  return isList(node) && !node.childNodes()->empty() &&
         std::ranges::all_of(*node.childNodes(),
                             [](const auto& record) { return record->childNodes() && !isList(*record); });
}

std::optional<RecordList> recordsOf(const VarnelModelNode& root, const NamePath& path,
                                    const NumberFormats& formats) {
  if (path.empty()) return std::nullopt;
  const VarnelModelNode* const list = nodeUnderNames(root, path);
  const VarnelModelNode* const around = nodeUnderNames(root, {path.begin(), path.end() - 1});
  if (!list || !isList(*list)) return std::nullopt;
  if (list->childNodes()->empty()) return RecordList();
  if (!isListOfRecords(*list)) return std::nullopt;
  Reader reader(path, formats);
  for (const auto& record : *list->childNodes()) reader.add(*record, *list, *around);
  return reader.list();
}

}  // namespace varnel
