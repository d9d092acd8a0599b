#pragma once

#include <QButtonGroup>
#include <QLabel>
#include <QProgressBar>
#include <QStackedLayout>
#include <QTableView>
#include <QTimer>
#include <QToolButton>
#include <string>
#include <vector>

#include "programs/varnel/trends/EventLegend.h"
#include "programs/varnel/trends/RowChooser.h"
#include "programs/varnel/trends/TrendPage.h"
#include "programs/varnel/trends/TrendTable.h"
#include "programs/varnel/trends/TrendView.h"

namespace varnel {

/// The page with the picture, what it tells in numbers, and the buttons.
class TrendPageWidget final : public TrendPage {
 public:
  enum class Format { Png, Svg, Csv };

  explicit TrendPageWidget(TrendSource& source);

  void addRow(const std::string& key) override;
  void removeRow(const std::string& key);
  std::vector<std::string> rows() const override { return _keys; }
  void refresh() override;
  void chooseRows() override;

  /// Writes what is shown into a file, and says below the buttons how it went.
  void save(Format format, const QString& path);

  TrendView& view() { return *_view; }
  RowChooser& chooser() { return *_chooser; }
  QTableView& table() { return *_tableView; }
  const EventLegendWidget& marks() const { return *_marks; }
  const QLabel& remark() const { return *_remark; }

 protected:
  void resizeEvent(QResizeEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  QToolButton* addButton(const QString& text, const QString& tooltip);
  void addLength(const QString& text, std::chrono::minutes length, const QString& tooltip);
  void makeSaveMenu(QToolButton& button);
  void askWhere(Format format);
  void copyPicture();
  bool choose(const std::string& key, bool isWanted);
  std::string refusalOf(const std::string& key) const;
  void showPicture();
  void pictureHasChanged();
  void showRemark();
  void tell(const QString& message);
  void fitTable();

  TrendSource& _source;
  std::vector<std::string> _keys;
  QString _message;  // of the last wish of the user; gone with the next one
  QButtonGroup _lengths;
  QToolButton* _wholeButton = nullptr;
  QToolButton* _zoomIn = nullptr;
  QToolButton* _zoomOut = nullptr;
  QHBoxLayout* _buttons;
  QStackedLayout* _content;
  QWidget* _picture;
  TrendView* _view;
  EventLegendWidget* _marks;
  TrendTable _table;
  QTableView* _tableView;
  RowChooser* _chooser;
  QLabel* _remark;
  QProgressBar* _progress;
  QTimer _reading;  // refreshes while a file is read
};

}  // namespace varnel
