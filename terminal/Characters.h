#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace varnel {

/// Makes the C library take texts as UTF-8, whatever the user's locale is. Call it before anything else of
/// this folder.
void useUtf8Characters();

/// The text as it is shown on one line. Line ends, tabs, and other control characters become blanks. Bytes
/// that are not UTF-8 become replacement characters.
std::wstring charactersOf(std::string_view text);
std::string utf8(std::wstring_view text);

/// How many columns of a terminal the character takes: 0 if it changes the one before, 2 if it is wide.
int columnsOf(wchar_t character);
int columnsOf(std::wstring_view text);
int columnsOf(std::string_view text);

/// The first characters of the text, as many as there is room for.
std::wstring_view fitting(std::wstring_view text, int columns);
/// The text, or what fits of it and the mark.
std::wstring cutTo(std::wstring_view text, int columns, std::wstring_view mark);
/// The text in lines of this width, broken at blanks where there are some. A newline begins a new line.
std::vector<std::wstring> wrapped(std::string_view text, int columns);

}  // namespace varnel
