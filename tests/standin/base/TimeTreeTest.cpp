// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/TimeTree.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <memory>
#include <vector>

namespace standin::tests {

namespace {

struct Request {
    int start;
    int length;
};

/// Spans of a tree, in the order in which the tree has to have them.
class Spans {
public:
    explicit Spans(const std::vector<Request>& requests)
    {
        for (const Request& request : requests) {
            auto span = std::make_unique<TimeSpan>();
            span->start = request.start;
            span->end = request.start + request.length;
            span->order = m_spans.size();
            m_tree.insert(*span);
            m_spans.push_back(std::move(span));
        }
    }

    TimeTree& tree() { return m_tree; }
    TimeSpan& at(std::size_t index) { return *m_spans[index]; }

    void erase(std::size_t index)
    {
        m_tree.erase(*m_spans[index]);
        m_spans.erase(m_spans.begin() + static_cast<std::ptrdiff_t>(index));
    }

    std::vector<TimeSpan*> expected(double from, double to) const
    {
        std::vector<TimeSpan*> found;
        for (const auto& span : m_spans) {
            if (span->start <= to && span->end >= from)
                found.push_back(span.get());
        }
        std::sort(found.begin(), found.end(), [](const TimeSpan* a, const TimeSpan* b) {
            return a->start != b->start ? a->start < b->start : a->order < b->order;
        });
        return found;
    }

    std::vector<TimeSpan*> touching(double from, double to)
    {
        std::vector<TimeSpan*> found;
        m_tree.visitTouching(from, to, [&](TimeSpan& span) { found.push_back(&span); });
        return found;
    }

    std::vector<TimeSpan*> walked() const
    {
        std::vector<TimeSpan*> found;
        for (TimeSpan* span = m_tree.first(); span; span = TimeTree::next(*span))
            found.push_back(span);
        return found;
    }

    std::vector<TimeSpan*> walkedBack() const
    {
        std::vector<TimeSpan*> found;
        for (TimeSpan* span = m_tree.last(); span; span = TimeTree::previous(*span))
            found.push_back(span);
        return found;
    }

    std::size_t size() const { return m_spans.size(); }

private:
    TimeTree m_tree;
    std::vector<std::unique_ptr<TimeSpan>> m_spans;
};

rc::Gen<std::vector<Request>> anyRequests()
{
    return rc::gen::container<std::vector<Request>>(rc::gen::construct<Request>(
        rc::gen::inRange(0, 50), rc::gen::oneOf(rc::gen::inRange(0, 4), rc::gen::inRange(0, 60))));
}

} // namespace

TEST(TimeTree, AnEmptyTreeHasNothing)
{
    TimeTree tree;

    EXPECT_TRUE(tree.isEmpty());
    EXPECT_EQ(tree.size(), 0U);
    EXPECT_EQ(tree.first(), nullptr);
    EXPECT_EQ(tree.last(), nullptr);
    EXPECT_EQ(tree.firstFrom(0.0), nullptr);
    EXPECT_EQ(tree.firstAfter(0.0), nullptr);
    EXPECT_EQ(tree.latestEnd(), 0.0);
    tree.visitTouching(-1e9, 1e9, [](TimeSpan&) { FAIL(); });
}

TEST(TimeTree, SpansThatOnlyTouchTheRangeAreVisited)
{
    Spans spans({{0, 10}, {10, 10}, {20, 5}, {26, 1}});

    EXPECT_EQ(spans.touching(10, 20), (std::vector{&spans.at(0), &spans.at(1), &spans.at(2)}));
    EXPECT_EQ(spans.touching(10.5, 19.5), (std::vector{&spans.at(1)}));
    EXPECT_EQ(spans.touching(25.5, 25.6), (std::vector<TimeSpan*>{}));
}

TEST(TimeTree, OfSpansThatStartTogetherTheOneInsertedFirstComesFirst)
{
    Spans spans({{5, 1}, {5, 9}, {5, 0}});

    EXPECT_EQ(spans.walked(), (std::vector{&spans.at(0), &spans.at(1), &spans.at(2)}));
    EXPECT_EQ(spans.tree().firstFrom(5.0), &spans.at(0));
    EXPECT_EQ(spans.tree().firstAfter(5.0), nullptr);
}

RC_GTEST_PROP(TimeTree, WalksAndSearchesFindWhatAPlainScanFinds, ())
{
    Spans spans(*anyRequests());
    const auto from = static_cast<double>(*rc::gen::inRange(-5, 120));
    const double to = from + *rc::gen::inRange(0, 30);
    const auto all = [&] { return spans.expected(-1e9, 1e9); };

    while (spans.size() > 0) {
        RC_ASSERT(spans.tree().size() == spans.size());
        RC_ASSERT(spans.walked() == all());
        auto reversed = all();
        std::reverse(reversed.begin(), reversed.end());
        RC_ASSERT(spans.walkedBack() == reversed);
        RC_ASSERT(spans.touching(from, to) == spans.expected(from, to));

        const auto ordered = all();
        const auto firstFrom =
            std::find_if(ordered.begin(), ordered.end(), [&](const TimeSpan* span) { return span->start >= from; });
        const auto firstAfter =
            std::find_if(ordered.begin(), ordered.end(), [&](const TimeSpan* span) { return span->start > from; });
        RC_ASSERT(spans.tree().firstFrom(from) == (firstFrom == ordered.end() ? nullptr : *firstFrom));
        RC_ASSERT(spans.tree().firstAfter(from) == (firstAfter == ordered.end() ? nullptr : *firstAfter));
        const auto latest = std::max_element(ordered.begin(), ordered.end(),
                                             [](const TimeSpan* a, const TimeSpan* b) { return a->end < b->end; });
        RC_ASSERT(spans.tree().latestEnd() == (*latest)->end);

        spans.erase(*rc::gen::inRange<std::size_t>(0, spans.size()));
    }
    RC_ASSERT(spans.tree().isEmpty());
}

} // namespace standin::tests
