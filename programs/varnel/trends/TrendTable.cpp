#include "programs/varnel/trends/TrendTable.h"

#include <QPixmap>
#include <algorithm>

#include "programs/varnel/trends/TrendScale.h"

namespace varnel {

bool TrendTable::Row::operator==(const Row& other) const {
  return color == other.color && tooltip == other.tooltip && std::ranges::equal(texts, other.texts);
}

void TrendTable::show(const TrendData& data, const TrendLook& look) {
  std::vector<Row> rows;
  for (std::size_t i = 0; i < data.lines.size(); ++i) {
    const TrendData::Line& line = data.lines[i];
    const TrendStatistics statistics = statisticsOf(line.summary);
    const auto text = [](const std::string& bytes) { return QString::fromStdString(bytes); };
    rows.push_back({look.penOf(i).color(),
                    {legendText(line.row), text(statistics.last), text(statistics.lowest),
                     text(statistics.mean), text(statistics.highest)},
                    text(line.row.key)});
  }
  if (rows.size() != _rows.size()) {
    beginResetModel();
    _rows = std::move(rows);
    endResetModel();
    return;
  }
  for (std::size_t i = 0; i < rows.size(); ++i) {
    if (rows[i] == _rows[i]) continue;
    _rows[i] = std::move(rows[i]);
    const int row = static_cast<int>(i);
    Q_EMIT dataChanged(index(row, 0), index(row, ColumnCount - 1));
  }
}

int TrendTable::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(_rows.size());
}

int TrendTable::columnCount(const QModelIndex& parent) const { return parent.isValid() ? 0 : ColumnCount; }

QVariant TrendTable::data(const QModelIndex& index, int role) const {
  const Row& row = _rows.at(static_cast<std::size_t>(index.row()));
  switch (role) {
    case Qt::DisplayRole:
      return row.texts[index.column()];
    case Qt::DecorationRole: {
      if (index.column() != Name) return {};
      QPixmap mark(12, 12);
      mark.fill(row.color);
      return mark;
    }
    case Qt::TextAlignmentRole:
      return static_cast<int>((index.column() == Name ? Qt::AlignLeft : Qt::AlignRight) | Qt::AlignVCenter);
    case Qt::ToolTipRole:
      return index.column() == Name ? row.texts[Name] : row.texts[index.column()];
    default:
      return {};
  }
}

QVariant TrendTable::headerData(int section, Qt::Orientation orientation, int role) const {
  if (orientation != Qt::Horizontal) return {};
  if (role == Qt::TextAlignmentRole)
    return static_cast<int>((section == Name ? Qt::AlignLeft : Qt::AlignRight) | Qt::AlignVCenter);
  if (role != Qt::DisplayRole) return {};
  switch (section) {
    case Name:
      return tr("Row");
    case Last:
      return tr("Last");
    case Lowest:
      return tr("Lowest");
    case Mean:
      return tr("Mean");
    default:
      return tr("Highest");
  }
}

}  // namespace varnel
