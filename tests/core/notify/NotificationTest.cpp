// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "core/notify/ChangeContextNotificationBase.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/RecordingListener.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

using cadrel::core::ActionChangeContext;
using cadrel::core::ChangeContext;
using cadrel::core::ChangeContextListenerInterface;
using cadrel::core::ChangeContextNotificationBase;
using cadrel::core::DataModelChangeContext;
using cadrel::core::EventChangeContext;
using cadrel::core::EventListChangeContext;
using cadrel::tests::RecordingListener;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

namespace {

/// A context of which the notifier knows nothing.
class WordContext : public ChangeContext {
public:
    explicit WordContext(std::string text) : ChangeContext(99), word(std::move(text)) {}

    std::string word;
};

/// Does something when it hears of a change.
class ActingListener : public ChangeContextListenerInterface {
public:
    explicit ActingListener(std::function<void()> action = nullptr) : m_action(std::move(action)) {}

    void onChange(const ChangeContext&) override { m_action(); }

private:
    std::function<void()> m_action;
};

/// Remembers the words of the contexts that it hears.
class WordListener : public ChangeContextListenerInterface {
public:
    void onChange(const ChangeContext& context) override
    {
        words.push_back(dynamic_cast<const WordContext&>(context).word);
    }

    std::vector<std::string> words;
};

const ChangeContext SettingsChange(ChangeContext::SettingsChanged);

} // namespace

TEST(ChangeContext, HasTheFixedTypes)
{
    EXPECT_EQ(ChangeContext::DataModelChanged, 0);
    EXPECT_EQ(ChangeContext::SettingsChanged, 1);
    EXPECT_EQ(ChangeContext::EventListChanged, 2);
    EXPECT_EQ(ChangeContext::EventChanged, 3);
    EXPECT_EQ(ChangeContext::VideoListChanged, 4);
    EXPECT_EQ(ChangeContext::PreviewStateChanged, 5);
    EXPECT_EQ(ChangeContext::ActionFinished, 6);
}

TEST(ChangeContext, OfEachClassHasItsTypeAndField)
{
    EXPECT_EQ(ChangeContext(ChangeContext::VideoListChanged).type, 4);
    EXPECT_EQ(DataModelChangeContext(nullptr).type, 0);
    EXPECT_EQ(DataModelChangeContext(nullptr).dataModel, nullptr);
    EXPECT_EQ(EventListChangeContext(1).type, 2);
    EXPECT_EQ(EventListChangeContext(1).listKind, 1);
    EXPECT_EQ(EventChangeContext().type, 3);
    EXPECT_EQ(ActionChangeContext(1).type, 6);
    EXPECT_EQ(ActionChangeContext(1).action, 1);
    EXPECT_EQ(ActionChangeContext::Preview, 0);
    EXPECT_EQ(ActionChangeContext::Run, 1);
}

TEST(ChangeContext, OfAJobTellsHowItEnded)
{
    EXPECT_EQ(ActionChangeContext(1).result, Result::Ok);
    EXPECT_FALSE(ActionChangeContext(1).isDropped);
    EXPECT_EQ(ActionChangeContext(0, Result::HostCallFailed).result, Result::HostCallFailed);
    EXPECT_FALSE(ActionChangeContext(0, Result::Cancelled).isDropped);

    const ActionChangeContext dropped = ActionChangeContext::dropped(ActionChangeContext::Preview);
    EXPECT_EQ(dropped.type, 6);
    EXPECT_EQ(dropped.action, 0);
    EXPECT_EQ(dropped.result, Result::Cancelled);
    EXPECT_TRUE(dropped.isDropped);
}

TEST(Notification, DoesNothingWithoutListeners)
{
    ChangeContextNotificationBase notifier;

    EXPECT_NO_THROW(notifier.notify(SettingsChange));
}

TEST(Notification, HandsTheWholeContextToEveryListener)
{
    ChangeContextNotificationBase notifier;
    WordListener first;
    WordListener second;
    notifier.addListener(&first);
    notifier.addListener(&second);

    notifier.notify(WordContext("reel"));

    EXPECT_EQ(first.words, std::vector<std::string>{"reel"});
    EXPECT_EQ(second.words, std::vector<std::string>{"reel"});
}

TEST(Notification, HasArrivedWhenNotifyReturns)
{
    ChangeContextNotificationBase notifier;
    RecordingListener listener;
    notifier.addListener(&listener);

    notifier.notify(SettingsChange);
    const std::size_t afterTheFirst = listener.types.size();
    notifier.notify(SettingsChange);

    EXPECT_EQ(afterTheFirst, 1U);
    EXPECT_EQ(listener.types.size(), 2U);
}

TEST(Notification, ArrivesOnceAtAListenerThatWasAddedTwice)
{
    ChangeContextNotificationBase notifier;
    RecordingListener listener;
    notifier.addListener(&listener);
    notifier.addListener(&listener);

    notifier.notify(SettingsChange);

    EXPECT_EQ(listener.types.size(), 1U);
}

