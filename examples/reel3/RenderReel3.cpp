// SPDX-License-Identifier: GPL-3.0-or-later

// Renders a cut of the example reel: each shot in a colour of its own, with its roll, its clip name, and the timecodes of the
// source and of the cut burnt in, as the EDL tells. The bars at the bottom are the number of the frame.

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/ProgrammePlace.h"
#include "core/time/Timecode.h"
#include "examples/burnin/VideoEncoding.h"
#include "examples/reel3/CutReading.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <exception>
#include <functional>
#include <iostream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using namespace reel3;
using cadrel::core::EventBase;
using cadrel::core::EventList;
using cadrel::core::Timecode;
using cadrel::core::TransitionType;
using cadrel::examples::BurntInFrame;
using cadrel::examples::colourOf;
using cadrel::examples::VideoEncoding;

constexpr int Width = 320;
constexpr int Height = 180;
constexpr const char* Options = "-c:v libx264 -preset superfast -crf 32 -pix_fmt yuv420p -g 48";

/// A shot of the cut, or the outgoing side of a transition.
struct Shot {
    std::string roll;
    std::string clip;
    std::int32_t source = 0; ///< the frame of the source at `start`
    double speed = 1.0;
    std::int32_t start = 0; ///< in frames of the cut
    bool isBlack = false;
};

struct CutEvent {
    Shot shot;
    Shot outgoing;
    std::int32_t end = 0;
    std::int32_t transition = TransitionType::Cut;
    std::int32_t duration = 0; ///< of the transition, in frames
};

Shot shotOf(const EventBase& event)
{
    return {event.rollName(),
            event.clipName(),
            event.firstSource().toFrameCount(),
            event.signedSpeed(),
            event.dstIn().toFrameCount(),
            cadrel::core::isBlack(event)};
}

std::vector<CutEvent> eventsOf(const EventList& picture)
{
    std::vector<CutEvent> events;
    for (std::size_t index = 0; index < picture.size(); ++index) {
        const EventBase& event = picture.at(index);
        if (!event.isValid() || event.dstIn().toFrameCount() >= event.dstOut().toFrameCount())
            continue;
        CutEvent next{shotOf(event), {}, event.dstOut().toFrameCount(), TransitionType::Cut, 0};
        if (const EventBase* const outgoing = cadrel::core::outgoingOf(picture, index);
            event.isTransition() && outgoing) {
            next.outgoing = shotOf(*outgoing);
            next.outgoing.speed = 1.0;
            next.transition = event.transitionType();
            next.duration = event.transitionDuration();
        }
        events.push_back(next);
    }
    return events;
}

void draw(BurntInFrame& frame, const Shot& shot, std::int32_t time)
{
    if (shot.isBlack) {
        frame.fill({});
        return;
    }
    frame.fill(colourOf(std::hash<std::string>()(shot.roll)));
    frame.write(0, shot.roll);
    frame.write(1, shot.clip);
    const double source =
        static_cast<double>(shot.source) + std::floor(static_cast<double>(time - shot.start) * shot.speed);
    frame.write(2, "SRC " + Timecode(static_cast<std::int32_t>(source)).toString());
}

void render(const std::string& edl, const std::string& video)
{
    const std::vector<CutEvent> events = eventsOf(readCut(edl));
    if (events.empty())
        throw std::runtime_error(edl + " has no events");
    const std::int32_t first = events.front().shot.start;
    const std::string options = std::string(Options) + " -timecode " + Timecode(first).toString();
    VideoEncoding encoding(video, Width, Height, "24", options);
    BurntInFrame frame(Width, Height);
    BurntInFrame outgoing(Width, Height);
    std::int32_t time = first;
    for (const CutEvent& event : events) {
        for (; time < event.end; ++time) {
            draw(frame, event.shot, time);
            const std::int32_t into = time - event.shot.start;
            if (into < event.duration) {
                draw(outgoing, event.outgoing, time);
                const double left = 1.0 - static_cast<double>(into) / event.duration;
                event.transition == TransitionType::Wipe ? frame.wipe(outgoing, left) : frame.mix(outgoing, left);
            }
            frame.write(3, "REC " + Timecode(time).toString());
            frame.drawBars(static_cast<std::uint16_t>(time - first));
            encoding.add(frame);
        }
    }
    encoding.finish();
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::cerr << "render_reel3: give the EDL of a cut and the name of the video\n";
        return 2;
    }
    const EdlSetting setting;
    try {
        render(argv[1], argv[2]);
        return 0;
    } catch (const cadrel::util::Result::Type&) {
        std::cerr << "render_reel3: " << argv[1] << ": can't be read\n";
    } catch (const std::exception& exception) {
        std::cerr << "render_reel3: " << exception.what() << '\n';
    }
    return 1;
}
