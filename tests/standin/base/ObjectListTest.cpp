// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/ObjectList.h"

#include <gtest/gtest.h>

#include <limits>

using namespace Velmark;

namespace standin::tests {

TEST(ObjectList, KeepsTheObjectsInTheirOrder)
{
    const Counted<IObjectList> list = makeCounted<ObjectList>();
    const auto first = makeCounted<FObject>();
    const auto second = makeCounted<FObject>();

    EXPECT_EQ(list->add(first.get(), 0), ResultOk);
    EXPECT_EQ(list->add(second.get(), 0), ResultOk);
    EXPECT_EQ(list->add(first.get(), 0), ResultOk);

    EXPECT_EQ(list->count(), 3);
    EXPECT_EQ(list->at(0), first.get());
    EXPECT_EQ(list->at(1), second.get());
    EXPECT_EQ(list->at(2), first.get()) << "Nothing is said against an object that is there twice.";
}

TEST(ObjectList, HasAReferenceToEachObject)
{
    const auto object = makeCounted<FObject>();
    {
        const Counted<IObjectList> list = makeCounted<ObjectList>();
        list->add(object.get(), 0);
        EXPECT_EQ(object->refCount(), 2);
        list->at(0);
        EXPECT_EQ(object->refCount(), 2) << "What it gives is borrowed.";
    }
    EXPECT_EQ(object->refCount(), 1);
}

TEST(ObjectList, RefusesNullAndAnswersNullAtAnIndexThatIsntThere)
{
    const Counted<IObjectList> list = makeCounted<ObjectList>();
    const auto object = makeCounted<FObject>();

    EXPECT_NE(list->add(nullptr, 0), ResultOk);
    EXPECT_EQ(list->count(), 0);
    EXPECT_EQ(list->at(0), nullptr);

    list->add(object.get(), 0);
    EXPECT_EQ(list->at(1), nullptr);
    EXPECT_EQ(list->at(-1), nullptr);
    EXPECT_EQ(list->at(std::numeric_limits<int32>::max()), nullptr);
    EXPECT_EQ(list->at(std::numeric_limits<int32>::min()), nullptr);
}

} // namespace standin::tests
