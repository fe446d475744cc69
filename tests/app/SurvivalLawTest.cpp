// SPDX-License-Identifier: GPL-3.0-or-later

// What survives of a cut, counted frame by frame, against the figures of the reports.

#include "core/time/Framerate.h"
#include "core/time/Timecode.h"
#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <rapidcheck.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Framerate;
using core::Timecode;
using nlohmann::json;

const Framerate Rate(24, 0);

std::string timecode(std::int32_t frame)
{
    Timecode timecode;
    timecode.setFrameCount(frame, Rate);
    return timecode.toString();
}

/// A number from `low` up to the one before `high`.
std::int32_t number(std::int32_t low, std::int32_t high)
{
    return *rc::gen::inRange(low, high);
}

/// A frame of a roll.
using Picture = std::pair<std::string, std::int32_t>;

/// A cut shot by shot, and what it shows frame by frame.
class CutFilm {
public:
    static constexpr std::int32_t Start = 24 * 3600;

    void shot(const std::string& roll, std::int32_t source, std::int32_t length)
    {
        const std::string digits = std::to_string(++m_count);
        m_text +=
            cut(std::string(3 - digits.size(), '0') + digits, roll, timecode(source) + " " + timecode(source + length),
                timecode(m_end) + " " + timecode(m_end + length));
        for (std::int32_t frame = 0; frame < length; ++frame)
            m_pictures[m_end + frame] = {roll, source + frame};
        m_end += length;
    }
    void black(std::int32_t length) { m_end += length; }

    const std::string& text() const { return m_text; }
    std::int32_t end() const { return m_end; }
    /// By frames of the programme, without black.
    const std::map<std::int32_t, Picture>& pictures() const { return m_pictures; }
    std::set<Picture> shown() const
    {
        std::set<Picture> shown;
        for (const auto& [frame, picture] : m_pictures)
            shown.insert(picture);
        return shown;
    }

private:
    std::string m_text = "TITLE: CUT\n";
    std::int32_t m_end = Start;
    int m_count = 0;
    std::map<std::int32_t, Picture> m_pictures;
};

/// A film that shows no picture twice, and another of which the first shot and some more are pieces of it.
std::pair<CutFilm, CutFilm> twoCuts()
{
    struct Shot {
        std::string roll;
        std::int32_t source;
        std::int32_t length;
    };
    CutFilm before;
    std::vector<Shot> shots;
    const std::int32_t count = number(1, 7);
    for (std::int32_t index = 0; index < count; ++index) {
        const Shot shot{number(0, 2) == 0 ? "A001" : "A002", 1000 * index, number(1, 60)};
        before.shot(shot.roll, shot.source, shot.length);
        before.black(number(0, 4) == 3 ? number(1, 20) : 0);
        shots.push_back(shot);
    }
    CutFilm after;
    const std::int32_t newCount = number(1, 10);
    for (std::int32_t index = 0; index < newCount; ++index) {
        const Shot shot = shots[static_cast<std::size_t>(number(0, count))];
        const std::int32_t head = number(0, shot.length);
        const std::int32_t length = number(1, shot.length - head + 1);
        if (index > 0 && number(0, 4) == 3)
            after.shot("N001", 5000 + 100 * index, number(1, 60));
        else
            after.shot(shot.roll, shot.source + head, length);
        after.black(number(0, 4) == 3 ? number(1, 20) : 0);
    }
    return {before, after};
}

/// What the new cut shows that the old one doesn't: stretches of picture without an end between.
json insertsOf(const CutFilm& before, const CutFilm& after)
{
    const std::set<Picture> old = before.shown();
    json inserts = json::array();
    std::int32_t last = -1;
    for (const auto& [frame, picture] : after.pictures()) {
        if (old.contains(picture))
            continue;
        if (last != frame - 1 || last < 0)
            inserts.push_back({{"dstIn", timecode(frame)}, {"frames", 0}});
        last = frame;
        inserts.back()["dstOut"] = timecode(frame + 1);
        inserts.back()["frames"] = inserts.back()["frames"].get<int>() + 1;
    }
    return inserts;
}

std::int32_t framesIn(const json& inserts)
{
    std::int32_t frames = 0;
    for (const json& insert : inserts)
        frames += insert.at("frames").get<std::int32_t>();
    return frames;
}

/// Holds the figures of a report against the pictures.
void requireFigures(const json& report, const CutFilm& before, const CutFilm& after)
{
    const json expected = insertsOf(before, after);
    const auto programme = static_cast<std::int32_t>(after.pictures().size());
    json inserts = report.at("inserts");
    for (json& insert : inserts) {
        insert.erase("shot");
        insert.erase("moreShots");
    }
    RC_ASSERT(report.at("programmeFrames").get<std::int32_t>() == programme);
    RC_ASSERT(report.at("coveredFrames").get<std::int32_t>() == programme - framesIn(expected));
    RC_ASSERT(inserts == expected);
}

} // namespace

RC_GTEST_PROP(SurvivalLaw, TheFiguresOfAChangeEdlAreThoseOfThePicturesThatBothCutsShow, ())
{
    const auto [before, after] = twoCuts();
    const TempFolder folder;
    const std::string heal = *rc::gen::element<std::string>("none", "normal", "gaps", "inserts");

    const Outcome outcome = runCadrel({"generate", "--old", folder.write("old.edl", before.text()), "--new",
                                       folder.write("new.edl", after.text()), "--rate", "24", "--no-b-roll", "--heal",
                                       heal, "--json", "-"});

    RC_LOG(before.text() + after.text() + outcome.err);
    RC_ASSERT(outcome.status == 0);
    requireFigures(json::parse(outcome.out), before, after);
}

RC_GTEST_PROP(SurvivalLaw, TheFiguresOfARunAreThoseOfThePicturesThatBothCutsShow, ())
{
    const auto [before, after] = twoCuts();
    const TempFolder folder;
    const double seconds = (before.end() - CutFilm::Start) / 24.0;
    const json sound = {{"kind", "audio"},
                        {"name", "DIA"},
                        {"events", json::array({{{"kind", "clip"}, {"start", 3600.0}, {"end", 3600.0 + seconds}}})}};

    const Outcome outcome = runCadrel({"apply", folder.write("film.stage", projectWith(sound.dump())), "--old",
                                       folder.write("old.edl", before.text()), "--new",
                                       folder.write("new.edl", after.text()), "--no-b-roll", "--force", "--json", "-"});

    RC_LOG(before.text() + after.text() + outcome.err);
    RC_ASSERT(outcome.status == 0);
    requireFigures(json::parse(outcome.out), before, after);
    const std::set<Picture> now = after.shown();
    std::int32_t surviving = 0;
    for (const auto& [frame, picture] : before.pictures())
        surviving += now.contains(picture) ? 1 : 0;
    const auto all = static_cast<std::int32_t>(before.pictures().size());
    const bool isTold = outcome.err.find("only " + timecode(surviving) + " of the " + timecode(all) +
                                         " of the old cut survive; --force goes on") != std::string::npos;
    RC_ASSERT(isTold == (2 * surviving < all));
}

} // namespace cadrel::tests
