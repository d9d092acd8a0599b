#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <QApplication>
#include <QLabel>
#include <QLineEdit>
#include <QListView>
#include <QPainter>
#include <QTest>
#include <algorithm>
#include <cstdlib>
#include <functional>
#include <map>
#include <memory>
#include <optional>

#include "programs/varnel-telephonyd/simulation/Technologies.h"
#include "tests/support/DictionaryOf.h"
#include "tests/support/PacketBuilder.h"
#include "tests/support/RecordingLog.h"
#include "tests/support/TestWidgets.h"
#include "tests/support/ViewerInMemory.h"
#include "widgets/Colors.h"
#include "widgets/QtValues.h"
#include "widgets/SlideOverlay.h"

namespace varnel {
namespace {

using namespace std::chrono_literals;

// The whole viewer in a window of 360 × 640 points on an invisible screen, with the messages of a simulated
// LTE modem. Its pictures are measured, not compared: fonts differ between machines.
class Appearance : public testing::Test {
 protected:
  ~Appearance() override {
    if (_viewer) _viewer->app.applicationWillTerminate();
    _viewer.reset();
    if (_application) QApplication::setPalette(QPalette());
  }

  // Pixels of the screen per point.
  void launch(const char* scale = "1", const QPalette* palette = nullptr) {
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    ::setenv("QT_SCALE_FACTOR", scale, 1);
    ::unsetenv("DBUS_SESSION_BUS_ADDRESS");
    _application = std::make_unique<QApplication>(_argumentCount, _arguments);
    ::unsetenv("QT_SCALE_FACTOR");
    QApplication::setFont(QFont(QStringLiteral("DejaVu Sans")));
    if (palette) QApplication::setPalette(*palette);
    _viewer.emplace("kalvi-lte");
    _viewer->app.applicationDidFinishLaunching();
    window().setGeometry(0, 0, 360, 640);
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window(), patience_ms));
    _viewer->queue.run();
    const auto modem = simulatedModem("kalvi-lte", 7);
    for (SimulatedMessage next = modem->next(); next.at <= 20s; next = modem->next())
      _viewer->deliver(next.bytes);
    refresh();
  }
  void receive(const Value& contexts) {
    _viewer->deliver(serverMessage(0xFF0002, contexts));
    refresh();
  }
  void refresh() { _viewer->refresh(); }
  void goTo(const NamePath& path) {
    _viewer->app.goTo(path);
    settle();
  }
  void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(QApplication::focusWidget(), key, modifiers);
    settle();
  }
  // Nothing slides any more, what has changed has its place, and what was closed is gone.
  void settle() {
    ASSERT_TRUE(QTest::qWaitFor([this] { return !slides(); }, patience_ms));
    QCoreApplication::processEvents();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  }
  bool slides() {
    const auto all = window().findChildren<QWidget*>();
    return std::ranges::any_of(all, [](QWidget* each) { return dynamic_cast<SlideOverlay*>(each); });
  }

  WindowWidget& window() { return static_cast<WindowWidget&>(*_viewer->app.window()); }
  PaneWidget& pane() { return window().stack()->topPane(); }
  std::vector<RowWidget*> rows() { return pane().tableWidget().visibleRows(); }
  static QImage pictureOf(QWidget& widget) { return widget.grab().toImage(); }

  // Each screen by its name, one after the other.
  void visitScreens(const std::function<void(const std::string& name)>& visit) {
    visit("sections");
    goTo({"Serving Cell Measurements", "Average RSRP"});
    visit("values");
    press(Qt::Key_F, Qt::ControlModifier);
    QTest::keyClicks(QApplication::focusWidget(), "rsrp");
    visit("find");
    press(Qt::Key_Escape);
    press(Qt::Key_F1);
    visit("help");
    press(Qt::Key_Escape);
    press(Qt::Key_S, Qt::ControlModifier);
    visit("save");
    press(Qt::Key_Escape);
  }

 private:
  int _argumentCount = 1;
  char _name[7] = "varnel";
  char* _arguments[2] = {_name, nullptr};
  const RecordingLog _log;
  std::unique_ptr<QApplication> _application;
  std::optional<ViewerInMemory> _viewer;
};

