// SPDX-License-Identifier: GPL-3.0-or-later
#include <gtest/gtest.h>

#include "host/gtk/list/range_selection.h"

namespace vaelo {
namespace {

using Rows = std::vector<std::size_t>;

class RangeSelectionTest : public testing::Test {
 protected:
  RangeSelectionTest() { list({"a", "b", "c", "d", "e", "f"}); }

  void list(const std::vector<std::string>& names) {
    std::vector<FolderEntry> entries;
    entries.reserve(names.size());
    for (const std::string& name : names) entries.push_back({name, name, EntryKind::Document, ""});
    model_.setEntries(std::move(entries));
  }
  Rows extend(std::size_t position) {
    EXPECT_TRUE(range_.extendTo(position));
    return model_.selectedRows();
  }

  FolderModel model_;
  RangeSelection range_{model_};
};

TEST_F(RangeSelectionTest, ALaterRangeReplacesTheEarlierOneFromTheSameRow) {
  range_.begin(2);
  EXPECT_EQ(extend(4), Rows({2, 3, 4}));
  EXPECT_EQ(extend(3), Rows({2, 3}));
  EXPECT_EQ(extend(0), Rows({0, 1, 2}));
  EXPECT_EQ(extend(2), Rows({2}));
}

TEST_F(RangeSelectionTest, WhatWasSelectedBeforeStays) {
  model_.setSelected(0, true);
  model_.setSelected(3, true);
  range_.begin(2);
  EXPECT_EQ(extend(4), Rows({0, 2, 3, 4}));
  EXPECT_EQ(extend(2), Rows({0, 2, 3}));
}

TEST_F(RangeSelectionTest, WhatIsSelectedOtherwiseMeanwhileStays) {
  range_.begin(1);
  extend(3);
  model_.setSelected(5, true);
  EXPECT_EQ(extend(1), Rows({1, 2, 3, 5}));
}

TEST_F(RangeSelectionTest, AnotherBeginningKeepsTheRangeBefore) {
  range_.begin(0);
  extend(1);
  range_.begin(4);
  EXPECT_EQ(extend(5), Rows({0, 1, 4, 5}));
  EXPECT_EQ(extend(4), Rows({0, 1, 4}));
}

TEST_F(RangeSelectionTest, ItEndsWhereItWasExtendedTo) {
  EXPECT_FALSE(range_.endsAt(0));
  range_.begin(1);
  EXPECT_TRUE(range_.endsAt(1));
  extend(3);
  EXPECT_TRUE(range_.endsAt(3));
  EXPECT_FALSE(range_.endsAt(1));
  EXPECT_FALSE(range_.endsAt(9));
}

TEST_F(RangeSelectionTest, WithoutABeginningThereIsNone) {
  EXPECT_FALSE(range_.extendTo(2));
  range_.begin(1);
  range_.forget();
  EXPECT_FALSE(range_.extendTo(2));
  range_.begin(1);
  list({"a", "c"});
  EXPECT_FALSE(range_.extendTo(1));
  EXPECT_EQ(model_.selectedRows(), Rows());
}

}  // namespace
}  // namespace vaelo
