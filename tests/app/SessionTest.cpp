// SPDX-License-Identifier: GPL-3.0-or-later

// Sessions of Ardour on the command line.

#include "tests/app/ProgramRun.h"
#include "tests/standin/ardour/SessionText.h"

#include <filesystem>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <pugixml.hpp>

namespace {

using namespace cadrel::tests;
using nlohmann::json;
using standin::tests::location;
using standin::tests::region;

/// Two shots of 2 s at 25 frames a second, which change places.
const std::string OldEdl = "TITLE: OLD\nFCM: NON-DROP FRAME\n"
                           "001  CAM001   V     C        10:00:00:00 10:00:02:00 00:00:00:00 00:00:02:00\n"
                           "002  CAM002   V     C        11:00:00:00 11:00:02:00 00:00:02:00 00:00:04:00\n";
const std::string NewEdl = "TITLE: NEW\nFCM: NON-DROP FRAME\n"
                           "001  CAM002   V     C        11:00:00:00 11:00:02:00 00:00:00:00 00:00:02:00\n"
                           "002  CAM001   V     C        10:00:00:00 10:00:02:00 00:00:02:00 00:00:04:00\n";

class Session : public testing::Test {
protected:
    Session()
    {
        m_text.regions = region(51, 0, 192000);
        m_text.locations = location(61, "session", 0, 192000, "IsSessionRange");
        m_text.routes = R"(<Route id="22" name="Piano" default-type="midi" midi-playlist="32"/>)";
        m_text.playlists = R"(<Playlist id="32" name="Piano" type="midi"/>)";
        file = folder.write("reel.ardour", std::string(m_text));
        oldEdl = folder.write("old.edl", OldEdl);
        newEdl = folder.write("new.edl", NewEdl);
        output = (folder.path() / "new.ardour").string();
    }

    Outcome apply(std::vector<std::string> more, const std::string& project = {}) const
    {
        std::vector<std::string> arguments{"apply", project.empty() ? file : project, "--old", oldEdl, "--new", newEdl};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runCadrel(arguments);
    }
    /// The regions of a session, each as position and start in samples.
    static std::vector<std::pair<long, long>> regionsOf(const std::string& session)
    {
        pugi::xml_document document;
        EXPECT_TRUE(document.load_file(session.c_str()));
        std::vector<std::pair<long, long>> regions;
        for (const pugi::xpath_node& node : document.select_nodes("//Playlist[@id='31']/Region")) {
            const std::string length = node.node().attribute("length").value();
            regions.emplace_back(std::stol(length.substr(length.find('@') + 2)) / 5880,
                                 std::stol(std::string(node.node().attribute("start").value()).substr(1)) / 5880);
        }
        return regions;
    }

