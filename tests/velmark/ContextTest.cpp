// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Context.h"
#include "velmark/Automation.h"
#include "velmark/ClassId.h"
#include "velmark/Implements.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace {

class Point : public Implements<Point, FObject, IAutomationPoint> {
public:
    static constexpr const char* ClassName = "Point";

    float getValue() override { return 0.25F; }
    int32 setValue(float) override { return ResultFalse; }
};

class List : public Implements<List, FObject, IObjectList> {
public:
    static constexpr const char* ClassName = "List";

    int32 add(FUnknown*, int32) override { return ResultFalse; }
    int32 count() override { return 17; }
    FUnknown* at(int32) override { return nullptr; }
};

/// A host that has itself as a service and makes points and lists.
class SmallHost : public Implements<SmallHost, FObject, IHostContext, IHostInfo> {
public:
    static constexpr const char* ClassName = "SmallHost";

    int32 getInterface(const Identifier& id, void** out) override
    {
        if (id == ClassId::AutomationPoint) {
            *out = static_cast<FUnknown*>(static_cast<FObject*>(makeCounted<Point>().detach()));
            return ResultOk;
        }
        if (id == ClassId::ObjectList) {
            *out = static_cast<IObjectList*>(makeCounted<List>().detach());
            return ResultOk;
        }
        return queryInterface(id, out);
    }
    const char* getName() override { return "Small"; }
};

} // namespace

TEST(Service, IsACountedInterfaceOfTheContext)
{
    const auto host = makeCounted<SmallHost>();
    {
        const Counted<IHostInfo> info = service<IHostInfo>(host.get());

        ASSERT_TRUE(info);
        EXPECT_STREQ(info->getName(), "Small");
        EXPECT_EQ(host->refCount(), 2);
    }
    EXPECT_EQ(host->refCount(), 1);
}

TEST(Service, IsNothingWhereTheHostHasntItOrThereIsNoContext)
{
    const Counted<IHostContext> host = makeCounted<SmallHost>();

    EXPECT_FALSE(service<IIdleManager>(host));
    EXPECT_FALSE(service<IHostInfo>(Counted<IHostContext>()));
}

TEST(Create, MakesAnObjectOfAClassAndAsksItForTheInterface)
{
    const Counted<IHostContext> host = makeCounted<SmallHost>();

    const auto point = create<IAutomationPoint>(host, ClassId::AutomationPoint);

    ASSERT_TRUE(point);
    EXPECT_EQ(point->getValue(), 0.25F);
    EXPECT_EQ(point->addRef(), 2) << "The reference of the creation has been given back.";
    point->release();
    EXPECT_FALSE(create<IObjectList>(host, ClassId::AutomationPoint)) << "A point is no list.";
}

TEST(Create, MakesAnObjectOfAClassThatIsNamedByItsInterface)
{
    const Counted<IHostContext> host = makeCounted<SmallHost>();

    const auto list = create<IObjectList>(host);

    ASSERT_TRUE(list);
    EXPECT_EQ(list->count(), 17);
    EXPECT_EQ(list->addRef(), 2);
    list->release();
}

TEST(Create, GivesNothingForAClassThatTheHostDoesntKnow)
{
    const Counted<IHostContext> host = makeCounted<SmallHost>();

    EXPECT_FALSE(create<IAutomationPoint>(host, ClassId::PointMarker));
    EXPECT_FALSE(create<IFilePath>(host));
    EXPECT_FALSE(create<IObjectList>(Counted<IHostContext>()));
}
