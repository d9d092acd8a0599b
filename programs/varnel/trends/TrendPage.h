#pragma once

#include <QWidget>
#include <string>

#include "programs/varnel/trends/TrendSource.h"

namespace varnel {

/// The view of courses: the content of a page of the window.
class TrendPage : public QWidget {
 public:
  /// Adds this row to the picture, unless it is there.
  virtual void addRow(const std::string& key) = 0;
  /// The keys of the rows in the picture.
  virtual std::vector<std::string> rows() const = 0;
  /// Lets the user choose the rows of the picture.
  virtual void chooseRows() = 0;
  /// Shows what the source has now.
  virtual void refresh() = 0;
};

}  // namespace varnel

/// The one function of the module. The module is a library of its own, which the program loads when the first
/// course is shown, so that the window opens as fast as without it.
extern "C" {
/// A new view, which the caller owns. The source must outlive it.
varnel::TrendPage* varnelMakeTrendPage(varnel::TrendSource& source);
}
