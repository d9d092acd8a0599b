#include "widgets/RowWidget.h"

#include <gtest/gtest.h>

#include "tests/support/TestWidgets.h"

namespace varnel {
namespace {

// A table of 360 × 400 with one leaf in it.
class RowWidgetTest : public testing::Test {
 protected:
  RowWidget& show(const std::string& name, const std::string& value) {
    delegate.rows = {{name, value}};
    table.resize(360, 400);
    table.setDelegate(&delegate);
    table.show();
    return *table.visibleRows().front();
  }
  enum class Edge { Left, Right };
  // Whether the three dots are painted at this edge, with nothing between them.
  static bool hasDots(RowWidget& row, Edge edge) {
    const QImage picture = row.grab().toImage();
    const auto isPainted = [&](int distance) {
      const int x = edge == Edge::Left ? distance : picture.width() - distance;
      return picture.pixelColor(x, 25) != picture.pixelColor(x, 12);
    };
    return isPainted(6) && !isPainted(9) && isPainted(12) && !isPainted(15) && isPainted(18);
  }

  TestRows delegate{{}};
  TableWidget table;
};

TEST_F(RowWidgetTest, AShortValueHasNoMarkAtEitherEdge) {
  RowWidget& row = show("RSRP", "-97.25 dBm");
  EXPECT_FALSE(hasDots(row, Edge::Left));
  EXPECT_FALSE(hasDots(row, Edge::Right));
  EXPECT_FALSE(row.reachesPastItsEdge());
}

TEST_F(RowWidgetTest, AValueOutsideTheRowIsMarkedAtTheRightEdge) {
  RowWidget& row = show("EF-3GPP MAIL BOX DIALING NUMBER", "+15550100");
  EXPECT_FALSE(hasDots(row, Edge::Left));
  EXPECT_TRUE(hasDots(row, Edge::Right));
  EXPECT_TRUE(row.reachesPastItsEdge());
}

TEST_F(RowWidgetTest, ScrolledSidewaysTheMarkIsWhereTheRestIs) {
  RowWidget& row = show("EF-3GPP MAIL BOX DIALING NUMBER", "+15550100");
  row.scrollSidewaysTo(60);
  EXPECT_TRUE(hasDots(row, Edge::Left));
  EXPECT_TRUE(hasDots(row, Edge::Right));
  row.scrollSidewaysTo(10000);
  EXPECT_TRUE(hasDots(row, Edge::Left));
  EXPECT_FALSE(hasDots(row, Edge::Right));
}

TEST_F(RowWidgetTest, ItsNameIsTheFirstOfItsTextsAlsoWhenThatIsEmpty) {
  EXPECT_EQ(show("RSRP", "-97 dBm").name(), "RSRP");
  delegate.rows = {{"", "-97 dBm"}};
  table.reloadData();
  EXPECT_EQ(table.visibleRows().front()->name(), "");
}

}  // namespace
}  // namespace varnel
