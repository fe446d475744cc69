// SPDX-License-Identifier: GPL-3.0-or-later

// What the mark of unsaved work costs where the bytes of the project cost much.

#include "tests/desktop/document/DocumentHost.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/standin/ManyClips.h"

#include <algorithm>
#include <functional>

namespace desktop::tests {

using cadrel::tests::secondsOf;

class LargeDocumentTest : public DocumentTest {
protected:
    /// A program that runs at the same time disturbs one try, but hardly all.
    static double leastOf(const std::function<void()>& act)
    {
        constexpr int Tries = 5;
        double least = secondsOf(act);
        for (int tried = 1; tried < Tries; ++tried)
            least = std::min(least, secondsOf(act));
        return least;
    }

    static constexpr int Tracks = 20;
    static constexpr int Clips = 2000; // on each

    OpenDocument& opened()
    {
        standin::ChangeLog log;
        const auto project = Velmark::makeCounted<Project>(log);
        standin::tests::addManyClips(*project, Tracks, Clips);
        standin::ProjectFile::write(*project, folder / "film.stage");
        return documents.open(folder / "film.stage");
    }
};

TEST_F(LargeDocumentTest, ToAskForTheMarkAfterEachOfAThousandEditsCostsLessThanTheBytesOnce)
{
    OpenDocument& document = opened();
    const double once = leastOf([&] { bytesOf(document); });
    int unsaved = 0;

    const double asked = leastOf([&] {
        unsaved = 0;
        for (int number = 1; number <= 1000; ++number) {
            renameTrack(document, number % 2 == 0 ? u"A" : u"B");
            unsaved += document.isUnsaved() ? 1 : 0;
        }
    });

    EXPECT_EQ(unsaved, 1000);
    EXPECT_LT(asked, once);
}

TEST_F(LargeDocumentTest, AnIdleCallWithoutAChangeCostsAFractionOfTheBytes)
{
    OpenDocument& document = opened();
    const double once = leastOf([&] { bytesOf(document); });

    const double idled = leastOf([&] {
        for (int number = 0; number < 20; ++number)
            idle();
    });

    EXPECT_LT(idled, once);
}

} // namespace desktop::tests
