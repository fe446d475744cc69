// SPDX-License-Identifier: GPL-3.0-or-later

// How long it takes to look at 200 tracks of 5,000 clips, and to draw them at each zoom.

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "desktop/tracks/TracksView.h"
#include "standin/edit/EditService.h"
#include "standin/project/ClipEvent.h"
#include "tests/support/Sanitizer.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iostream>
#include <memory>
#include <optional>
#include <string>

using cadrel::core::Timecode;
using cadrel::tests::secondsOf;
using desktop::RowLayout;
using desktop::TracksView;
using standin::ClipEvent;
using standin::Track;
using standin::tests::TestHost;
using Velmark::Counted;
using Velmark::makeCounted;

namespace {

constexpr int TrackCount = 200;
constexpr int ClipCount = 5000;
constexpr double MostSeconds = 5.0; ///< to open it
constexpr double MostPaint = 0.033; ///< a thirtieth of a second

/// Two hours, with a curve of a thousand points on each track.
void fill(standin::Project& project)
{
    for (int number = 0; number < TrackCount; ++number) {
        const Counted<Track> track = Track::create(Track::Kind::Audio);
        track->setName(u"track");
        for (int at = 0; at < ClipCount; ++at) {
            const auto clip = makeCounted<ClipEvent>();
            const double start = at * 1.44 + number * 0.01;
            clip->setSpan(start, start + 0.7 + (at % 7) * 0.1);
            const std::string name = "clip " + std::to_string(at);
            clip->setName(std::u16string(name.begin(), name.end()));
            clip->insertInto(*track);
        }
        for (int at = 0; at < 1000; ++at) {
            const auto point = makeCounted<standin::AutomationPoint>();
            point->setSpan(at * 7.2, at * 7.2);
            point->setValue((at % 10) / 10.0);
            point->insertInto(track->curve(1));
        }
        track->insertInto(project);
    }
}

/// Two thousand shots of 3.6 seconds, of which every second pair has changed places, in a film from 00:00:00:00 on.
desktop::ChangeMap manyEvents(const cadrel::core::Framerate& framerate)
{
    cadrel::core::EventList change;
    for (int shot = 0; shot < 2000; ++shot) {
        const int from = shot % 4 < 2 ? shot : shot ^ 1;
        auto event = std::make_shared<cadrel::core::EventBase>();
        event->setTimecodes(Timecode(from * 90), Timecode(from * 90 + 90), Timecode(shot * 90),
                            Timecode(shot * 90 + 90));
        change.add(event);
    }
    return {change, change, change, framerate, 0.0, desktop::ChangeMap::State::Carried};
}

} // namespace

TEST(TracksSpeed, AMillionClipsAreOpenedInFiveSecondsAndDrawnThirtyTimesASecondAtEachZoom)
{
    if (CADREL_ADDRESS_SANITIZER)
        GTEST_SKIP() << "measured without sanitizers";
    const juce::ScopedJuceInitialiser_GUI juce;
    TestHost host;
    fill(host.project);
    TracksView view(host.project, host.application.edits(), nullptr);
    view.setSize(1600, 1000);
    juce::Image image(juce::Image::RGB, 1600, 1000, true);
    const auto draw = [&] {
        juce::Graphics graphics(image);
        view.paintEntireComponent(graphics, false);
    };
    const double opened = secondsOf(draw);
    EXPECT_LT(opened, MostSeconds);
    std::cout << "opened: " << opened << " s\n";
    double longest = 0.0;

    const cadrel::tests::TestProject rate;
    for (const bool hasChange : {false, true}) {
        if (hasChange)
            view.setChange(manyEvents(rate.framerate));
        view.setGhosts(hasChange);
        view.showEvent(hasChange ? std::optional<std::size_t>(300) : std::nullopt);
        for (const RowLayout::Size size : {RowLayout::Size::Small, RowLayout::Size::Medium, RowLayout::Size::Large}) {
            view.setRowSize(size);
            view.fitAll();
            for (int zoom = 0; zoom < 12; ++zoom) {
                view.scrollTo(1000.0);
                draw();
                // The shortest of three, as the machine may do other things as well.
                double least = 1.0;
                for (int time = 0; time < 3; ++time) {
                    view.scrollTo(1000.0 + time * 37.0 * view.scale().secondsPerPixel());
                    least = std::min(least, secondsOf(draw));
                }
                longest = std::max(longest, least);
                EXPECT_LT(least, MostPaint) << (hasChange ? "with" : "without") << " a change, rows "
                                            << static_cast<int>(size) << ", zoom " << zoom;
                view.zoomBy(4.0);
            }
        }
    }
    std::cout << "drawn in " << longest * 1000.0 << " ms at most\n";
}
