#include "app/RowAnswers.h"

#include "app/DateFormatter.h"
#include "app/PrintableText.h"

namespace varnel {

namespace {

constexpr std::string_view momentPattern = "yyyy-MM-dd 'at' HH:mm:ss";

}  // namespace

std::string RowAnswers::pathOf(const NamePath& names) {
  std::string path;
  for (const std::string& name : names) path.append("/").append(name);
  return path;
}

std::string RowAnswers::titleOf(const NamePath& names) {
  std::string title;
  for (const std::string& name : names) title.append(title.empty() ? "" : " > ").append(name);
  return title;
}

const Explanations& RowAnswers::explanations() const {
  if (!_explanations) _explanations.emplace(_resources);
  return *_explanations;
}

std::string RowAnswers::meaning(std::string_view path) const {
  const auto explanation = explanations().of(path);
  return explanation ? explanation->text() : std::string();
}

std::optional<SignalLevel> RowAnswers::level(const VarnelModelNode& row, std::string_view path) const {
  const auto series = _history.seriesOf(row);
  if (!series) return std::nullopt;
  const double number = _history.summary(*series, _history.last({})).last;
  return explanations().levelOf(path, number, _history.unit(*series));
}

std::string RowAnswers::age(const VarnelModelNode& row) const {
  if (!row.value()) return {};
  // Only a leaf has a value.
  const auto& written = static_cast<const VarnelModelLeafNode&>(row).writtenAt();
  if (!written) return {};
  return "The modem last sent it " + DateFormatter(momentPattern).string(*written, _clock.zoneAt(*written)) +
         ".";
}

std::string RowAnswers::everything(const VarnelModelNode& row, const NamePath& names) const {
  const std::string path = pathOf(names);
  std::string text = "This row: " + titleOf(names) + '\n';
  if (!row.value()) {
    const std::size_t rows = row.childNodes()->size();
    return text + meaning(path) + "It leads to " + std::to_string(rows) + (rows == 1 ? " row" : " rows") +
           "; Enter opens them.\n";
  }
  text += "Its value: " + printableText(*row.value());
  if (const auto howGood = level(row, path)) text.append(" (").append(nameOf(*howGood)).append(")");
  text += '\n';
  if (const std::string moment = age(row); !moment.empty()) text += moment + '\n';
  return text + meaning(path);
}

std::optional<RowAnswers::Course> RowAnswers::course(const VarnelModelNode& row,
                                                     const NamePath& names) const {
  const auto series = _history.seriesOf(row);
  if (!series) return std::nullopt;
  Course course{titleOf(names), *series};
  // The record can change its place while its course is shown.
  if (const std::string record = _history.record(*series); !record.empty())
    course.title.append(" (").append(record).append(")");
  return course;
}

}  // namespace varnel
