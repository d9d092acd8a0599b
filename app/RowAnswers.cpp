#include "app/RowAnswers.h"

#include <chrono>

#include "app/DateFormatter.h"
#include "app/PrintableText.h"

namespace varnel {

namespace {

constexpr std::string_view momentPattern = "yyyy-MM-dd 'at' HH:mm:ss";

// Such as "1 minute"; in the largest unit of which there is a whole one.
std::string durationText(std::chrono::nanoseconds duration) {
  struct Unit {
    std::chrono::seconds length;
    std::string_view name;
  };
  constexpr Unit units[] = {{std::chrono::hours(24), "day"},
                            {std::chrono::hours(1), "hour"},
                            {std::chrono::minutes(1), "minute"},
                            {std::chrono::seconds(1), "second"}};
  for (const Unit& unit : units) {
    const auto count = duration / unit.length;
    if (count > 0) return std::to_string(count) + " " + std::string(unit.name) + (count == 1 ? "" : "s");
  }
  return {};
}

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

std::string RowAnswers::explanation(const VarnelModelNode& row, std::string_view path,
                                    const std::optional<SignalLevel>& level) const {
  std::string text;
  const auto add = [&text](const std::string& line) {
    if (!text.empty()) text += '\n';
    text += line;
  };
  if (const auto explanation = explanations().of(path)) add(explanation->meaning);
  if (level) add("Level: " + std::string(nameOf(*level)));
  const auto* const leaf = dynamic_cast<const VarnelModelLeafNode*>(&row);
  if (!leaf || !leaf->writtenAt()) return text;
  const std::string age = durationText(durationBetween(*leaf->writtenAt(), _clock.now()));
  add(age.empty() ? "The modem has just sent it." : "The modem sent it " + age + " ago.");
  return text;
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
