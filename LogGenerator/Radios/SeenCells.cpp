#include "LogGenerator/Radios/SeenCells.h"

#include <algorithm>
#include <limits>

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
  // A capture can say any time.
  if (_now.seconds < std::numeric_limits<std::int64_t>::min() + lifetime.count()) return;
  const Time latest{_now.seconds - lifetime.count(), _now.nanoseconds};
  const std::size_t removed =
      std::erase_if(_cells, [&](const Cell& cell) { return cell.lastSeen <= latest; });
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

// Few cells change their places, and each is moved only as far as it must. Returns whether one was moved.
bool SeenCells::sort() {
  const auto isBefore = [](const Cell& a, const Cell& b) { return a.place < b.place; };
  bool isMoved = false;
  for (std::size_t i = 1; i < _cells.size(); ++i) {
    const auto cell = _cells.begin() + static_cast<std::ptrdiff_t>(i);
    if (!isBefore(*cell, *(cell - 1))) continue;
    std::rotate(std::upper_bound(_cells.begin(), cell, *cell, isBefore), cell, cell + 1);
    isMoved = true;
  }
  return isMoved;
}

void SeenCells::show(Section& section) {
  if (!_isChanged) return;
  _isChanged = false;
  const ArrayLock::Scope lock;
  _listIsOld |= sort();
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
