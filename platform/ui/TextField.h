#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace varnel {

class TextField;

class TextFieldDelegate {
 public:
  virtual ~TextFieldDelegate() = default;
  /// The user has pressed the return key. Returns true when the field is to do its default action.
  virtual bool textFieldShouldReturn(TextField& field) = 0;
};

/// One line of text that the user may edit.
class TextField {
 public:
  virtual ~TextField() = default;
  /// Null removes the delegate.
  virtual void setDelegate(TextFieldDelegate* delegate) = 0;
  /// Empty when the user has typed nothing; absent only on a host with fields that can lack a text.
  virtual std::optional<std::string> text() const = 0;
  /// Gives up the keyboard focus, and hides an on-screen keyboard.
  virtual void resignFirstResponder() = 0;
};

}  // namespace varnel
