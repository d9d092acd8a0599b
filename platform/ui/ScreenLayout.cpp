#include "platform/ui/ScreenLayout.h"

#include <array>
#include <string_view>
#include <utility>

#include "base/Dictionary.h"

namespace varnel {

namespace {

using Kind = ScreenElement::Kind;

constexpr std::array<std::pair<std::string_view, Kind>, 4> kindNames{{{"Button", Kind::Button},
                                                                      {"TextField", Kind::TextField},
                                                                      {"Table", Kind::Table},
                                                                      {"Space", Kind::Space}}};

std::optional<Kind> kindNamed(const std::string* name) {
  for (const auto& [text, kind] : kindNames) {
    if (name && *name == text) return kind;
  }
  return std::nullopt;
}

std::string textOf(const Dictionary& entries, std::string_view key) {
  const std::string* text = entries.get(key).string();
  return text ? *text : std::string();
}

double lengthOf(const Dictionary& entries, std::string_view key) {
  return static_cast<double>(entries.get(key).integer().value_or(0));
}

std::optional<ScreenElement> elementFrom(const Value& value) {
  const Dictionary* entries = value.dictionary();
  if (!entries) return std::nullopt;
  const auto kind = kindNamed(entries->get("Kind").string());
  if (!kind) return std::nullopt;
  return ScreenElement{*kind, textOf(*entries, "Outlet"), textOf(*entries, "Title"),
                       textOf(*entries, "Action")};
}

std::optional<std::vector<ScreenElement>> rowFrom(const Value& value) {
  const Array* elements = value.array();
  if (!elements) return std::nullopt;
  std::vector<ScreenElement> row;
  for (const Value& element : *elements) {
    auto made = elementFrom(element);
    if (!made) return std::nullopt;
    row.push_back(std::move(*made));
  }
  return row;
}

}  // namespace

std::optional<ScreenLayout> ScreenLayout::fromResource(const Value& resource) {
  const Dictionary* entries = resource.dictionary();
  const Array* rows = entries ? entries->get("Rows").array() : nullptr;
  if (!rows) return std::nullopt;
  ScreenLayout layout{.margin = lengthOf(*entries, "Margin"),
                      .spacing = lengthOf(*entries, "Spacing"),
                      .backgroundAction = textOf(*entries, "BackgroundAction")};
  for (const Value& value : *rows) {
    auto row = rowFrom(value);
    if (!row) return std::nullopt;
    layout.rows.push_back(std::move(*row));
  }
  return layout;
}

}  // namespace varnel
