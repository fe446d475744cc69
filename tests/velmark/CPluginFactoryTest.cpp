// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/CPluginFactory.h"

#include "velmark/FieldText.h"
#include "velmark/PlugView.h"

#include "tests/velmark/Probe.h"

#include <gtest/gtest.h>

#include <cstring>
#include <stdexcept>
#include <string>

using namespace Velmark;
using cadrel::tests::Probe;
using cadrel::tests::ProbeEnding;

namespace {

constexpr Identifier Known{"000102030405060708090a0b0c0d0e0f"};
constexpr Identifier Unknown{"ffffffffffffffffffffffffffffffff"};

PFactoryInfo info()
{
    PFactoryInfo info;
    putText(std::string_view("Maker"), info.vendor);
    putText(std::string_view("https://example.org"), info.url);
    putText(std::string_view("maker@example.org"), info.email);
    info.flags = PFactoryInfo::Flag::Unicode;
    return info;
}

PClassInfo2 classInfo(std::string_view name = "Clock", const Identifier& id = Known)
{
    PClassInfo2 info;
    info.cid = id;
    info.cardinality = 1;
    putText(std::string_view("Service"), info.category);
    putText(name, info.name);
    info.classFlags = 7;
    putText(std::string_view("Time"), info.subCategories);
    putText(std::string_view("Vendor"), info.vendor);
    putText(std::string_view("1.2"), info.version);
    putText(std::string_view("SDK 4"), info.sdkVersion);
    return info;
}

FUnknown* makeProbe(void* context)
{
    return static_cast<IIdleHandler*>(new Probe(static_cast<ProbeEnding*>(context)));
}

FUnknown* makeNothing(void*)
{
    return nullptr;
}

FUnknown* throwInstead(void*)
{
    throw std::runtime_error("no object");
}

Counted<CPluginFactory> factory()
{
    return makeCounted<CPluginFactory>(info());
}

} // namespace

TEST(CPluginFactory, AnswersForItsFourInterfacesWithOneObject)
{
    const auto object = factory();

    const auto root = query<FUnknown>(object);
    const auto first = query<IPluginFactory>(object);
    const auto second = query<IPluginFactory2>(object);
    const auto third = query<IPluginFactory3>(object);

    ASSERT_TRUE(root && first && second && third);
    EXPECT_EQ(root.get(), first.get());
    EXPECT_EQ(first.get(), second.get());
    EXPECT_EQ(second.get(), third.get());
    EXPECT_EQ(object->addRef(), 6);
    EXPECT_EQ(object->release(), 5);
}

TEST(CPluginFactory, ClearsTheOutPointerForAnotherInterface)
{
    const auto object = factory();
    void* out = &out;

    EXPECT_EQ(object->queryInterface(IIdleHandler::iid, &out), -1);
    EXPECT_EQ(out, nullptr);
}

TEST(CPluginFactory, RefusesToAnswerIntoNull)
{
    EXPECT_EQ(factory()->queryInterface(FUnknown::iid, nullptr), -1);
}

TEST(CPluginFactory, TellsWhoMadeIt)
{
    PFactoryInfo told;
    EXPECT_EQ(factory()->getFactoryInfo(told), ResultOk);

    EXPECT_STREQ(told.vendor, "Maker");
    EXPECT_STREQ(told.url, "https://example.org");
    EXPECT_STREQ(told.email, "maker@example.org");
    EXPECT_EQ(told.flags, 16);
}

TEST(CPluginFactory, CutsTextsThatLackTheirZero)
{
    PFactoryInfo full;
    std::memset(full.vendor, 'v', sizeof full.vendor);
    const auto object = makeCounted<CPluginFactory>(full);
    PClassInfo2 fullClass = classInfo();
    std::memset(fullClass.name, 'n', sizeof fullClass.name);
    ASSERT_TRUE(object->registerClass(fullClass, makeProbe, nullptr));

    PFactoryInfo told;
    object->getFactoryInfo(told);
    PClassInfo2 toldClass;
    object->getClassInfo2(0, toldClass);

    EXPECT_EQ(std::string(told.vendor), std::string(63, 'v'));
    EXPECT_EQ(std::string(toldClass.name), std::string(63, 'n'));
}

