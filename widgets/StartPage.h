#pragma once

#include <QAbstractButton>
#include <QVBoxLayout>
#include <QWidget>
#include <functional>
#include <utility>
#include <vector>

namespace varnel {

/// What an empty window offers: a simulated modem, a file, and the port of a modem. It lies above the table
/// of a pane.
class StartPage final : public QWidget {
  Q_OBJECT

 public:
  /// One of several things to choose from.
  struct Choice {
    QString id;
    QString name;
  };

  /// Covers this widget, whose child it becomes, and follows its size.
  explicit StartPage(QWidget& table);

  /// Gives the keyboard focus to the first offer.
  void takeKeyboard() { _first->setFocus(Qt::OtherFocusReason); }
  void setModems(std::vector<Choice> modems) { _modems = std::move(modems); }
  /// The ports are looked for whenever the user wants to choose one.
  void setPortsSource(std::function<std::vector<Choice>()> ports) { _ports = std::move(ports); }

 Q_SIGNALS:
  void modemWanted(const QString& id);
  void fileWanted();
  void portWanted(const QString& id);

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;
  void paintEvent(QPaintEvent* event) override;

 private:
  QAbstractButton& addOffer(const QString& title, const QString& explanation);

  QVBoxLayout* _column;
  QAbstractButton* _first = nullptr;
  std::vector<Choice> _modems;
  std::function<std::vector<Choice>()> _ports;
};

}  // namespace varnel
