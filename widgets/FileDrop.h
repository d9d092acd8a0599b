#pragma once

#include <QObject>
#include <QWidget>
#include <functional>
#include <string>

namespace varnel {

/// Lets a file be dropped onto a widget. It takes one local file at a time.
class FileDrop final : public QObject {
 public:
  /// Belongs to the widget. Calls the function with the path of the file.
  FileDrop(QWidget& target, std::function<void(const std::string& path)> take);

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  std::function<void(const std::string& path)> _take;
};

}  // namespace varnel
