#pragma once

#include <QPointer>
#include <functional>
#include <string>

#include "app/RowAnswers.h"
#include "app/VarnelApp.h"
#include "widgets/WindowWidget.h"

namespace varnel {

/// What users can do with rows in the window beyond opening them: find them, copy them, and learn what they
/// mean. Also the sheet with all keys, and the menu.
class RowCommands final {
 public:
  /// The objects must outlive it.
  RowCommands(VarnelApp& app, const RowAnswers& answers);
  RowCommands(const RowCommands&) = delete;
  RowCommands& operator=(const RowCommands&) = delete;

  /// Adds the commands to the window.
  void addTo(WindowWidget& window);

 private:
  using Copy = std::string (*)(const VarnelModelNode& root, const NamePath& names);

  // What a copy is of.
  enum class Subject { Row, Section };

  QAction* addCopy(Subject subject, const QString& text, const QList<QKeySequence>& keys,
                   std::function<std::string(const NamePath& names)> contents);
  std::function<std::string(const NamePath& names)> copied(Copy copy) const;
  void find();
  void help();
  NamePath names() const;
  bool has(Subject subject) const;
  void followDisplay() const;

  VarnelApp& _app;
  const RowAnswers& _answers;
  QPointer<WindowWidget> _window;
};

}  // namespace varnel
