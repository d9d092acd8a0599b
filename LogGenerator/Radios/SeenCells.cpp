#include "LogGenerator/Radios/SeenCells.h"

#include <algorithm>

#include "LogGenerator/ArrayLock.h"

namespace varnel {

void SeenCells::begin(Section& section, const Time& now) {
  setNow(now);
  if (section.container().dictionary() != _container.dictionary()) adopt(section);
  removeOld();
}

void SeenCells::setNow(const Time& now) {
  if (_nowText.empty() || now.seconds != _now.seconds) _nowText = dateDescription(now);
  _now = now;
}

// The section of another display: what this list had belongs to the one before. The section has no time
// before its first packet.
void SeenCells::adopt(const Section& section) {
  _container = section.container();
  _cells.clear();
  _list = Value::ofArray();
  const Time moment = section.time() == Time() ? _now : section.time();
  const Dictionary* const entries = _container.dictionary();
  const Array* const records = entries ? entries->get(listEntry).array() : nullptr;
  if (!records) return;
  for (const Value& record : *records) {
    const auto place = record.dictionary() ? _readPlace(*record.dictionary()) : std::nullopt;
    if (place && !find(place->key) && _cells.size() < capacity) _cells.push_back({*place, moment, record});
  }
  _listIsOld = true;
}

void SeenCells::removeOld() {
  // After a clock has stepped back, a cell was last seen now.
  for (Cell& cell : _cells) cell.lastSeen = std::min(cell.lastSeen, _now);
  const std::size_t removed = std::erase_if(
      _cells, [this](const Cell& cell) { return durationBetween(cell.lastSeen, _now) >= lifetime; });
  if (removed > 0) _isChanged = _listIsOld = true;
}

void SeenCells::remove(std::uint64_t key) {
  const std::size_t removed = std::erase_if(_cells, [&](const Cell& cell) { return cell.place.key == key; });
  if (removed > 0) _isChanged = _listIsOld = true;
}

SeenCells::Cell* SeenCells::find(std::uint64_t key) {
  for (Cell& cell : _cells) {
    if (cell.place.key == key) return &cell;
  }
  return nullptr;
}

Dictionary* SeenCells::see(const CellPlace& place) {
  Cell* cell = find(place.key);
  if (!cell) {
    makeRoom(place);
    if (_cells.size() >= capacity) return nullptr;
    cell = &_cells.emplace_back(Cell{place, _now, Value::ofDictionary()});
    _listIsOld = true;
  }
  _isChanged = true;
  cell->place = place;
  cell->lastSeen = _now;
  return cell->record.dictionary();
}

// The last cell goes for one that comes before it.
void SeenCells::makeRoom(const CellPlace& place) {
  if (_cells.size() < capacity) return;
  const auto last = std::ranges::max_element(_cells, std::less<>(), &Cell::place);
  if (place < last->place) _cells.erase(last);
}

void SeenCells::show(Section& section) {
  if (!_isChanged) return;
  _isChanged = false;
  const ArrayLock::Scope lock;
  if (!std::ranges::is_sorted(_cells, std::less<>(), &Cell::place)) {
    std::ranges::sort(_cells, std::less<>(), &Cell::place);
    _listIsOld = true;
  }
  Array& list = *_list.array();
  // Whoever clears a display clears this list too.
  if (_listIsOld || list.size() != _cells.size()) {
    list.clear();
    for (const Cell& cell : _cells) list.push_back(cell.record);
    _listIsOld = false;
  }
  section.set(listEntry, _list);
}

}  // namespace varnel