// ---- What pictures show ----

QRect inPixels(const QRect& points, const QImage& picture) {
  const double scale = picture.devicePixelRatio();
  return QRectF(points.x() * scale, points.y() * scale, points.width() * scale, points.height() * scale)
      .toRect();
}

// The color that most pixels of the area have.
QColor groundOf(const QImage& picture, const QRect& area) {
  std::map<QRgb, int> counts;
  for (int y = area.top(); y <= area.bottom(); ++y)
    for (int x = area.left(); x <= area.right(); ++x) ++counts[picture.pixel(x, y)];
  return QColor::fromRgb(
      std::ranges::max_element(counts, {}, [](const auto& entry) { return entry.second; })->first);
}

// The columns in which something is painted, other than the ground; nothing when there are none.
std::optional<std::pair<int, int>> paintedColumns(const QImage& picture, const QRect& area) {
  const QRgb ground = groundOf(picture, area).rgb();
  std::optional<std::pair<int, int>> columns;
  for (int x = area.left(); x <= area.right(); ++x) {
    for (int y = area.top(); y <= area.bottom(); ++y) {
      if (picture.pixel(x, y) == ground) continue;
      columns = {columns ? columns->first : x, x};
      break;
    }
  }
  return columns;
}

// The best contrast of a pixel to the ground. The middle of a stroke has the color of the text.
double contrastIn(const QImage& picture, const QRect& area) {
  const QColor ground = groundOf(picture, area);
  double best = 1;
  for (int y = area.top(); y <= area.bottom(); ++y)
    for (int x = area.left(); x <= area.right(); ++x)
      best = std::max(best, contrast(ground, picture.pixelColor(x, y)));
  return best;
}

// Where the window shows the widget, without what lies outside of the widgets around it.
QRect placeIn(const QWidget& window, const QWidget& widget) {
  QRect place(widget.mapTo(&window, QPoint(0, 0)), widget.size());
  for (const QWidget* around = widget.parentWidget(); around; around = around->parentWidget())
    place &= QRect(around->mapTo(&window, QPoint(0, 0)), around->size());
  return place;
}

// The widgets of this kind that the user can see: another widget may lie above them.
template <class Widget>
std::vector<const Widget*> seenIn(const QWidget& window) {
  std::vector<const Widget*> seen;
  for (const Widget* const widget : window.findChildren<const Widget*>()) {
    const QWidget* const top = window.childAt(placeIn(window, *widget).center());
    if (widget->isVisible() && top && (top == widget || widget->isAncestorOf(top))) seen.push_back(widget);
  }
  return seen;
}

// ---- High contrast ----

QPalette highContrast() {
  QPalette palette;
  for (const auto role :
       {QPalette::Window, QPalette::Base, QPalette::Button, QPalette::AlternateBase, QPalette::ToolTipBase})
    palette.setColor(role, Qt::black);
  for (const auto role :
       {QPalette::WindowText, QPalette::Text, QPalette::ButtonText, QPalette::PlaceholderText,
        QPalette::ToolTipText, QPalette::BrightText, QPalette::HighlightedText})
    palette.setColor(role, Qt::white);
  palette.setColor(QPalette::Highlight, QColor(0x00, 0x80, 0xFF));
  palette.setColor(QPalette::Link, QColor(0xFF, 0xFF, 0x00));
  return palette;
}

// WCAG 2.1: level AAA for what has to be read, level AA for what repeats or adds.
constexpr double contrastOfText = 7;
constexpr double contrastOfMore = 4.5;

