#pragma once

#include <QLineEdit>

#include "platform/ui/TextField.h"

namespace varnel {

/// A line that the user may edit.
class TextFieldWidget final : public QLineEdit, public TextField {
 public:
  /// The title is shown while the field is empty.
  explicit TextFieldWidget(const QString& title);

  void setDelegate(TextFieldDelegate* delegate) override { _delegate = delegate; }
  std::optional<std::string> text() const override;
  void resignFirstResponder() override;

 private:
  TextFieldDelegate* _delegate = nullptr;
};

}  // namespace varnel
