#pragma once

#include <QWidget>

namespace varnel {

/// Which way Tab goes.
enum class FocusDirection { Next, Previous };

/// Gives the keyboard to the next widget inside that one which takes it, round and round. False when there is
/// none.
bool cycleFocusWithin(QWidget& root, FocusDirection direction);

}  // namespace varnel
