#pragma once

#include <QAbstractTableModel>
#include <QString>
#include <optional>
#include <string>
#include <vector>

#include "platform/ui/RecordList.h"

namespace varnel {

/// The records of a list for a table with columns: first the name of a record's row, then its entries. A
/// record is the same one after a refresh when its identity is, so whatever points to it goes along.
class RecordTableModel final : public QAbstractTableModel {
 public:
  /// Replaces the records. The order of a sorted column holds for the new ones too. A column stays when no
  /// record has its entry any more.
  void show(RecordList list);
  /// Marks the record with this name; null for none.
  void markOpen(const QString& name);

  /// The place in the list of the record in this row of the table, and the other way round; nothing when
  /// there is no such record.
  std::optional<std::size_t> placeOf(int row) const;
  std::optional<int> rowOfPlace(std::size_t place) const;
  /// The identity of the record in this row of the table, and the other way round.
  std::optional<std::string> identityOf(int row) const;
  std::optional<int> rowOfIdentity(const std::string& identity) const;
  /// The name of the column; empty for the first one.
  QString columnName(int column) const;

  int rowCount(const QModelIndex& parent = {}) const override;
  int columnCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
  /// By number where both are numbers. Numbers come before texts, and records without the entry always last.
  /// A column below 0 is the order of the list.
  void sort(int column, Qt::SortOrder order) override;

 private:
  const RecordList::Record& recordIn(int row) const { return _list.records[_order[std::size_t(row)]]; }
  RecordList::Cell cellOf(const RecordList::Record& record, int column) const;
  void lookForNumbers();
  QVariant alignmentOf(int column) const;
  bool isOpen(const RecordList::Record& record) const;
  std::vector<std::size_t> sorted() const;
  void takeColumnsOf(RecordList& list);
  void removeWhatIsNotIn(const RecordList& list);
  void addWhatIsNew(const RecordList& list);

  RecordList _list;
  std::vector<bool> _isNumeric;     // by column: its texts stand on the right
  std::vector<std::size_t> _order;  // by row of the table: place in the list
  int _sortedColumn = -1;
  Qt::SortOrder _sortOrder = Qt::AscendingOrder;
  QString _open;
};

}  // namespace varnel
