#pragma once

namespace varnel {

/// Something that the user did at the terminal.
struct Key {
  enum class Kind {
    Character,  ///< a printable character
    Control,    ///< Ctrl and a letter; `character` is the small letter
    Up,
    Down,
    Left,
    Right,
    ShiftLeft,
    ShiftRight,
    Home,
    End,
    PageUp,
    PageDown,
    Enter,
    Escape,
    Backspace,
    Delete,
    Tab,
    BackTab,
    Help,
    Click,  ///< the place is in `column` and `row`, as for the wheel
    WheelUp,
    WheelDown,
  };

  Kind kind = Kind::Character;
  wchar_t character = 0;
  int column = 0;
  int row = 0;

  static Key of(wchar_t character) { return {Kind::Character, character, 0, 0}; }
  static Key control(wchar_t letter) { return {Kind::Control, letter, 0, 0}; }
  bool is(wchar_t wanted) const { return kind == Kind::Character && character == wanted; }
  bool isControl(wchar_t letter) const { return kind == Kind::Control && character == letter; }
  bool isMouse() const { return kind >= Kind::Click; }
};

/// Whether somebody used a key. An unused key goes to what is around that.
enum class KeyUse { Used, Unused };

}  // namespace varnel
