#pragma once

#include <string>

#include "platform/ui/TextField.h"
#include "terminal/CellGrid.h"
#include "terminal/Key.h"

namespace varnel {

/// One line of text. A text that is longer than its room scrolls with the cursor.
class TerminalTextField final : public TextField {
 public:
  explicit TerminalTextField(std::string_view placeholder = {});

  void setDelegate(TextFieldDelegate* delegate) override { _delegate = delegate; }
  std::optional<std::string> text() const override;
  void resignFirstResponder() override { _hasResigned = true; }

  KeyUse take(const Key& key);
  /// Whether the field gave up the focus since this was called last.
  bool hasResigned();

  enum class Focus { Has, HasNot };
  void paint(CellGrid& grid, const Area& area, Focus focus) const;

 private:
  void insert(wchar_t character);

  TextFieldDelegate* _delegate = nullptr;
  std::wstring _placeholder;
  std::wstring _text;
  std::size_t _cursor = 0;  // before this character
  bool _hasResigned = false;
};

}  // namespace varnel