TEST(Notification, NoLongerArrivesAtARemovedListener)
{
    ChangeContextNotificationBase notifier;
    RecordingListener removed;
    RecordingListener kept;
    notifier.addListener(&removed);
    notifier.addListener(&kept);

    notifier.removeListener(&removed);
    notifier.notify(SettingsChange);

    EXPECT_TRUE(removed.types.empty());
    EXPECT_EQ(kept.types.size(), 1U);
}

TEST(Notification, IsGoneAfterOneRemovalOfAListenerThatWasAddedTwice)
{
    ChangeContextNotificationBase notifier;
    RecordingListener listener;
    notifier.addListener(&listener);
    notifier.addListener(&listener);

    notifier.removeListener(&listener);
    notifier.notify(SettingsChange);

    EXPECT_TRUE(listener.types.empty());
}

TEST(Notification, TakesTheRemovalOfAListenerThatIsNotThere)
{
    ChangeContextNotificationBase notifier;
    RecordingListener listener;
    RecordingListener other;
    notifier.addListener(&listener);
    notifier.addListener(&other);

    notifier.removeListener(&listener);
    notifier.removeListener(&listener);
    notifier.notify(SettingsChange);

    EXPECT_TRUE(listener.types.empty());
    EXPECT_EQ(other.types.size(), 1U);
}

TEST(Notification, ReachesEachListenerOnceAlsoWhereOthersComeAndGoMeanwhile)
{
    using cadrel::core::EventList;
    std::vector<int> heard;
    EventList list;
    const auto event = std::make_shared<cadrel::core::EventBase>();
    list.add(event);
    // Temporary lists listen to the event from addresses before, between and behind those of its listeners.
    struct Neighbours {
        std::optional<EventList> before;
        ActingListener first;
        std::optional<EventList> between;
        ActingListener second;
        std::optional<EventList> behind;
        ActingListener third;
    };
    Neighbours at;
    const auto actAs = [&](int number) {
        return ActingListener([&, number] {
            heard.push_back(number);
            for (std::optional<EventList>* place : {&at.before, &at.between, &at.behind})
                place->emplace(list);
            for (std::optional<EventList>* place : {&at.behind, &at.before, &at.between})
                place->reset();
            const EventList onTheStack(list);
            const auto onTheHeap = std::make_unique<EventList>(list);
        });
    };
    at.first = actAs(1);
    at.second = actAs(2);
    at.third = actAs(3);
    for (ActingListener* listener : {&at.third, &at.first, &at.second})
        event->addListener(listener);
    RecordingListener ofTheList;
    list.addListener(&ofTheList);

    event->setClipName("changed");

    std::ranges::sort(heard);
    EXPECT_EQ(heard, (std::vector<int>{1, 2, 3}));
    EXPECT_EQ(ofTheList.types, std::vector<std::int32_t>{ChangeContext::EventListChanged});
}

TEST(Notification, ReachesEachListenerThatStaysOnceWhereOneRemovesItselfMeanwhile)
{
    for (const std::size_t leaving : {0U, 1U, 2U}) {
        ChangeContextNotificationBase notifier;
        std::vector<std::size_t> heard;
        std::array<ActingListener, 3> listeners;
        for (std::size_t i = 0; i < listeners.size(); ++i) {
            listeners[i] = ActingListener([&, i] {
                heard.push_back(i);
                if (i == leaving)
                    notifier.removeListener(&listeners[i]);
            });
            notifier.addListener(&listeners[i]);
        }

        notifier.notify(SettingsChange);
        std::ranges::sort(heard);
        EXPECT_EQ(heard, (std::vector<std::size_t>{0, 1, 2})) << leaving;

        heard.clear();
        notifier.notify(SettingsChange);
        std::ranges::sort(heard);
        std::vector<std::size_t> staying = {0, 1, 2};
        std::erase(staying, leaving);
        EXPECT_EQ(heard, staying) << leaving;
    }
}

TEST(Notification, EndsAtAListenerThatThrows)
{
    ChangeContextNotificationBase notifier;
    int heard = 0;
    std::array<ActingListener, 3> listeners;
    for (ActingListener& listener : listeners) {
        listener = ActingListener([&] {
            ++heard;
            throw Result::Refused;
        });
        notifier.addListener(&listener);
    }

    EXPECT_EQ(thrownBy([&] { notifier.notify(SettingsChange); }), Result::Refused);
    EXPECT_EQ(heard, 1);
}

TEST(Notification, OfACopyReachesNobody)
{
    ChangeContextNotificationBase notifier;
    RecordingListener listener;
    notifier.addListener(&listener);

    ChangeContextNotificationBase copy = notifier;
    copy.notify(SettingsChange);

    EXPECT_TRUE(listener.types.empty());
}

TEST(Notification, ReachesTheOwnListenersAfterAnAssignment)
{
    ChangeContextNotificationBase notifier;
    ChangeContextNotificationBase other;
    RecordingListener listener;
    RecordingListener ofTheOther;
    notifier.addListener(&listener);
    other.addListener(&ofTheOther);

    notifier = other;
    notifier.notify(SettingsChange);

    EXPECT_EQ(listener.types.size(), 1U);
    EXPECT_TRUE(ofTheOther.types.empty());
}
