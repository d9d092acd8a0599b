#include "widgets/RecordTableModel.h"

#include <QFont>
#include <QGuiApplication>
#include <algorithm>
#include <charconv>
#include <numeric>
#include <unordered_map>
#include <unordered_set>
#include <utility>

#include "widgets/Colors.h"
#include "widgets/QtValues.h"

namespace varnel {

namespace {

constexpr double textSize = 15;
constexpr double headerSize = 13;
// Of the entries that records ever had. Beyond them, the table begins anew.
constexpr std::size_t mostColumns = 100;

// The names of records are their numbers.
RecordList::Cell cellWithName(const RecordList::Record& record) {
  double number = 0;
  const char* const end = record.name.data() + record.name.size();
  const auto read = std::from_chars(record.name.data(), end, number);
  if (read.ec != std::errc() || read.ptr != end) return {record.name, std::nullopt};
  return {record.name, number};
}

// Negative, zero, or positive, as of two numbers.
int compare(const RecordList::Cell& one, const RecordList::Cell& other) {
  if (one.number && other.number) return (*one.number > *other.number) - (*one.number < *other.number);
  if (one.number.has_value() != other.number.has_value()) return one.number ? -1 : 1;
  return one.text.compare(other.text);
}

// The record's cells in another order of the columns.
std::vector<RecordList::Cell> cellsIn(const std::vector<std::string>& columns, RecordList::Record& record,
                                      const std::vector<std::string>& itsColumns) {
  std::vector<RecordList::Cell> cells(columns.size());
  for (std::size_t i = 0; i < std::min(itsColumns.size(), record.cells.size()); ++i) {
    const auto column = std::ranges::find(columns, itsColumns[i]) - columns.begin();
    cells[static_cast<std::size_t>(column)] = std::move(record.cells[i]);
  }
  return cells;
}

}  // namespace

void RecordTableModel::show(RecordList list) {
  takeColumnsOf(list);
  removeWhatIsNotIn(list);
  addWhatIsNew(list);
  std::unordered_map<std::string_view, std::size_t> places;
  for (std::size_t place = 0; place < list.records.size(); ++place)
    places.emplace(list.records[place].identity, place);
  // The rows stay where they are; only the records behind them change their places.
  std::vector<std::size_t> order;
  for (const std::size_t former : _order) order.push_back(places.at(_list.records[former].identity));
  _list = std::move(list);
  lookForNumbers();
  _order = std::move(order);
  sort(_sortedColumn, _sortOrder);
  if (!_order.empty() && columnCount() > 0)
    Q_EMIT dataChanged(index(0, 0), index(rowCount() - 1, columnCount() - 1));
}

// Columns stay at their places, also while no record has the entry, so that the table keeps its form. Gives
// the list all columns of the table.
void RecordTableModel::takeColumnsOf(RecordList& list) {
  std::vector<std::string> columns = _list.columns;
  for (const std::string& name : list.columns) {
    if (std::ranges::find(columns, name) == columns.end()) columns.push_back(name);
  }
  if (columns.size() > mostColumns) {
    beginResetModel();
    _list = {list.columns, {}};
    _order.clear();
    endResetModel();
    return;
  }
  for (auto& record : list.records) record.cells = cellsIn(columns, record, list.columns);
  list.columns = columns;
  if (columns.size() == _list.columns.size()) return;
  beginInsertColumns({}, columnCount(), static_cast<int>(columns.size()));
  _list.columns = std::move(columns);
  endInsertColumns();
}

void RecordTableModel::removeWhatIsNotIn(const RecordList& list) {
  std::unordered_set<std::string_view> identities;
  for (const auto& record : list.records) identities.insert(record.identity);
  for (int row = rowCount() - 1; row >= 0; --row) {
    if (identities.contains(recordIn(row).identity)) continue;
    beginRemoveRows({}, row, row);
    _order.erase(_order.begin() + row);
    endRemoveRows();
  }
}

void RecordTableModel::addWhatIsNew(const RecordList& list) {
  std::unordered_set<std::string> identities;
  for (const std::size_t place : _order) identities.insert(_list.records[place].identity);
  std::vector<RecordList::Record> added;
  for (const auto& record : list.records) {
    if (identities.insert(record.identity).second) added.push_back(record);
  }
  if (added.empty()) return;
  beginInsertRows({}, rowCount(), rowCount() + static_cast<int>(added.size()) - 1);
  for (auto& record : added) {
    _order.push_back(_list.records.size());
    _list.records.push_back(std::move(record));
  }
  endInsertRows();
}

void RecordTableModel::markOpen(const QString& name) {
  if (name == _open) return;
  _open = name;
  if (!_order.empty()) Q_EMIT dataChanged(index(0, 0), index(rowCount() - 1, columnCount() - 1));
}

std::optional<std::size_t> RecordTableModel::placeOf(int row) const {
  if (row < 0 || row >= rowCount()) return std::nullopt;
  return _order[static_cast<std::size_t>(row)];
}

std::optional<int> RecordTableModel::rowOfPlace(std::size_t place) const {
  const auto found = std::ranges::find(_order, place);
  if (found == _order.end()) return std::nullopt;
  return static_cast<int>(found - _order.begin());
}

std::optional<std::string> RecordTableModel::identityOf(int row) const {
  if (row < 0 || row >= rowCount()) return std::nullopt;
  return recordIn(row).identity;
}

std::optional<int> RecordTableModel::rowOfIdentity(const std::string& identity) const {
  for (int row = 0; row < rowCount(); ++row) {
    if (recordIn(row).identity == identity) return row;
  }
  return std::nullopt;
}

QString RecordTableModel::columnName(int column) const {
  if (column < 1 || column >= columnCount()) return {};
  return singleLine(_list.columns[static_cast<std::size_t>(column) - 1]);
}

int RecordTableModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(_order.size());
}

