#include "widgets/QtValues.h"

#include <QGuiApplication>
#include <algorithm>

namespace varnel {

QString singleLine(std::string_view text) {
  QString line = QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
  const auto bendsTheLine = [](QChar character) {
    return character.category() == QChar::Other_Control || character == QChar::LineSeparator ||
           character == QChar::ParagraphSeparator;
  };
  if (std::any_of(line.cbegin(), line.cend(), bendsTheLine))
    std::replace_if(line.begin(), line.end(), bendsTheLine, u' ');
  return line;
}

QString plainTooltip(const QString& text) {
  // The toolkit wraps lines only at blanks. After this many characters without one, a line may be wrapped
  // too.
  constexpr qsizetype longestWord = 40;
  constexpr QChar zeroWidthSpace(0x200B);
  QString wrappable;
  qsizetype wordLength = 0;
  for (const QChar character : text) {
    if (wordLength >= longestWord && !character.isLowSurrogate()) {
      wrappable += zeroWidthSpace;
      wordLength = 0;
    }
    wrappable += character;
    wordLength = character.isSpace() ? 0 : wordLength + 1;
  }
  return QStringLiteral("<p style=\"white-space: pre-wrap\">") + wrappable.toHtmlEscaped() +
         QStringLiteral("</p>");
}

std::string utf8(const QString& text) { return text.toStdString(); }

QFont qtFont(const Font& font) {
  QFont made = QGuiApplication::font();
  if (!font.family.empty()) {
    made.setFamilies({QString::fromStdString(font.family)});
    made.setStyleHint(QFont::SansSerif);
  }
  made.setPixelSize(std::max(1, qRound(font.size)));
  made.setBold(font.weight == Font::Weight::Bold);
  return made;
}

QRectF qtRect(const Rect& rect) { return {rect.x, rect.y, rect.width, rect.height}; }

QRect qtPixels(const Rect& rect) { return qtRect(rect).toRect(); }

}  // namespace varnel
