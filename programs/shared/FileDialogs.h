#pragma once

class QFileDialog;

namespace varnel {

/// Opens the dialog no larger than the screen of its parent. On a small screen it fills the screen and leaves
/// out what is not needed to find a file.
void openWithinScreen(QFileDialog& dialog);

}  // namespace varnel
