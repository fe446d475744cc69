// SPDX-License-Identifier: GPL-3.0-or-later

// The CMX reader on any bytes, and the writer on what it has read.

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "core/fileio/CmxWriter.h"
#include "fuzz/Check.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace {

using namespace cadrel;
using fuzz::check;

struct Read {
    core::EventList events;
    core::Framerate framerate;
};

void read(const std::wstring& path, bool acceptAudio, Read& result)
{
    check(core::fileio::CmxParser().parse(path, result.events, result.framerate, acceptAudio) == util::Result::Ok,
          "every regular file is read");
}

bool sameRate(const core::Framerate& a, const core::Framerate& b)
{
    return a.framesPerSecond == b.framesPerSecond && a.dropFrame == b.dropFrame && a.pulledDown == b.pulledDown;
}

void checkEvent(const core::EventBase& event)
{
    check(event.eventKind() == core::EventKind::Plain, "the reader makes plain events");
    check(event.edlFileName() == "fuzz.edl", "an event knows its file");
    check(event.sourceLine() > 0, "an event knows its line");
    check(!event.comment().empty() && event.comment()[0] >= '0' && event.comment()[0] <= '9',
          "an event line opens with a digit");
    check(event.transitionType() >= core::TransitionType::Cut && event.transitionType() <= core::TransitionType::Wipe,
          "a transition is a cut, a dissolve or a wipe");
    check(event.transitionDuration() >= 0, "no transition has a negative length");
    check(event.clipName() == util::StringUtil::trim(event.clipName()), "clip names are trimmed");
    const std::vector<std::int32_t> flaws = event.flaws();
    check(std::is_sorted(flaws.begin(), flaws.end()), "flaws stand in ascending order");
    if (event.isValid()) {
        check(event.srcIn().isValid() && event.srcOut().isValid() && event.dstIn().isValid() &&
                  event.dstOut().isValid(),
              "the timecodes of a valid event are valid");
        check(event.srcOut() >= event.srcIn() && event.dstOut() >= event.dstIn(), "no valid range is reversed");
    }
}

/// Audio channels change nothing but the flaw that they get where they aren't accepted.
void checkAudio(const core::EventList& without, const core::EventList& with)
{
    check(without.size() == with.size(), "audio events are kept in any case");
    for (std::size_t i = 0; i < with.size(); ++i) {
        std::vector<std::int32_t> flaws = without.at(i).flaws();
        if (!with.at(i).hasFlaw(core::EventFlaw::NotVideoEvent))
            std::erase(flaws, core::EventFlaw::NotVideoEvent);
        check(flaws == with.at(i).flaws(), "accepting audio takes one flaw away and no other");
        check(with.at(i).hasSameTimecodes(without.at(i)), "accepting audio changes no timecode");
    }
}

/// A thorough reading loses no event that a plain one takes, and what it tells can be found.
void checkThorough(const std::wstring& path, const core::EventList& plain)
{
    core::fileio::CmxParser parser;
    parser.readThoroughly();
    Read thorough;
    check(parser.parse(path, thorough.events, thorough.framerate, false) == util::Result::Ok,
          "every regular file is read thoroughly");
    check(thorough.events.size() >= plain.size(), "a thorough reading takes what a plain one takes");
    for (const auto& event : thorough.events.events())
        checkEvent(*event);
    for (const auto& [line, problem] : parser.remarks().unreadLines) {
        check(line.number > 0 && line.text.size() <= 515, "an unread line has a number and a text of some length");
        check(!problem.empty(), "an unread line has a problem");
    }
}

void checkWrittenCuts(const tests::TempFolder& folder, const core::EventList& events)
{
    core::EventList cuts;
    for (const auto& event : events.events()) {
        const bool isCut = event->transitionType() == core::TransitionType::Cut;
        if (event->isValid() && isCut && cuts.size() < core::fileio::CmxWriter::MostEventsInAFile)
            cuts.add(event);
    }
    if (cuts.isEmpty())
        return;

    const std::wstring path = tests::widePath(folder / "written.edl");
    check(core::fileio::CmxWriter().write(path, cuts) == util::Result::Ok, "valid cuts can be written");
    Read back;
    read(path, false, back);
    check(back.events.size() == cuts.size(), "every written cut is read back");
    for (std::size_t i = 0; i < cuts.size(); ++i)
        check(back.events.at(i).isValid() && back.events.at(i).hasSameTimecodes(cuts.at(i)),
              "a written cut reads back with its timecodes");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static const tests::TestProject project{core::Framerate(30, 1)};
    static const tests::TempFolder folder;
    const std::wstring path =
        tests::widePath(folder.write("fuzz.edl", std::string_view(reinterpret_cast<const char*>(data), size)));

    Read video;
    Read audio;
    read(path, false, video);
    read(path, true, audio);
    for (const auto& event : video.events.events())
        checkEvent(*event);
    checkAudio(video.events, audio.events);

    core::Framerate detected;
    check(core::fileio::CmxParser().detect(path, detected) == util::Result::Ok,
          "every regular file shows a rate or none");
    check(sameRate(detected, video.framerate), "looking for the rate alone gives the rate of the reading");

    checkThorough(path, video.events);
    checkWrittenCuts(folder, video.events);
    return 0;
}