TEST(CPluginFactory, ListsItsClassesInTheThreeForms)
{
    const auto object = factory();
    EXPECT_EQ(object->countClasses(), 0);
    ASSERT_TRUE(object->registerClass(classInfo("Clock"), makeProbe, nullptr));
    ASSERT_TRUE(object->registerClass(classInfo("Zähler", Unknown), makeProbe, nullptr));
    EXPECT_EQ(object->countClasses(), 2);

    PClassInfo first;
    ASSERT_EQ(object->getClassInfo(1, first), ResultOk);
    EXPECT_EQ(first.cid, Unknown);
    EXPECT_EQ(first.cardinality, 1);
    EXPECT_STREQ(first.category, "Service");
    EXPECT_STREQ(first.name, "Zähler");

    PClassInfo2 second;
    ASSERT_EQ(object->getClassInfo2(0, second), ResultOk);
    EXPECT_EQ(second.cid, Known);
    EXPECT_STREQ(second.name, "Clock");
    EXPECT_EQ(second.classFlags, 7U);
    EXPECT_STREQ(second.subCategories, "Time");
    EXPECT_STREQ(second.vendor, "Vendor");
    EXPECT_STREQ(second.version, "1.2");
    EXPECT_STREQ(second.sdkVersion, "SDK 4");

    PClassInfoUnicode wide;
    ASSERT_EQ(object->getClassInfoUnicode(1, wide), ResultOk);
    EXPECT_EQ(wide.cid, Unknown);
    EXPECT_EQ(wide.cardinality, 1);
    EXPECT_EQ(textOf(wide.category), u"Service");
    EXPECT_EQ(textOf(wide.name), u"Zähler");
    EXPECT_EQ(wide.classFlags, 7U);
    EXPECT_EQ(textOf(wide.subCategories), u"Time");
    EXPECT_EQ(textOf(wide.vendor), u"Vendor");
    EXPECT_EQ(textOf(wide.version), u"1.2");
    EXPECT_EQ(textOf(wide.sdkVersion), u"SDK 4");
}

TEST(CPluginFactory, RefusesAnIndexBelowAtAndPastItsEnds)
{
    const auto object = factory();
    ASSERT_TRUE(object->registerClass(classInfo(), makeProbe, nullptr));
    PClassInfo first;
    PClassInfo2 second;
    PClassInfoUnicode wide;

    for (const int32 index : {-2147483647 - 1, -1, 1, 2, 2147483647}) {
        EXPECT_NE(object->getClassInfo(index, first), ResultOk);
        EXPECT_NE(object->getClassInfo2(index, second), ResultOk);
        EXPECT_NE(object->getClassInfoUnicode(index, wide), ResultOk);
    }
    EXPECT_EQ(object->getClassInfo(0, first), ResultOk);
}

TEST(CPluginFactory, KeepsMoreClassesThanItGrowsByAtATime)
{
    const auto object = factory();
    for (int32 index = 0; index < 25; ++index) {
        Identifier id;
        id.bytes[0] = static_cast<uint8>(index + 1);
        ASSERT_TRUE(object->registerClass(classInfo(std::to_string(index), id), makeProbe, nullptr));
    }

    EXPECT_EQ(object->countClasses(), 25);
    PClassInfo told;
    for (int32 index = 0; index < 25; ++index) {
        ASSERT_EQ(object->getClassInfo(index, told), ResultOk);
        EXPECT_EQ(told.name, std::to_string(index));
    }
}

