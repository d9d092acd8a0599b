#pragma once

#include <array>
#include <string_view>

namespace varnel {

/// The characters that are no text of the display. A terminal whose character set has only ASCII gets others.
struct Glyphs {
  std::wstring_view more;        ///< a text goes on past the edge
  std::wstring_view disclosure;  ///< the row leads to another pane
  std::wstring_view checkmark;
  std::wstring_view change;   ///< the row changed with the last refresh
  std::wstring_view step;     ///< between the names of a path
  std::wstring_view dash;     ///< between the parts of the window's title
  std::wstring_view divider;  ///< between two panes
  std::wstring_view line;     ///< a line from left to right
  std::array<std::wstring_view, 4> wheel;
  /// From the lowest to the highest value; empty where there are no blocks.
  std::wstring_view blocks;
};

inline constexpr Glyphs unicodeGlyphs{
    L"…", L"›", L"✓", L"•", L" › ", L" — ", L"│", L"─", {L"◐", L"◓", L"◑", L"◒"}, L"▁▂▃▄▅▆▇█"};
inline constexpr Glyphs asciiGlyphs{
    L">", L">", L"x", L"*", L" > ", L" - ", L"|", L"-", {L"|", L"/", L"-", L"\\"}, L"_.-=*#"};

}  // namespace varnel
