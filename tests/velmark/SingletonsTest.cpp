// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Singletons.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <vector>

using namespace Velmark;

namespace {

/// Writes its number down when it ends, and may try to add another object then.
class Ender : public FObject {
public:
    Ender(std::vector<int>& ended, int number) : m_ended(ended), m_number(number) {}
    ~Ender() override
    {
        m_ended.push_back(m_number);
        if (m_lastWish)
            m_lastWish();
    }

    void setLastWish(void (*wish)()) { m_lastWish = wish; }

private:
    std::vector<int>& m_ended;
    int m_number;
    void (*m_lastWish)() = nullptr;
};

} // namespace

TEST(Singletons, AreReleasedInReverseAtTheShutdown)
{
    std::vector<int> ended;
    Singletons singletons;
    // More than there is room for at first.
    for (int number = 1; number <= 12; ++number)
        EXPECT_TRUE(singletons.add(new Ender(ended, number)));
    EXPECT_TRUE(ended.empty());

    singletons.shutDown();

    EXPECT_EQ(ended, (std::vector<int>{12, 11, 10, 9, 8, 7, 6, 5, 4, 3, 2, 1}));
}

TEST(Singletons, AreReleasedWithTheirList)
{
    std::vector<int> ended;
    {
        Singletons singletons;
        singletons.add(new Ender(ended, 1));
        singletons.add(new Ender(ended, 2));
    }
    EXPECT_EQ(ended, (std::vector<int>{2, 1}));
}

TEST(Singletons, AreReleasedOnce)
{
    std::vector<int> ended;
    Singletons singletons;
    const auto kept = makeCounted<Ender>(ended, 1);
    kept->addRef();
    singletons.add(kept.get());

    singletons.shutDown();
    singletons.shutDown();

    EXPECT_EQ(kept->refCount(), 1);
}

TEST(Singletons, AreNotAddedOnceTheShutdownHasBegun)
{
    Singletons singletons;
    singletons.shutDown();
    const auto late = makeCounted<FObject>();

    EXPECT_FALSE(singletons.add(late.get()));

    EXPECT_EQ(late->refCount(), 1) << "The reference stays with the caller.";
}

TEST(Singletons, OfTheProcessAreOneListAndTakeNothingFromTheDestructorsOfTheirOwn)
{
    static std::vector<int> ended;
    static bool added = true;
    auto* const last = new Ender(ended, 1);
    last->setLastWish([] {
        const auto late = makeCounted<FObject>();
        added = Singletons::ofProcess().add(late.get());
    });
    ASSERT_TRUE(Singletons::ofProcess().add(last));

    Singletons::ofProcess().shutDown();

    EXPECT_EQ(ended, (std::vector<int>{1}));
    EXPECT_FALSE(added);
}
