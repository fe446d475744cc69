// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/FObject.h"
#include "velmark/Counted.h"
#include "velmark/UpdateHandler.h"

#include "tests/velmark/Probe.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace Velmark;
using cadrel::tests::DeeperProbe;
using cadrel::tests::Probe;
using cadrel::tests::ProbeEnding;

namespace {

/// Writes down what it is asked for while it is the process-wide handler.
class RecordingHandler : public UpdateHandler {
public:
    struct Call {
        std::string operation;
        const FObject* object;
        int32 message;
        const IDependent* dependent;

        bool operator==(const Call&) const = default;
    };

    RecordingHandler() { FObject::setUpdateHandler(this); }
    ~RecordingHandler() override { FObject::setUpdateHandler(nullptr); }

    void triggerUpdates(FObject& changed, int32 message) override
    {
        calls.push_back({"trigger", &changed, message, nullptr});
    }
    void deferUpdates(FObject& changed, int32 message) override
    {
        calls.push_back({"defer", &changed, message, nullptr});
    }
    void addDependent(FObject& object, IDependent& dependent) override
    {
        calls.push_back({"add", &object, 0, &dependent});
    }
    void removeDependent(FObject& object, IDependent& dependent) override
    {
        calls.push_back({"remove", &object, 0, &dependent});
    }

    std::vector<Call> calls;
};

/// Writes down the messages that were done with.
class DoneProbe : public Implements<DoneProbe, FObject> {
public:
    static constexpr const char* ClassName = "DoneProbe";

    void updateDone(int32 message) override { done.push_back(message); }

    std::vector<int32> done;
};

} // namespace

TEST(FObject, IsBornWithTheReferenceOfItsMaker)
{
    auto* const object = new FObject;

    EXPECT_EQ(object->refCount(), 1);
    EXPECT_EQ(object->addRef(), 2);
    EXPECT_EQ(object->refCount(), 2);
    EXPECT_EQ(object->release(), 1);
    EXPECT_EQ(object->release(), 0);
}

TEST(FObject, IsDestroyedOnceByTheLastReleaseAndMarked)
{
    ProbeEnding ending;
    auto* const object = new Probe(&ending);

    object->addRef();
    object->release();
    EXPECT_EQ(ending.times, 0);
    object->release();

    EXPECT_EQ(ending.times, 1);
    EXPECT_EQ(ending.refCount, -1000);
}

TEST(FObject, CopyCountsForItself)
{
    const auto first = makeCounted<Probe>();
    first->addRef();

    const auto second = makeCounted<Probe>(*first);
    EXPECT_EQ(second->refCount(), 1);
    FObject& assigned = *second;
    assigned = *first;

    EXPECT_EQ(first->refCount(), 2);
    EXPECT_EQ(second->refCount(), 1);
    first->release();
}

TEST(FObject, AnswersForItsThreeIdentifiersWithAReference)
{
    const auto object = makeCounted<FObject>();

    for (const Identifier& id : {Identifier(FUnknown::iid), Identifier(IDependent::iid), Identifier(FObject::iid)}) {
        void* out = nullptr;
        EXPECT_EQ(object->queryInterface(id, &out), 0);
        EXPECT_EQ(out, object.get());
        EXPECT_EQ(object->refCount(), 2);
        object->release();
    }
}

TEST(FObject, ClearsTheOutPointerForAnUnknownIdentifier)
{
    const auto object = makeCounted<FObject>();
    void* out = object.get();

    EXPECT_EQ(object->queryInterface(IIdleHandler::iid, &out), -1);

    EXPECT_EQ(out, nullptr);
    EXPECT_EQ(object->refCount(), 1);
}

TEST(FObject, KnowsItsClassByName)
{
    const auto object = makeCounted<FObject>();
    const auto probe = makeCounted<Probe>();
    const auto deeper = makeCounted<DeeperProbe>();

    EXPECT_STREQ(object->classNameOf(), "FObject");
    EXPECT_TRUE(object->isA("FObject", false));
    EXPECT_TRUE(object->isA("FObject", true));
    EXPECT_FALSE(object->isA("Probe", true));

    EXPECT_STREQ(probe->classNameOf(), "Probe");
    EXPECT_TRUE(probe->isA("Probe", false));
    EXPECT_FALSE(probe->isA("FObject", false));
    EXPECT_TRUE(probe->isA("FObject", true));
    EXPECT_FALSE(probe->isA("DeeperProbe", true));

    EXPECT_STREQ(deeper->classNameOf(), "DeeperProbe");
    EXPECT_TRUE(deeper->isA("Probe", true));
    EXPECT_FALSE(deeper->isA("Probe", false));
    EXPECT_TRUE(deeper->isA("FObject", true));
}

TEST(FObject, IsOfTheTypeOfItsOwnClassAlone)
{
    const auto deeper = makeCounted<DeeperProbe>();
    const FObject& object = *deeper;

    EXPECT_TRUE(object.isTypeOf("DeeperProbe"));
    EXPECT_FALSE(object.isTypeOf("Probe"));
    EXPECT_FALSE(object.isTypeOf("FObject"));
}

TEST(FObject, IsDoneWithAChangeAtOnceWithoutAHandler)
{
    const auto object = makeCounted<DoneProbe>();

    object->changed(7);
    object->deferUpdate(8);

    EXPECT_EQ(object->done, (std::vector<int32>{7, 8}));
}

TEST(FObject, LeavesItsChangesToTheHandler)
{
    RecordingHandler handler;
    const auto object = makeCounted<DoneProbe>();

    object->changed(7);
    object->deferUpdate(8);

    EXPECT_EQ(handler.calls, (std::vector<RecordingHandler::Call>{{"trigger", object.get(), 7, nullptr},
                                                                  {"defer", object.get(), 8, nullptr}}));
    EXPECT_TRUE(object->done.empty()) << "The handler says when the dependents have been told.";
}

TEST(FObject, LeavesItsDependentsToTheHandlerAndCountsNeither)
{
    const auto object = makeCounted<FObject>();
    const auto dependent = makeCounted<FObject>();
    object->addDependent(*dependent);

    RecordingHandler handler;
    object->addDependent(*dependent);
    object->removeDependent(*dependent);

    EXPECT_EQ(handler.calls, (std::vector<RecordingHandler::Call>{{"add", object.get(), 0, dependent.get()},
                                                                  {"remove", object.get(), 0, dependent.get()}}));
    EXPECT_EQ(object->refCount(), 1);
    EXPECT_EQ(dependent->refCount(), 1);
}
