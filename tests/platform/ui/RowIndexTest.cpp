#include "platform/ui/RowIndex.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

TEST(RowIndex, CountsThroughSections) {
  const RowIndex index({2, 0, 3});
  EXPECT_EQ(index.rows(), 5u);
  EXPECT_EQ(index.pathOf(0), (IndexPath{0, 0}));
  EXPECT_EQ(index.pathOf(1), (IndexPath{0, 1}));
  EXPECT_EQ(index.pathOf(2), (IndexPath{2, 0}));
  EXPECT_EQ(index.pathOf(4), (IndexPath{2, 2}));
}

TEST(RowIndex, FindsTheRowOfAPath) {
  const RowIndex index({2, 0, 3});
  EXPECT_EQ(index.rowOf({0, 1}), 1u);
  EXPECT_EQ(index.rowOf({2, 2}), 4u);
  EXPECT_EQ(index.rowOf({0, 2}), std::nullopt);
  EXPECT_EQ(index.rowOf({1, 0}), std::nullopt);
  EXPECT_EQ(index.rowOf({3, 0}), std::nullopt);
}

TEST(RowIndex, WithoutSectionsThereAreNoRows) { EXPECT_EQ(RowIndex().rows(), 0u); }

}  // namespace
}  // namespace varnel
