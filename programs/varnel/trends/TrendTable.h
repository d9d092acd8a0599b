#pragma once

#include <QAbstractTableModel>
#include <vector>

#include "programs/varnel/trends/TrendData.h"
#include "programs/varnel/trends/TrendLook.h"

namespace varnel {

/// What a picture tells in numbers: a row for each line with its color, and the lowest value, the mean, and
/// the highest value of what is shown.
class TrendTable final : public QAbstractTableModel {
  Q_OBJECT

 public:
  enum Column { Name, Last, Lowest, Mean, Highest, ColumnCount };

  using QAbstractTableModel::QAbstractTableModel;

  void show(const TrendData& data, const TrendLook& look);

  int rowCount(const QModelIndex& parent = {}) const override;
  int columnCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
  QVariant headerData(int section, Qt::Orientation orientation, int role = Qt::DisplayRole) const override;

 private:
  struct Row {
    QColor color;
    QString texts[ColumnCount];
    QString tooltip;

    bool operator==(const Row& other) const;
  };

  std::vector<Row> _rows;
};

}  // namespace varnel