    TempFolder folder;
    std::string file;
    std::string oldEdl;
    std::string newEdl;
    std::string output;

private:
    standin::tests::SessionText m_text;
};

TEST_F(Session, IsCarriedOverToAnother)
{
    const std::string before = contentOf(file);
    const Outcome outcome = apply({"-o", output});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(regionsOf(output), (std::vector<std::pair<long, long>>{{0, 96000}, {96000, 0}}));
    EXPECT_EQ(contentOf(file), before);
}

TEST_F(Session, IsReplacedInPlaceAndItsFormerFileKept)
{
    const std::string before = contentOf(file);
    const Outcome outcome = apply({"--in-place", "--backup"});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(regionsOf(file).size(), 2U);
    EXPECT_EQ(contentOf(folder.path() / "reel_backup_1.ardour"), before);
}

TEST_F(Session, IsWhatItsFolderStandsFor)
{
    EXPECT_EQ(apply({"-o", output}, folder.path().string()).status, 0);
    EXPECT_TRUE(std::filesystem::exists(output));
    const Outcome several = runCadrel({"show", folder.path().string()});
    EXPECT_EQ(several.status, 1);
    EXPECT_NE(several.err.find("holds several sessions"), std::string::npos) << several.err;
}

TEST_F(Session, IsNotWrittenWhereItsSoundIsNot)
{
    const TempFolder other;
    const Outcome outcome = apply({"-o", (other.path() / "new.ardour").string()});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_NE(outcome.err.find("lies outside of the session's folder"), std::string::npos) << outcome.err;
    EXPECT_TRUE(std::filesystem::is_empty(other.path()));
}

TEST_F(Session, EndsAsMuchLaterAsTheProgramme)
{
    folder.write("new.edl", NewEdl + "003  CAM003   V     C        12:00:00:00 12:00:01:00 00:00:04:00 00:00:05:00\n");
    ASSERT_EQ(apply({"-o", output}).status, 0);
    pugi::xml_document document;
    ASSERT_TRUE(document.load_file(output.c_str()));
    // 5 s.
    EXPECT_STREQ(document.select_node("//Location[@name='session']").node().attribute("end").value(), "a1411200000");
}

TEST_F(Session, IsLeftAloneWhileArdourHasUnsavedWork)
{
    folder.write("reel.pending", "<Session/>");
    const Outcome outcome = apply({"--in-place"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_NE(outcome.err.find("unsaved work"), std::string::npos) << outcome.err;
    EXPECT_EQ(regionsOf(file).size(), 1U);
}

TEST_F(Session, TellsWhatToDoWhenItCannotBeTaken)
{
    folder.write("reel.pending", "<Session/>");
    EXPECT_NE(apply({"--in-place"})
                  .err.find("in place of this session; open the session in Ardour and save it, or remove "
                            "that file\n"),
              std::string::npos);
    std::filesystem::remove(folder.path() / "reel.pending");
    folder.write("other.ardour", contentOf(file));
    const Outcome several = runCadrel({"show", folder.path().string()});
    EXPECT_NE(several.err.find("holds several sessions; name one of them\n"), std::string::npos) << several.err;
}

TEST_F(Session, CanBeginAnewWhereWhatEarlierRunsHaveStoredIsBroken)
{
    ASSERT_EQ(apply({"-o", output}).status, 0);
    std::string text = contentOf(output);
    const std::size_t stored = text.find("<Cadrel version");
    ASSERT_NE(stored, std::string::npos);
    text.replace(text.find('>', stored) + 1, 1, "x");
    const std::string broken = folder.write("broken.ardour", text);
    const std::string again = (folder.path() / "again.ardour").string();
    const auto applyBack = [&](std::vector<std::string> more) {
        std::vector<std::string> arguments{"apply", broken, "--old", newEdl, "--new", oldEdl, "-o", again};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runCadrel(arguments);
    };
    const Outcome stopped = applyBack({});
    EXPECT_EQ(stopped.status, 1);
    EXPECT_NE(stopped.err.find("Cadrel's data in it is damaged; take an intact copy, or begin anew with --fresh"),
              std::string::npos)
        << stopped.err;
    const Outcome fresh = applyBack({"--fresh"});
    EXPECT_EQ(fresh.status, 0) << fresh.err;
    EXPECT_EQ(runCadrel({"show", again}).out.find("damaged"), std::string::npos);
    EXPECT_NE(runCadrel({"show", broken}).out.find("damaged"), std::string::npos);
}

TEST_F(Session, ShowsItsVideoAsTheOldPicture)
{
    std::string text = contentOf(file);
    text.insert(text.find("</Session>"), R"(<Extra><Videotimeline Filename="reel.mov" VideoOffset="0"/></Extra>)");
    const std::string film = folder.write("film.ardour", text);
    const Outcome shown = runCadrel({"show", film});
    EXPECT_NE(shown.out.find("Cadrel's track: Old Video"), std::string::npos) << shown.out;
    const Outcome outcome = runCadrel({"apply", film, "--old", oldEdl, "--new", newEdl, "-o", output, "--summary"});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_NE(contentOf(output).find(R"(<Videotimeline Filename="reel.mov" VideoOffset="0"/>)"), std::string::npos);
}

TEST_F(Session, HasFadesOfTheLengthThatIsAskedFor)
{
    EXPECT_EQ(apply({"-o", output, "--fade", "10"}).status, 0);
    pugi::xml_document document;
    ASSERT_TRUE(document.load_file(output.c_str()));
    const std::string events = document.select_node("//Region/FadeIn/AutomationList/events").node().text().get();
    // 10 ms are 480 samples of 5,880 superclocks.
    EXPECT_NE(events.find("\na2822400 1\n"), std::string::npos) << events;
}

TEST_F(Session, HasNoOtherLengthOfFades)
{
    for (const char* const length : {"-1", "10001", "x", "nan", "-nan"})
        EXPECT_EQ(apply({"-o", output, "--fade", length}).status, 2) << length;
    for (const char* const length : {"0", "10000"})
        EXPECT_EQ(apply({"-o", output, "--overwrite", "--fade", length}).status, 0) << length;
}

TEST_F(Session, HasAReportThatNamesWhatStays)
{
    const Outcome outcome = apply({"--summary"});
    EXPECT_NE(outcome.out.find("\nStays       the MIDI track \"Piano\"\n"), std::string::npos) << outcome.out;
    const json report = json::parse(apply({"--json", "-"}).out);
    EXPECT_EQ(report.at("staying"), json::array({"the MIDI track \"Piano\""}));
}

TEST_F(Session, IsShownWithoutTheIdsOfItsObjects)
{
    const Outcome outcome = runCadrel({"show", file});
    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.out.find("Form:"), std::string::npos) << outcome.out;
    EXPECT_EQ(runCadrel({"show", file, "--json", "-"}).out.find("Form:"), std::string::npos);
}

TEST_F(Session, GetsItsMarkersOfARunReplacedByTheNext)
{
    ASSERT_EQ(apply({"-o", output}).status, 0);
    const auto marksIn = [](const std::string& session) {
        pugi::xml_document document;
        EXPECT_TRUE(document.load_file(session.c_str()));
        return document.select_nodes("//Location[starts-with(@name, 'Destination')]").size();
    };
    EXPECT_EQ(marksIn(output), 2U);
    const std::string again = (folder.path() / "again.ardour").string();
    const Outcome outcome = runCadrel({"apply", output, "--old", newEdl, "--new", oldEdl, "-o", again});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(marksIn(again), 2U);
    // The cut in the region stays.
    EXPECT_EQ(regionsOf(again), (std::vector<std::pair<long, long>>{{96000, 96000}, {0, 0}}));
}

TEST_F(Session, StaysToTheByteWhenNothingHasChanged)
{
    const std::string same = folder.write("same.edl", OldEdl);
    ASSERT_EQ(runCadrel({"apply", file, "--old", oldEdl, "--new", same, "-o", output}).status, 0);
    const std::string before = contentOf(file);
    const std::string after = contentOf(output);
    const std::size_t extra = after.find("\n  <Extra>");
    ASSERT_NE(extra, std::string::npos);
    const std::size_t end = after.find("</Extra>", extra) + std::string("</Extra>").size();
    EXPECT_EQ(after.substr(0, extra) + after.substr(end), before);
}

TEST(FadeOption, IsRefusedForAProjectWithoutFades)
{
    const TempFolder folder;
    const std::string project =
        folder.write("reel.stage", R"({"format": "stage", "version": 1, "framesPerSecond": 25, "tracks": []})");
    const std::string edl = folder.write("old.edl", OldEdl);
    const std::string other = folder.write("new.edl", NewEdl);
    const Outcome outcome = runCadrel({"apply", project, "--old", edl, "--new", other, "--fade", "5"});
    EXPECT_EQ(outcome.status, 1);
    EXPECT_NE(outcome.err.find("without fades"), std::string::npos) << outcome.err;
}

} // namespace
