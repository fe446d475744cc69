// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/PreviewEventsStep.h"

#include "core/edl/EventBase.h"
#include "util/Result.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>

namespace cadrel::host::tests {

using Events = PreviewEventsStep::Events;

TEST(PreviewEventsStep, ChangesTheListForTheOtherOneByTurns)
{
    const auto first = std::make_shared<core::EventBase>();
    const auto second = std::make_shared<core::EventBase>();
    const auto list = std::make_shared<core::EventList>();
    list->add(second);
    const auto step = Velmark::makeCounted<PreviewEventsStep>(list, Events{first, first});

    for (int round = 0; round < 2; ++round) {
        EXPECT_EQ(step->undo(), Velmark::ResultOk);
        EXPECT_EQ(list->events(), (Events{first, first}));
        EXPECT_EQ(step->redo(), Velmark::ResultOk);
        EXPECT_EQ(list->events(), Events{second});
    }
}

TEST(PreviewEventsStep, RefusesWhenItsListIsGone)
{
    auto list = std::make_shared<core::EventList>();
    const auto step = Velmark::makeCounted<PreviewEventsStep>(list, Events{std::make_shared<core::EventBase>()});

    const std::weak_ptr<core::EventList> gone = list;
    list.reset();
    EXPECT_TRUE(gone.expired());

    EXPECT_EQ(step->undo(), util::Result::NotAvailable);
    EXPECT_EQ(step->redo(), util::Result::NotAvailable);
}

TEST(PreviewEventsStep, HasChangedSidesWhateverThoseWhoAreToldThrow)
{
    struct Thrower : core::ChangeContextListenerInterface {
        void onChange(const core::ChangeContext&) override { throw std::runtime_error("told"); }
    };
    const auto first = std::make_shared<core::EventBase>();
    const auto second = std::make_shared<core::EventBase>();
    const auto list = std::make_shared<core::EventList>();
    list->add(second);
    const auto step = Velmark::makeCounted<PreviewEventsStep>(list, Events{first});
    Thrower thrower;
    list->addListener(&thrower);

    EXPECT_EQ(step->undo(), util::Result::NotAvailable);
    EXPECT_EQ(list->events(), Events{first});
    EXPECT_EQ(step->redo(), util::Result::NotAvailable);
    EXPECT_EQ(list->events(), Events{second});
    list->removeListener(&thrower);
}

TEST(PreviewEventsStep, IsPartOfItsEntryAndNothingMore)
{
    const auto list = std::make_shared<core::EventList>();
    const auto step = Velmark::makeCounted<PreviewEventsStep>(list, Events{std::make_shared<core::EventBase>()});

    EXPECT_EQ(step->execute(), Velmark::ResultOk);

    EXPECT_TRUE(list->isEmpty());
    EXPECT_EQ(step->getDescription(), nullptr);
    EXPECT_TRUE(step->isA("PreviewEventsStep", false));
}

} // namespace cadrel::host::tests