TEST_F(Appearance, InHighContrastEveryTextStandsOut) {
  const QPalette palette = highContrast();
  launch("1", &palette);
  int texts = 0;
  visitScreens([&](const std::string& screen) {
    const QImage picture = pictureOf(window());
    const auto expectText = [&](const QRect& area, const QString& text, double least) {
      if (area.width() < 8 || area.height() < 8) return;
      ++texts;
      EXPECT_GE(contrastIn(picture, area), least) << screen << ": " << text.toStdString();
    };
    EXPECT_EQ(groundOf(picture, picture.rect()), QColor(Qt::black)) << screen;
    for (const auto* const label : seenIn<QLabel>(window())) {
      if (!label->text().isEmpty()) expectText(placeIn(window(), *label), label->text(), contrastOfText);
    }
    for (const auto* const button : seenIn<QAbstractButton>(window())) {
      if (!button->text().isEmpty()) expectText(placeIn(window(), *button), button->text(), contrastOfMore);
    }
    if (screen == "sections" || screen == "values") {
      for (const RowWidget* const row : rows()) {
        const QRect place = placeIn(window(), *row).adjusted(4, 4, -4, -4);
        const QRect name(place.left(), place.top(), 60, place.height());
        expectText(name, row->name(), contrastOfText);
        const QRect end(place.right() - 50, place.top(), 50, place.height());
        const bool hasValue =
            row->description() != row->name() && !row->description().endsWith(QStringLiteral(": "));
        if (paintedColumns(picture, end)) expectText(end, row->description(), hasValue ? contrastOfText : 3);
      }
    }
    if (const auto* const list = window().findChild<QListView*>()) {
      for (int i = 0; i < 4; ++i) {
        const QRect item = list->visualRect(list->model()->index(i, 0))
                               .translated(placeIn(window(), *list->viewport()).topLeft());
        expectText({item.left() + 6, item.top() + 5, 150, 22}, QStringLiteral("name"), contrastOfText);
        expectText({item.left() + 6, item.top() + 28, 150, 16}, QStringLiteral("sections"), contrastOfMore);
      }
    }
    if (screen == "help")
      expectText(placeIn(window(), *window().page()).adjusted(0, 0, -20, 0), QStringLiteral("help"),
                 contrastOfText);
  });
  EXPECT_GT(texts, 40) << "the screens have texts";
}

// ---- 200 % ----

// True when each block of 2 × 2 pixels has one color, as in a picture that was made larger.
bool isEnlarged(const QImage& picture, const QRect& area) {
  for (int y = area.top() & ~1; y + 1 <= area.bottom(); y += 2) {
    for (int x = area.left() & ~1; x + 1 <= area.right(); x += 2) {
      const QRgb color = picture.pixel(x, y);
      if (picture.pixel(x + 1, y) != color || picture.pixel(x, y + 1) != color ||
          picture.pixel(x + 1, y + 1) != color)
        return false;
    }
  }
  return true;
}

TEST_F(Appearance, At200PercentEverythingIsSharpAndNothingIsCut) {
  launch("2");
  ASSERT_EQ(window().devicePixelRatioF(), 2);
  visitScreens([&](const std::string& screen) {
    const QImage picture = pictureOf(window());
    ASSERT_EQ(picture.size(), QSize(720, 1280)) << screen;
    for (const auto* const label : seenIn<QLabel>(window())) {
      if (label->text().isEmpty()) continue;
      EXPECT_FALSE(isEnlarged(picture, inPixels(placeIn(window(), *label), picture)))
          << screen << ": " << label->text().toStdString();
      EXPECT_TRUE(label->wordWrap() ||
                  label->width() >= label->fontMetrics().horizontalAdvance(label->text()))
          << screen << ": " << label->text().toStdString();
    }
    if (screen != "sections" && screen != "values") return;
    for (const RowWidget* const row : rows()) {
      const QRect place = placeIn(window(), *row);
      if (place.height() < 50) continue;
      EXPECT_FALSE(isEnlarged(picture, inPixels(place, picture))) << row->name().toStdString();
      // The last points of a row's content are free, unless there is more to scroll to.
      const int end = place.left() + static_cast<int>(row->contentBounds().width);
      const QRect last = inPixels({end - 2, place.top() + 8, 2, place.height() - 16}, picture);
      EXPECT_TRUE(row->sidewaysRange() > 0 || !paintedColumns(picture, last))
          << row->description().toStdString();
      // The line below a row is one pixel of the screen, half a point.
      const QRect line = inPixels({place.left() + 20, place.bottom() - 1, 40, 2}, picture);
      const QColor ground =
          groundOf(picture, inPixels({place.left(), place.top() + 2, place.width(), 4}, picture));
      int painted = 0;
      for (int y = line.top(); y <= line.bottom(); ++y)
        painted += picture.pixelColor(line.left(), y) != ground ? 1 : 0;
      EXPECT_EQ(painted, 1) << row->name().toStdString();
    }
  });
}