TEST(CPluginFactory, CreatesAnObjectThatTheCallerAloneOwns)
{
    const auto object = factory();
    ProbeEnding ending;
    ASSERT_TRUE(object->registerClass(classInfo(), makeProbe, &ending));

    Counted<IActionHandler> made;
    ASSERT_EQ(object->createInstance(Known, IActionHandler::iid, reinterpret_cast<void**>(made.out())), ResultOk);
    EXPECT_EQ(made->handleAction("", "", true), 102);
    EXPECT_EQ(made->addRef(), 2);
    EXPECT_EQ(made->release(), 1);

    made.reset();
    EXPECT_EQ(ending.times, 1);
}

TEST(CPluginFactory, CreatesANewObjectAtEachCall)
{
    const auto object = factory();
    ASSERT_TRUE(object->registerClass(classInfo(), makeProbe, nullptr));

    Counted<FUnknown> first;
    Counted<FUnknown> second;
    ASSERT_EQ(object->createInstance(Known, FUnknown::iid, reinterpret_cast<void**>(first.out())), ResultOk);
    ASSERT_EQ(object->createInstance(Known, FUnknown::iid, reinterpret_cast<void**>(second.out())), ResultOk);

    EXPECT_NE(first.get(), second.get());
}

TEST(CPluginFactory, CreatesNothingForAnUnknownClass)
{
    const auto object = factory();
    ProbeEnding ending;
    ASSERT_TRUE(object->registerClass(classInfo(), makeProbe, &ending));
    void* out = &out;

    EXPECT_NE(object->createInstance(Unknown, FUnknown::iid, &out), ResultOk);
    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(ending.times, 0);
}

TEST(CPluginFactory, LeavesNoObjectThatLacksTheInterface)
{
    const auto object = factory();
    ProbeEnding ending;
    ASSERT_TRUE(object->registerClass(classInfo(), makeProbe, &ending));
    void* out = &out;

    EXPECT_NE(object->createInstance(Known, IPlugView::iid, &out), ResultOk);
    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(ending.times, 1);
}

TEST(CPluginFactory, AnswersAFailureWhereNoObjectCanBeMade)
{
    const auto object = factory();
    ASSERT_TRUE(object->registerClass(classInfo(), makeNothing, nullptr));
    ASSERT_TRUE(object->registerClass(classInfo("Thrower", Unknown), throwInstead, nullptr));

    for (const Identifier& id : {Known, Unknown}) {
        void* out = &out;
        EXPECT_NE(object->createInstance(id, FUnknown::iid, &out), ResultOk);
        EXPECT_EQ(out, nullptr);
        EXPECT_NE(object->createInstance(id, FUnknown::iid, nullptr), ResultOk);
    }
}

TEST(CPluginFactory, KeepsAReferenceToItsContext)
{
    const auto context = makeCounted<Probe>();
    {
        const auto object = factory();
        EXPECT_EQ(object->setHostContext(static_cast<IIdleHandler*>(context.get())), ResultOk);
        EXPECT_EQ(context->refCount(), 2);
        EXPECT_EQ(object->setHostContext(nullptr), ResultOk);
        EXPECT_EQ(context->refCount(), 1);
        object->setHostContext(static_cast<IIdleHandler*>(context.get()));
    }
    EXPECT_EQ(context->refCount(), 1);
}

TEST(CPluginFactory, TakesItselfOutOfTheModuleAtItsEnd)
{
    gPluginFactory = new CPluginFactory(info());
    const auto other = factory();

    EXPECT_EQ(other->addRef(), 2);
    EXPECT_EQ(other->release(), 1);
    ASSERT_NE(gPluginFactory, nullptr);
    EXPECT_EQ(gPluginFactory->release(), 0);
    EXPECT_EQ(gPluginFactory, nullptr);
}

TEST(CPluginFactory, LeavesAnotherFactoryInTheModule)
{
    gPluginFactory = new CPluginFactory(info());
    CPluginFactory* const module = gPluginFactory;

    {
        const auto other = factory();
    }

    EXPECT_EQ(gPluginFactory, module);
    module->release();
}
