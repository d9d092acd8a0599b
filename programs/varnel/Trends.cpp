#include "programs/varnel/Trends.h"

#include <memory>
#include <stdexcept>
#include <utility>

#include "programs/shared/Modules.h"
#include "widgets/TableWidget.h"

namespace varnel {

namespace {

std::unique_ptr<TrendPage> makePage(TrendSource& source) {
  const auto make = reinterpret_cast<decltype(&varnelMakeTrendPage)>(
      moduleFunction("varnel-trends.so", "varnelMakeTrendPage", "shows trends"));
  return std::unique_ptr<TrendPage>(make(source));
}

}  // namespace

void Trends::furnish(WindowWidget& window) {
  _window = &window;
  QAction& trend = window.addCommand(QObject::tr("Trend of this row"), {Qt::Key_T}, [this] {
    if (page()) return page()->chooseRows();
    show(_window->pathOfFocus());
  });
  trend.setObjectName(QLatin1String(TableWidget::courseCommand));
  const auto hasCourse = [this] { return keyOf(_window->pathOfFocus()).has_value(); };
  window.offerOnlyIf(trend, hasCourse);
  const QAction& addition =
      window.addCommand(QObject::tr("Add this row to the last trend"), {Qt::SHIFT | Qt::Key_T}, [this] {
        if (page()) return page()->chooseRows();
        showAlso(_window->pathOfFocus());
      });
  window.offerOnlyIf(addition, hasCourse);
}

void Trends::show(const NamePath& path) { open(path, Picture::New); }

void Trends::showAlso(const NamePath& path) { open(path, Picture::WithFormerRows); }

void Trends::open(const NamePath& path, Picture picture) {
  if (!_window) return;
  const std::string obstacle = _saved ? _saved->obstacle() : std::string();
  if (!obstacle.empty()) return _host.tellFailure(obstacle);
  std::unique_ptr<TrendPage> page;
  const auto former = picture == Picture::WithFormerRows ? source().remembered() : std::vector<std::string>();
  try {
    page = makePage(source());
  } catch (const std::runtime_error& error) {
    return _host.tellFailure(error.what());
  }
  for (const std::string& key : former) page->addRow(key);
  if (const auto key = keyOf(path)) page->addRow(*key);
  _page = page.get();
  const bool isEmpty = page->rows().empty();
  _window->showPage(QObject::tr("Trend"), std::move(page));
  // A section, or a text, has no course.
  if (isEmpty) _page->chooseRows();
}

// A row that shows no number at present may have had one before, or later in the file. Outside of lists, its
// path is its key.
std::optional<std::string> Trends::keyOf(const NamePath& path) {
  if (path.empty()) return std::nullopt;
  if (auto key = _host.keyOf(path)) return key;
  std::string joined;
  for (const std::string& name : path) joined.append("/").append(name);
  return source().row(joined) ? std::optional(joined) : std::nullopt;
}

void Trends::refresh() {
  if (page()) page()->refresh();
}

const CaptureHistory* Trends::capture() const {
  const bool isThere = _capture && (_capture->isReading() || !_capture->isEmpty());
  return isThere ? _capture.get() : nullptr;
}

HistoryTrends& Trends::source() {
  if (_saved) return _saved->trends();
  return capture() ? _capture->trends() : _host.live;
}

void Trends::openCapture(CaptureHistory::Wish wish) {
  closeFile();
  _capture = std::make_unique<CaptureHistory>(std::move(wish));
}

void Trends::openSaved(SavedHistory::Wish wish) {
  closeFile();
  _saved = std::make_unique<SavedHistory>(std::move(wish));
}

void Trends::closeFile() {
  leavePage();
  _capture.reset();
  _saved.reset();
}

void Trends::leavePage() {
  if (page()) _window->closePage();
  // Closing deletes the page later, but what it shows may go at once.
  delete _page.data();
}

}  // namespace varnel
