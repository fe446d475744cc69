// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/gui/main/ShownWindow.h"
#include "tests/support/BestSeconds.h"
#include "tests/support/Sanitizer.h"

#include <gtest/gtest.h>

#include <functional>
#include <iostream>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::ListKind;
using core::Timecode;

constexpr int EventCount = 100000;
constexpr int EventLength = 20; ///< in frames

/// Three lists that no one has by hand. Each event of the change list has its source in the old one, and its destination in the
/// new one, which has them in other places.
class MainGuiSpeedTest : public ShownWindow {
protected:
    void SetUp() override
    {
        for (const int kind : {ListKind::Old, ListKind::New, ListKind::Change})
            list(kind).append(eventsOf(kind));
        activate();
    }

    static std::vector<std::shared_ptr<EventBase>> eventsOf(int kind)
    {
        std::vector<std::shared_ptr<EventBase>> events;
        events.reserve(EventCount);
        for (int index = 0; index < EventCount; ++index) {
            const int oldIndex = index;
            const int newIndex = (index + 1000) % EventCount;
            const int source = kind == ListKind::Change ? oldIndex : index % 5000;
            const int destination = kind == ListKind::Old ? oldIndex : newIndex;
            auto event = std::make_shared<EventBase>();
            event->setRollName("A017C004_261122_R1AB");
            event->setTimecodes(Timecode(source * EventLength), Timecode((source + 1) * EventLength),
                                Timecode(destination * EventLength), Timecode((destination + 1) * EventLength));
            event->setEventNumber(static_cast<std::uint32_t>(index + 1));
            events.push_back(std::move(event));
        }
        return events;
    }

    static void expectFast(const char* step, const std::function<void()>& prepare, const std::function<void()>& action)
    {
        constexpr double Limit = CADREL_ADDRESS_SANITIZER ? 2.0 : 0.1;
        const double best = bestSecondsOf(5, Limit, action, prepare);
        std::cout << step << ": " << best * 1000.0 << " ms\n";
        EXPECT_LT(best, Limit) << step;
    }
};

TEST_F(MainGuiSpeedTest, SelectingAHundredThousandChangesShowsWhatTheyComeFromInATenthOfASecond)
{
    const auto selectNone = [this] { table("Change").deselectAllRows(); };
    const auto selectAll = [this] { tableModel("Change").selectAll(); };
    const auto isRelated = [this](const std::string& name, int row) {
        return tableModel(name).getSpokenRow(row).contains("Related");
    };

    expectFast("select one", selectNone, [this] { table("Change").selectRow(50000); });
    expectFast("select none", selectAll, selectNone);
    expectFast("select all", selectNone, selectAll);

    for (const int row : {0, 49999, 99999}) {
        EXPECT_TRUE(isRelated("Old", row)) << row;
        EXPECT_TRUE(isRelated("New", row)) << row;
    }
}

} // namespace
} // namespace cadrel::tests
