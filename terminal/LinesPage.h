#pragma once

#include <functional>
#include <string>

#include "terminal/Overlay.h"

namespace varnel {

/// A page of text that covers the screen. The keys of a table scroll it; q, Escape, Left, and h close it.
class LinesPage final : public Overlay {
 public:
  enum class Start { Top, End };

  /// `text` yields lines with a newline between them, each time anew. A page that starts at the end stays at
  /// the end while lines are added.
  LinesPage(std::wstring title, std::function<std::string()> text, Start start = Start::Top);

  Wish take(const Key& key) override;
  void paint(CellGrid& grid, const Glyphs& glyphs) override;

 private:
  void scrollBy(int lines);

  const std::wstring _title;
  const std::function<std::string()> _text;
  bool _isAtEnd;
  int _top = 0;
  int _lastTop = 0;
  int _page = 1;
};

}  // namespace varnel