// ---- Names from right to left ----

// "network", "the network of the city with a long name", and "internet" in Hebrew; "network" in Arabic.
const std::string network = "רשת", city = "הרשת העירונית עם השם הארוך מאוד", internet = "אינטרנט",
                  arabic = "شبكة";

// How much is painted in each column, from the first one with anything on.
std::vector<int> inkOf(const QImage& picture) {
  const QColor ground = groundOf(picture, picture.rect());
  std::vector<int> ink;
  for (int x = 0; x < picture.width(); ++x) {
    int inColumn = 0;
    for (int y = 0; y < picture.height(); ++y)
      inColumn += std::abs(picture.pixelColor(x, y).green() - ground.green());
    if (inColumn > 0 || !ink.empty()) ink.push_back(inColumn);
  }
  ink.resize(static_cast<std::size_t>(picture.width()));
  return ink;
}

int distance(const std::vector<int>& one, const std::vector<int>& other) {
  int sum = 0;
  for (std::size_t i = 0; i < one.size(); ++i) sum += std::abs(one[i] - other[i]);
  return sum;
}

// A name as the rows write it, on white.
QImage nameAlone(const QString& name) {
  QImage picture(120, 34, QImage::Format_RGB32);
  picture.fill(Qt::white);
  QPainter painter(&picture);
  painter.setFont(qtFont(Font::boldSystem(15)));
  painter.drawText(picture.rect(), Qt::AlignLeft | Qt::AlignAbsolute | Qt::AlignVCenter, name);
  return picture;
}

// A row begins with the mark of a change; names begin after it.
constexpr int endOfChangeMark = 8;

TEST_F(Appearance, NamesFromRightToLeftStandWhereOthersStandAndReadFromTheRight) {
  launch();
  const Value contexts = Value::ofArray({dictionaryOf({{"APN", "internet"},
                                                       {network, internet},
                                                       {arabic, arabic},
                                                       {city, city + city},
                                                       {"LTE " + network, "x"}})});
  receive(contexts);
  receive(contexts);  // so that no row has the mark of a change
  goTo({"PDP Context Info", "0", "APN"});
  press(Qt::Key_Home);
  ASSERT_GE(rows().size(), 5u);
  const QImage picture = pictureOf(window());
  const auto columnsOf = [&](std::size_t row) {
    const QRect place = placeIn(window(), *rows().at(row)).adjusted(endOfChangeMark, 8, -4, -8);
    return *paintedColumns(picture, place);
  };
  const auto latin = columnsOf(0);
  for (const std::size_t row : {1U, 2U, 4U}) {
    // Names begin at the left inset and values end at the right one, in any script: the bearings of the
    // letters differ by a few points.
    EXPECT_NEAR(columnsOf(row).first, latin.first, 5) << rows().at(row)->description().toStdString();
    EXPECT_NEAR(columnsOf(row).second, latin.second, 8) << rows().at(row)->description().toStdString();
    EXPECT_EQ(rows().at(row)->sidewaysRange(), 0);
  }
  EXPECT_GT(rows().at(3)->sidewaysRange(), 0) << "a long name can be scrolled";

  // The first letter is the rightmost one: in the other order the ink would stand elsewhere.
  const QRect name = placeIn(window(), *rows().at(1));
  const auto painted = inkOf(picture.copy(name.left() + endOfChangeMark, name.top() + 8, 120, 34));
  QString reversed = QString::fromStdString(network);
  std::reverse(reversed.begin(), reversed.end());
  EXPECT_LT(distance(painted, inkOf(nameAlone(QString::fromStdString(network)))),
            distance(painted, inkOf(nameAlone(reversed))));
}

}  // namespace
}  // namespace varnel
