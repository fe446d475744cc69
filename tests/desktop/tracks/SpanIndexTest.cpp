// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/SpanIndex.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <limits>
#include <vector>

using desktop::SpanIndex;
using Span = SpanIndex::Span;

namespace {

std::vector<std::size_t> touching(const SpanIndex& index, double start, double end)
{
    std::vector<std::size_t> found;
    index.visitTouching(start, end, [&](std::size_t at) { found.push_back(at); });
    return found;
}

using Indexes = std::vector<std::size_t>;

} // namespace

TEST(SpanIndex, FindsNothingWhereThereIsNothing)
{
    const SpanIndex index;
    EXPECT_EQ(index.size(), 0U);
    EXPECT_EQ(index.latestEnd(), -std::numeric_limits<double>::infinity());
    EXPECT_EQ(touching(index, -1e9, 1e9), Indexes());
}

TEST(SpanIndex, FindsWhatTouchesARangeAtItsEdges)
{
    const SpanIndex index({{0, 1}, {1, 2}, {3, 3}, {4, 5}});
    EXPECT_EQ(touching(index, 2, 3), (Indexes{1, 2}));
    EXPECT_EQ(touching(index, 1, 1), (Indexes{0, 1}));
    EXPECT_EQ(touching(index, 2.5, 2.9), Indexes());
    EXPECT_EQ(touching(index, 5, 9), (Indexes{3}));
    EXPECT_EQ(touching(index, 5.1, 9), Indexes());
}

TEST(SpanIndex, FindsALongOneThatBeganFarBefore)
{
    std::vector<Span> spans{{0, 1000}};
    for (int at = 1; at < 1000; ++at)
        spans.push_back({double(at), at + 0.5});
    const SpanIndex index(std::move(spans));
    EXPECT_EQ(touching(index, 900.6, 900.9), (Indexes{0}));
    EXPECT_EQ(index.latestEnd(), 1000.0);
}

RC_GTEST_PROP(SpanIndex, FindsInOrderWhatALookAtEachOneFinds, ())
{
    std::vector<Span> spans;
    double start = *rc::gen::inRange(-20, 20);
    for (const int step : *rc::gen::container<std::vector<int>>(rc::gen::inRange(0, 4))) {
        start += step;
        spans.push_back({start, start + *rc::gen::inRange(0, 12)});
    }
    const double from = *rc::gen::inRange(-25, 60);
    const double to = from + *rc::gen::inRange(0, 20);
    Indexes expected;
    for (std::size_t at = 0; at < spans.size(); ++at) {
        if (spans[at].start <= to && spans[at].end >= from)
            expected.push_back(at);
    }
    RC_ASSERT(touching(SpanIndex(spans), from, to) == expected);
}
