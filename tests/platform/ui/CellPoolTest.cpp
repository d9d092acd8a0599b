#include "platform/ui/CellPool.h"

#include <gtest/gtest.h>

namespace varnel {
namespace {

std::unique_ptr<TableCell> cell(const char* identifier) {
  return std::make_unique<TableCell>(nullptr, identifier);
}

TEST(CellPool, IsEmptyAtFirst) { EXPECT_EQ(CellPool().take("Row"), nullptr); }

TEST(CellPool, HandsOutWhatCameInFirst) {
  CellPool pool;
  auto first = cell("Row"), second = cell("Row");
  const TableCell* const firstAddress = first.get();
  const TableCell* const secondAddress = second.get();
  pool.put(std::move(first));
  pool.put(std::move(second));
  const auto taken = pool.take("Row");
  EXPECT_EQ(taken.get(), firstAddress);
  EXPECT_EQ(pool.take("Row").get(), secondAddress);
  EXPECT_EQ(pool.take("Row"), nullptr);
}

TEST(CellPool, KeepsCellsOfOtherIdentifiers) {
  CellPool pool;
  pool.put(cell("Row"));
  pool.put(cell("Other"));
  EXPECT_EQ(pool.take("Third"), nullptr);
  EXPECT_EQ(pool.take("Other")->reuseIdentifier(), "Other");
  EXPECT_EQ(pool.take("Row")->reuseIdentifier(), "Row");
}

}  // namespace
}  // namespace varnel
