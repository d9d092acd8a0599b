#pragma once

#include <QWidget>

namespace varnel {

/// The direction of the Tab key.
enum class FocusDirection { Next, Previous };

/// Gives the keyboard focus to the next widget inside `root` that takes it, and after the last one to the
/// first. False when there is none.
bool cycleFocusWithin(QWidget& root, FocusDirection direction);

}  // namespace varnel
