// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/SessionClock.h"

#include "standin/project/FileFault.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

#include <cmath>

namespace standin::tests {

namespace {

SessionClock clockOf(const std::string& attributes, const std::string& tempos = "")
{
    pugi::xml_document document;
    const std::string text =
        "<Session " + attributes + "><TempoMap><Tempos>" + tempos + "</Tempos></TempoMap></Session>";
    EXPECT_TRUE(document.load_string(text.c_str()));
    return SessionClock(document.document_element());
}

SessionClock at48k(const std::string& tempos = "")
{
    return clockOf(R"(version="7002" sample-rate="48000")", tempos);
}

std::string tempo(const std::string& npm, const std::string& enpm, const std::string& sclock,
                  const std::string& quarters, const std::string& noteType = "4")
{
    return "<Tempo npm=\"" + npm + "\" enpm=\"" + enpm + "\" note-type=\"" + noteType + "\" sclock=\"" + sclock +
           "\" quarters=\"" + quarters + "\"/>";
}

TEST(SessionClock, CountsSuperclocks)
{
    const SessionClock clock = at48k();
    EXPECT_EQ(clock.seconds("a282240000"), 1.0);
    EXPECT_EQ(clock.samples("a282240000"), 48000);
    EXPECT_EQ(clock.samples("a5880"), 1);
    EXPECT_EQ(clock.timeText(1), "a5880");
    EXPECT_EQ(clock.timeText(1, true), "a5879");
}

TEST(SessionClock, RoundsDownToTheSample)
{
    const SessionClock clock = at48k();
    EXPECT_EQ(clock.samples("a5879"), 0);
    EXPECT_EQ(clock.samples("a11759"), 1);
}

TEST(SessionClock, CountsPlainSamplesBeforeVersion7000)
{
    const SessionClock clock = clockOf(R"(version="6000" sample-rate="44100")");
    EXPECT_EQ(clock.seconds("44100"), 1.0);
    EXPECT_EQ(clock.samples("22050"), 22050);
    EXPECT_EQ(clock.timeText(22050), "22050");
    EXPECT_EQ(clock.timeText(22050, true), "22049");
    EXPECT_THROW(clock.seconds("a22050"), FileFault);
}

TEST(SessionClock, CountsBeatsAtASteadyTempo)
{
    // 120 quarters a minute are two a second.
    const SessionClock clock = at48k(tempo("120", "120", "0", "0:0"));
    EXPECT_EQ(clock.seconds("b3840"), 1.0);
    EXPECT_EQ(clock.samples("b1920"), 24000);
    EXPECT_EQ(clock.ticksAt(1.5), 5760.0);
}

TEST(SessionClock, CountsNotesOfAnotherLength)
{
    // 120 eighths a minute are one quarter a second.
    const SessionClock clock = at48k(tempo("120", "120", "0", "0:0", "8"));
    EXPECT_EQ(clock.seconds("b1920"), 1.0);
}

TEST(SessionClock, CountsBeatsAfterAChangeOfTempo)
{
    const SessionClock clock = at48k(tempo("120", "120", "0", "0:0") + tempo("60", "60", "282240000", "2:0"));
    EXPECT_EQ(clock.seconds("b3840"), 1.0);
    EXPECT_EQ(clock.seconds("b5760"), 2.0);
    EXPECT_EQ(clock.ticksAt(2.0), 5760.0);
    EXPECT_EQ(clock.bendsBetween(0.0, 4.0), std::vector<double>{1.0});
    EXPECT_TRUE(clock.bendsBetween(1.0, 4.0).empty());
}

TEST(SessionClock, CountsBeatsAlongARamp)
{
    // From 60 to 120 in a second the tempo is e^(t ln 2): (2 - 1) / ln 2 quarters pass.
    const double quarters = 1.0 / std::log(2.0);
    const int ticks = static_cast<int>(std::lround((quarters - 1.0) * 1920));
    const SessionClock clock =
        at48k(tempo("60", "120", "0", "0:0") + tempo("120", "120", "282240000", "1:" + std::to_string(ticks)));
    EXPECT_NEAR(clock.seconds("b1920"), std::log2(1.0 + std::log(2.0)), 1e-12);
    EXPECT_NEAR(clock.ticksAt(std::log2(1.0 + std::log(2.0))), 1920.0, 1e-9);
    EXPECT_FALSE(clock.bendsBetween(0.0, 1.0).empty());
}

TEST(SessionClock, CountsBeatsUpToTheNextTempoWhereOneContinues)
{
    // As above, but the first tempo doesn't tell where it leads.
    const double quarters = 1.0 / std::log(2.0);
    const int ticks = static_cast<int>(std::lround((quarters - 1.0) * 1920));
    const SessionClock clock =
        at48k(R"(<Tempo npm="60" enpm="60" continuing="1" note-type="4" sclock="0" quarters="0:0"/>)" +
              tempo("120", "120", "282240000", "1:" + std::to_string(ticks)));
    EXPECT_NEAR(clock.seconds("b1920"), std::log2(1.0 + std::log(2.0)), 1e-12);
}

TEST(SessionClock, RoundsTheTiesOfAllTimesUp)
{
    const SessionClock clock = at48k();
    EXPECT_EQ(clock.samplesOf(0.5 / 48000), 1);
    EXPECT_EQ(clock.samplesOf(0.49 / 48000), 0);
    EXPECT_EQ(clock.samplesOf(-0.5 / 48000), 0);
    EXPECT_EQ(clock.samplesOf(-0.51 / 48000), -1);
}

TEST(SessionClock, WritesATimeThatIsReadAsTheSameSample)
{
    for (const char* const rate : {"44100", "48000", "88200", "96000", "176400", "192000", "22050", "11025"}) {
        const SessionClock clock = clockOf(std::string(R"(version="7002" sample-rate=")") + rate + "\"");
        for (const std::int64_t samples : {0L, 1L, 2L, 3L, 44099L, 44101L, 123456789L})
            EXPECT_EQ(clock.samples(clock.timeText(samples)), samples) << rate;
    }
}

TEST(SessionClock, RefusesWhatIsNoTime)
{
    const SessionClock clock = at48k(tempo("120", "120", "0", "0:0"));
    for (const char* const time :
         {"", "a", "5880", "a-1", "ax", "a1x", "c12", "a99999999999999999999", "b-1", "a9223372036854775807"})
        EXPECT_THROW(clock.seconds(time), FileFault) << time;
}

TEST(SessionClock, RefusesBeatsWithoutATempo)
{
    EXPECT_THROW(at48k().seconds("b1"), FileFault);
}

TEST(SessionClock, RefusesARateAtWhichNoSessionRuns)
{
    for (const char* const rate : {"", "0", "-48000", "7999", "768001", "48k"})
        EXPECT_THROW(clockOf(std::string(R"(version="7002" sample-rate=")") + rate + "\""), FileFault) << rate;
    EXPECT_EQ(clockOf(R"(version="7002" sample-rate="8000")").sampleRate(), 8000);
    EXPECT_EQ(clockOf(R"(version="7002" sample-rate="768000")").sampleRate(), 768000);
}

TEST(SessionClock, RefusesATempoMapThatCannotBe)
{
    EXPECT_THROW(at48k(tempo("0", "0", "0", "0:0")), FileFault);
    EXPECT_THROW(at48k(tempo("-1", "120", "0", "0:0")), FileFault);
    EXPECT_THROW(at48k(tempo("120", "120", "x", "0:0")), FileFault);
    EXPECT_THROW(at48k(tempo("120", "120", "0", "0")), FileFault);
    EXPECT_THROW(at48k(tempo("120", "120", "0", "0:0") + tempo("60", "60", "0", "1:0")), FileFault);
    EXPECT_THROW(at48k(tempo("120", "120", "0", "1:0") + tempo("60", "60", "5880", "0:0")), FileFault);
}

} // namespace

} // namespace standin::tests
