#include "platform/ui/ScreenLayout.h"

#include <gtest/gtest.h>

#include "tests/support/DictionaryOf.h"

namespace varnel {
namespace {

using Kind = ScreenElement::Kind;

Value row(Array elements) { return Value::ofArray(std::move(elements)); }
Value rows(Array rows) { return dictionaryOf({{"Rows", Value::ofArray(std::move(rows))}}); }

TEST(ScreenLayout, HasItsRowsAndElementsInTheirOrder) {
  const auto layout = ScreenLayout::fromResource(
      rows({row({dictionaryOf({{"Kind", "Button"}, {"Title", "Go"}, {"Action", "go:"}}),
                 dictionaryOf({{"Kind", "Space"}})}),
            row({dictionaryOf({{"Kind", "Table"}, {"Outlet", "list"}}),
                 dictionaryOf({{"Kind", "TextField"}, {"Outlet", "field"}, {"Title", "Name"}})})}));
  ASSERT_TRUE(layout);
  ASSERT_EQ(layout->rows.size(), 2u);
  ASSERT_EQ(layout->rows[0].size(), 2u);
  EXPECT_EQ(layout->rows[0][0], (ScreenElement{Kind::Button, "", "Go", "go:"}));
  EXPECT_EQ(layout->rows[0][1], (ScreenElement{Kind::Space, "", "", ""}));
  ASSERT_EQ(layout->rows[1].size(), 2u);
  EXPECT_EQ(layout->rows[1][0], (ScreenElement{Kind::Table, "list", "", ""}));
  EXPECT_EQ(layout->rows[1][1], (ScreenElement{Kind::TextField, "field", "Name", ""}));
}

TEST(ScreenLayout, HasMarginSpacingAndBackgroundAction) {
  Value resource = rows({});
  resource.dictionary()->set("Margin", Value::ofInteger(12));
  resource.dictionary()->set("Spacing", Value::ofInteger(8));
  resource.dictionary()->set("BackgroundAction", "touched:");
  const auto layout = ScreenLayout::fromResource(resource);
  ASSERT_TRUE(layout);
  EXPECT_EQ(layout->margin, 12);
  EXPECT_EQ(layout->spacing, 8);
  EXPECT_EQ(layout->backgroundAction, "touched:");
}

TEST(ScreenLayout, WithoutThemTheyAreNone) {
  const auto layout = ScreenLayout::fromResource(rows({}));
  ASSERT_TRUE(layout);
  EXPECT_EQ(layout->margin, 0);
  EXPECT_EQ(layout->spacing, 0);
  EXPECT_EQ(layout->backgroundAction, "");
}

TEST(ScreenLayout, IsNotMadeOfAnythingElse) {
  EXPECT_FALSE(ScreenLayout::fromResource(Value()));
  EXPECT_FALSE(ScreenLayout::fromResource(Value("text")));
  EXPECT_FALSE(ScreenLayout::fromResource(dictionaryOf({})));
  EXPECT_FALSE(ScreenLayout::fromResource(rows({Value("no row")})));
  EXPECT_FALSE(ScreenLayout::fromResource(rows({row({Value("no element")})})));
  EXPECT_FALSE(ScreenLayout::fromResource(rows({row({dictionaryOf({})})})));
  EXPECT_FALSE(ScreenLayout::fromResource(rows({row({dictionaryOf({{"Kind", "Slider"}})})})));
}

}  // namespace
}  // namespace varnel
