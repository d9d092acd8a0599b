#pragma once

#include <QAction>
#include <QList>
#include <QString>
#include <QTextBrowser>
#include <functional>
#include <string>
#include <vector>

namespace varnel {

/// Keys, and what they do.
struct KeyHelp {
  QString keys;
  QString deed;
};

/// The keys of the panes, which no action has.
const std::vector<KeyHelp>& keysOfPanes();
/// Those of actions that have keys and a text.
std::vector<KeyHelp> keysOf(const QList<QAction*>& actions);

/// One sheet with what there is to say about a row, and all keys below it.
class HelpPage final : public QTextBrowser {
  Q_OBJECT

 public:
  /// `about` yields plain lines about the row, and is asked again at each `update`. Without any, only the
  /// keys are shown.
  HelpPage(std::function<std::string()> about, std::vector<KeyHelp> keys);

  /// The display has changed. The place on the sheet stays.
  void updateAbout();

 private:
  QString sheet(const QString& about) const;

  const std::function<std::string()> _about;
  const std::vector<KeyHelp> _keys;
  QString _shown;
};

}  // namespace varnel
