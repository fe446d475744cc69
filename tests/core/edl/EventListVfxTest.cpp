// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/settings/Settings.h"
#include "core/settings/VfxNameMatcher.h"

#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"

#include <gtest/gtest.h>

#include <memory>
#include <vector>

using cadrel::core::EventBase;
using cadrel::core::EventList;
using cadrel::core::ListKind;
using cadrel::core::MatchBy;
using cadrel::core::VfxNameMatcher;
using cadrel::tests::makeEvent;
using cadrel::tests::RecordingListener;

using Kinds = std::vector<std::int32_t>;

namespace {

/// A list of a VFX roll, a plain roll whose clip is a VFX shot, and a VFX roll without a version.
class EventListVfx : public testing::Test {
protected:
    EventListVfx()
    {
        patterns.compile({{"VFX_", ""}});
        add("VFX_012", "PLATE");
        add("A001C003", "VFX_7");
        add("VFX_", "VFX_");
        list.addListener(&listener);
    }

    void add(const std::string& roll, const std::string& clip)
    {
        auto event = makeEvent(roll, "01:00:00:00", "01:00:01:00", "10:00:00:00", "10:00:01:00");
        event->setClipName(clip);
        list.add(event);
    }
    std::vector<bool> marks() const
    {
        std::vector<bool> flags;
        for (const auto& event : list.events())
            flags.push_back(event->vfx());
        return flags;
    }

    VfxNameMatcher patterns;
    EventList list{ListKind::New};
    RecordingListener listener;
};

} // namespace

TEST_F(EventListVfx, MarksByTheRollName)
{
    list.markVfx(patterns, MatchBy::RollName);

    EXPECT_EQ(marks(), (std::vector<bool>{true, false, false}));
}

TEST_F(EventListVfx, MarksByTheClipName)
{
    list.markVfx(patterns, MatchBy::ClipName);

    EXPECT_EQ(marks(), (std::vector<bool>{false, true, false}));
}

TEST_F(EventListVfx, MarksByTheRollNameForAnyOtherNumber)
{
    for (const std::int32_t matchBy : {2, -1}) {
        list.clearVfx();

        list.markVfx(patterns, matchBy);

        EXPECT_EQ(marks(), (std::vector<bool>{true, false, false})) << matchBy;
    }
}

TEST_F(EventListVfx, TakesTheMarkFromAnEventThatNoLongerMatches)
{
    list.markVfx(patterns, MatchBy::RollName);

    list.markVfx(patterns, MatchBy::ClipName);

    EXPECT_EQ(marks(), (std::vector<bool>{false, true, false}));
}

TEST_F(EventListVfx, TakesEveryMarkWithoutPatterns)
{
    list.markVfx(patterns, MatchBy::RollName);

    list.markVfx(VfxNameMatcher(), MatchBy::RollName);

    EXPECT_EQ(marks(), (std::vector<bool>{false, false, false}));
}

TEST_F(EventListVfx, ClearsEveryMark)
{
    list.at(0).setVfx(true);
    list.at(2).setVfx(true);

    list.clearVfx();

    EXPECT_EQ(marks(), (std::vector<bool>{false, false, false}));
}

TEST_F(EventListVfx, TellsOnceThatMarksChanged)
{
    add("VFX_013", "");
    listener.forget();

    list.markVfx(patterns, MatchBy::RollName);
    EXPECT_EQ(listener.listKinds, Kinds{ListKind::New});

    listener.forget();
    list.clearVfx();
    EXPECT_EQ(listener.listKinds, Kinds{ListKind::New});
}

TEST_F(EventListVfx, TellsNothingWhenNoMarkChanges)
{
    list.clearVfx();
    EXPECT_EQ(listener.types, Kinds());

    list.markVfx(patterns, MatchBy::RollName);
    listener.forget();
    list.markVfx(patterns, MatchBy::RollName);
    EXPECT_EQ(listener.types, Kinds());
}

TEST_F(EventListVfx, TellsNothingForAnEmptyList)
{
    EventList empty;
    RecordingListener ofTheEmpty;
    empty.addListener(&ofTheEmpty);

    empty.markVfx(patterns, MatchBy::RollName);
    empty.clearVfx();

    EXPECT_EQ(ofTheEmpty.types, Kinds());
}

TEST_F(EventListVfx, HearsItsEventsAgainAfterwards)
{
    list.markVfx(patterns, MatchBy::RollName);
    listener.forget();
    list.at(1).setVfx(true);
    EXPECT_EQ(listener.listKinds, Kinds{ListKind::New});

    list.clearVfx();
    listener.forget();
    list.at(1).setVfx(true);
    EXPECT_EQ(listener.listKinds, Kinds{ListKind::New});
}

TEST_F(EventListVfx, TellsAListThatSharesAnEventOnlyWhatChanged)
{
    EventList sharing(list);
    RecordingListener ofTheSharing;
    sharing.addListener(&ofTheSharing);

    list.markVfx(patterns, MatchBy::RollName);

    // One of the three events changed.
    EXPECT_EQ(ofTheSharing.listKinds, Kinds{ListKind::Change});
}

TEST_F(EventListVfx, MarksAnEventThatStandsInTheListTwice)
{
    list.add(list.eventAt(0));

    list.markVfx(patterns, MatchBy::RollName);

    EXPECT_EQ(marks(), (std::vector<bool>{true, false, false, true}));
}
