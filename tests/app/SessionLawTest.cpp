// SPDX-License-Identifier: GPL-3.0-or-later

// What holds of every session that goes through the whole program.

#include "tests/app/ProgramRun.h"
#include "tests/standin/ardour/SomeSession.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>
#include <string>

namespace cadrel::tests {

namespace {

std::string twoDigits(int number)
{
    return std::to_string(100 + number).substr(1);
}

/// Within the first minute.
std::string timecodeOf(int frame)
{
    return std::string("00:00:").append(twoDigits(frame / 30)).append(":").append(twoDigits(frame % 30));
}

/// A cut of shots of less than a second, some of which play a stretch that another one has.
std::string someCut()
{
    std::string edl = "TITLE: CUT\nFCM: NON-DROP FRAME\n";
    int record = 0;
    const int shots = *rc::gen::inRange(1, 30);
    for (int shot = 1; shot <= shots; ++shot) {
        const int length = *rc::gen::inRange(1, 30);
        const int roll = *rc::gen::inRange(1, 4);
        const int source = *rc::gen::inRange(0, 60);
        edl.append("0").append(twoDigits(shot)).append("  CAM00").append(std::to_string(roll));
        edl.append("   V     C        ").append(timecodeOf(source)).append(" ").append(timecodeOf(source + length));
        edl.append(" ").append(timecodeOf(record)).append(" ").append(timecodeOf(record + length)).append("\n");
        record += length;
    }
    return edl;
}

/// Without what Cadrel has added at the end.
std::string withoutOwn(const std::string& session)
{
    constexpr std::string_view End = "</Extra>";
    const std::size_t begin = session.find("\n  <Extra>");
    RC_ASSERT(begin != std::string::npos);
    return session.substr(0, begin) + session.substr(session.find(End, begin) + End.size());
}

} // namespace

RC_GTEST_PROP(SessionLaw, ACutOntoItselfLeavesTheSessionAsItWasToTheByte, ())
{
    const TempFolder folder;
    const std::string session = standin::tests::someSession();
    const std::string cut = someCut();
    const std::string file = folder.write("reel.ardour", session);
    const std::string old = folder.write("old.edl", cut);
    const std::string fresh = folder.write("new.edl", cut);
    const auto conformed = [&](const std::string& from, const char* name) {
        const std::string to = (folder.path() / name).string();
        const Outcome outcome =
            runCadrel({"apply", from, "--old", old, "--new", fresh, "-o", to, "--summary", "--force"});
        if (outcome.status != 0)
            RC_FAIL(outcome.err);
        return to;
    };
    const std::string once = conformed(file, "once.ardour");
    RC_ASSERT(withoutOwn(contentOf(once)) == session);
    const std::string twice = conformed(once, "twice.ardour");
    RC_ASSERT(contentOf(twice) == contentOf(once));
}

} // namespace cadrel::tests
