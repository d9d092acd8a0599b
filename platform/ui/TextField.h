#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace varnel {

class TextField;

class TextFieldDelegate {
 public:
  virtual ~TextFieldDelegate() = default;
  /// The user has pressed the return key. True when the field is to do what it does by itself then.
  virtual bool textFieldShouldReturn(TextField& field) = 0;
};

/// One line that the user may edit.
class TextField {
 public:
  virtual ~TextField() = default;
  /// Null takes the delegate off.
  virtual void setDelegate(TextFieldDelegate* delegate) = 0;
  /// Empty when nothing was typed; absent only where a host knows a field without a text.
  virtual std::optional<std::string> text() const = 0;
  /// Gives the keyboard away and hides it where it is on the screen.
  virtual void resignFirstResponder() = 0;
};

}  // namespace varnel