int RecordTableModel::columnCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(_list.columns.size()) + 1;
}

RecordList::Cell RecordTableModel::cellOf(const RecordList::Record& record, int column) const {
  if (column == 0) return cellWithName(record);
  const auto place = static_cast<std::size_t>(column) - 1;
  return place < record.cells.size() ? record.cells[place] : RecordList::Cell();
}

void RecordTableModel::lookForNumbers() {
  const std::vector<bool> former =
      std::exchange(_isNumeric, std::vector<bool>(static_cast<std::size_t>(columnCount()), true));
  for (const auto& record : _list.records) {
    for (int column = 0; column < columnCount(); ++column) {
      const RecordList::Cell cell = cellOf(record, column);
      if (!cell.number && !cell.text.empty()) _isNumeric[static_cast<std::size_t>(column)] = false;
    }
  }
  if (_isNumeric != former) Q_EMIT headerDataChanged(Qt::Horizontal, 0, columnCount() - 1);
}

QVariant RecordTableModel::alignmentOf(int column) const {
  const auto place = static_cast<std::size_t>(column);
  const bool isNumeric = place < _isNumeric.size() && _isNumeric[place];
  return QVariant(Qt::AlignVCenter | Qt::AlignAbsolute | (isNumeric ? Qt::AlignRight : Qt::AlignLeft));
}

bool RecordTableModel::isOpen(const RecordList::Record& record) const {
  return !_open.isEmpty() && singleLine(record.name) == _open;
}

QVariant RecordTableModel::data(const QModelIndex& index, int role) const {
  if (!index.isValid() || index.row() >= rowCount()) return {};
  const RecordList::Record& record = recordIn(index.row());
  switch (role) {
    case Qt::DisplayRole:
      return singleLine(cellOf(record, index.column()).text);
    case Qt::TextAlignmentRole:
      return alignmentOf(index.column());
    case Qt::FontRole:
      return qtFont(isOpen(record) ? Font::boldSystem(textSize) : Font::system(textSize));
    case Qt::BackgroundRole:
      return isOpen(record) ? QVariant(selectionColor(QGuiApplication::palette())) : QVariant();
    default:
      return {};
  }
}

QVariant RecordTableModel::headerData(int section, Qt::Orientation orientation, int role) const {
  if (orientation != Qt::Horizontal) return {};
  const QString name = section == 0 ? QStringLiteral("No.") : columnName(section);
  switch (role) {
    case Qt::DisplayRole:
      return name;
    case Qt::ToolTipRole:
      return plainTooltip(name + QStringLiteral(": click to sort"));
    case Qt::TextAlignmentRole:
      return alignmentOf(section);
    case Qt::FontRole:
      return qtFont(Font::boldSystem(headerSize));
    default:
      return {};
  }
}

void RecordTableModel::sort(int column, Qt::SortOrder order) {
  _sortedColumn = column;
  _sortOrder = order;
  const std::vector<std::size_t> next = sorted();
  if (next == _order) return;
  Q_EMIT layoutAboutToBeChanged({}, VerticalSortHint);
  std::unordered_map<std::size_t, int> rows;
  for (std::size_t row = 0; row < next.size(); ++row) rows.emplace(next[row], static_cast<int>(row));
  const QModelIndexList former = persistentIndexList();
  QModelIndexList moved;
  for (const QModelIndex& each : former)
    moved.append(index(rows.at(_order[static_cast<std::size_t>(each.row())]), each.column()));
  _order = next;
  changePersistentIndexList(former, moved);
  Q_EMIT layoutChanged({}, VerticalSortHint);
}

std::vector<std::size_t> RecordTableModel::sorted() const {
  std::vector<std::size_t> order(_list.records.size());
  std::iota(order.begin(), order.end(), std::size_t{0});
  if (_sortedColumn < 0 || _sortedColumn >= columnCount()) return order;
  std::ranges::stable_sort(order, [this](std::size_t one, std::size_t other) {
    const RecordList::Cell first = cellOf(_list.records[one], _sortedColumn);
    const RecordList::Cell second = cellOf(_list.records[other], _sortedColumn);
    if (first.text.empty() || second.text.empty()) return !first.text.empty() && second.text.empty();
    const int order = compare(first, second);
    return _sortOrder == Qt::AscendingOrder ? order < 0 : order > 0;
  });
  return order;
}

}  // namespace varnel
