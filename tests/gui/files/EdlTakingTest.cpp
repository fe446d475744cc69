// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/EdlTaking.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "gui/files/TakenFiles.h"
#include "tests/gui/files/EdlTexts.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/RecordingAlerts.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Framerate;
using core::ListKind;
using gui::TakenFiles;
using util::Result;

using Messages = std::vector<std::wstring>;
using Buttons = std::vector<std::vector<std::wstring>>;

class EdlTakingTest : public testing::Test {
protected:
    std::string write(const std::string& name, const std::string& text) const
    {
        return m_folder.write(name, text).string();
    }
    std::wstring pathOf(const std::string& name) const { return widePath(m_folder / name); }

    void take(const std::vector<std::string>& paths) { gui::takeEdls(m_taken, paths, true); }
    /// One event that spans a frame number.
    std::string withFrame(const std::string& frame) const
    {
        return edlLine("001", "10:00:00:00 10:00:05:" + frame + " 01:00:00:00 01:00:05:" + frame);
    }

    const Messages& messages() const { return m_alerts.messages; }
    std::wstring rateMismatch(const std::string& name) const
    {
        return L"Frame rate mismatch between current project and loaded EDL " + pathOf(name);
    }
    std::wstring invalidTimecodes(const std::string& name) const
    {
        return L"Some timecodes in the loaded EDL file " + pathOf(name) +
               L" do not match the current project frame rate.";
    }
    std::wstring noValidEntries(const std::string& name) const
    {
        return L"The loaded EDL file " + pathOf(name) + L" does not contain valid entries.";
    }
    static constexpr const wchar_t* LineOfAReel = L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: ";

    const Buttons m_question{{L"Continue", L"Abort"}};
    const Buttons m_statement{{}};

    TestProject m_project;
    TempFolder m_folder;
    RecordingAlerts m_alerts;
    std::shared_ptr<TakenFiles> m_taken = std::make_shared<TakenFiles>(ListKind::Old);
};

TEST_F(EdlTakingTest, TakesAGoodFileWithoutAWord)
{
    take({write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(messages(), Messages{});
    EXPECT_EQ(m_taken->summary(), std::wstring(LineOfAReel) + L"a.edl\n");
}

TEST_F(EdlTakingTest, TakesAFileWhoseNameHasLettersOfAnyLanguage)
{
    take({write("L\xc3\xb6we \xe6\x98\xa0.edl", fiveSecondsEdl())});

    EXPECT_EQ(m_taken->summary(), std::wstring(LineOfAReel) + L"L\u00f6we \u6620.edl\n");
}

TEST_F(EdlTakingTest, GoesOnWithTheNextFileWhenOneCannotBeLoaded)
{
    take({(m_folder / "gone.edl").string(), m_folder.path().string(), write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(messages(), (Messages{L"An error occurred while loading the file.\n\n" + pathOf("gone.edl"),
                                    L"An error occurred while loading the file.\n\n" + widePath(m_folder.path())}));
    EXPECT_EQ(m_alerts.buttons, (Buttons{{}, {}}));
    EXPECT_EQ(m_taken->summary(), std::wstring(LineOfAReel) + L"a.edl\n");
}

TEST_F(EdlTakingTest, DoesNotReadWhatIsTooLargeForAnEdl)
{
    const std::string path = write("film.mov", fiveSecondsEdl());
    // Takes no room on the disk.
    std::filesystem::resize_file(path, std::uintmax_t{256} * 1024 * 1024 + 1);

    take({path});

    EXPECT_EQ(messages(), Messages{L"An error occurred while loading the file.\n\n" + pathOf("film.mov")});
    EXPECT_TRUE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, ShowsANameThatIsNoUtf8WithReplacementCharacters)
{
    take({"/reels/caf\xe9.edl"});

    EXPECT_EQ(messages(), Messages{L"An error occurred while loading the file.\n\n/reels/caf\ufffd.edl"});
}

TEST_F(EdlTakingTest, AsksAboutAFileOfAHigherRate)
{
    take({write("a.edl", withFrame("29"))});

    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});
    EXPECT_EQ(m_alerts.buttons, m_question);
    EXPECT_FALSE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, LeavesOutAFileThatTheUserAborts)
{
    m_alerts.answer = 2;
    take({write("a.edl", withFrame("29")), write("b.edl", fiveSecondsEdl())});

    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});
    EXPECT_EQ(m_taken->summary(), std::wstring(LineOfAReel) + L"b.edl\n");
}

TEST_F(EdlTakingTest, LeavesOutAFileOnEscape)
{
    m_alerts.key = RecordingAlerts::Key::Escape;
    take({write("a.edl", withFrame("29"))});

    EXPECT_TRUE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, TakesAFileOfALowerRateWithoutAWord)
{
    const TestProject project(Framerate(30, 0));

    take({write("a.edl", withFrame("23"))});

    EXPECT_EQ(messages(), Messages{});
    EXPECT_FALSE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, AsksAboutTimecodesThatDoNotExistInAFileOfALowerRate)
{
    const TestProject project(Framerate(30, 0));

    take({write("a.edl", invalidEdl())});

    EXPECT_EQ(messages(), Messages{invalidTimecodes("a.edl")});
    EXPECT_EQ(m_alerts.buttons, m_question);
    EXPECT_FALSE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, LeavesOutAFileWithTimecodesThatDoNotExistWhenTheUserAborts)
{
    m_alerts.answer = 2;
    take({write("a.edl", invalidEdl())});

    EXPECT_EQ(messages(), Messages{invalidTimecodes("a.edl")});
    EXPECT_TRUE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, AsksAboutNonDropAgainstDropFrameAtThirty)
{
    const TestProject project(Framerate(30, true, 1));

    take({write("a.edl", "FCM: NON-DROP FRAME\n" + withFrame("29"))});
    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});

    take({write("b.edl", "FCM: DROP FRAME\n" + withFrame("29")), write("c.edl", withFrame("29"))});
    EXPECT_EQ(messages().size(), 1U);
}

TEST_F(EdlTakingTest, AsksAboutDropFrameAgainstNonDropAtThirty)
{
    const TestProject project(Framerate(30, true, 0));

    take({write("a.edl", "FCM: DROP FRAME\n" + withFrame("20"))});
    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});

    take({write("b.edl", "FCM: NON-DROP FRAME\n" + withFrame("29")), write("c.edl", withFrame("29"))});
    EXPECT_EQ(messages().size(), 1U);
}

TEST_F(EdlTakingTest, AsksNothingWhereTheProjectDoesNotSayItsKindOfTimecode)
{
    const TestProject project(Framerate(30, -1));

    take({write("a.edl", "FCM: NON-DROP FRAME\n" + withFrame("29"))});

    EXPECT_EQ(messages(), Messages{});
}

TEST_F(EdlTakingTest, KnowsDropFrameByItsSemicolons)
{
    const TestProject project(Framerate(30, true, 0));

    take({write("a.edl", edlLine("001", "10:00:00;00 10:00:05;00 01:00:00;00 01:00:05;00"))});

    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});
}

TEST_F(EdlTakingTest, CountsDropFrameAsThirtyFrames)
{
    take({write("a.edl", "FCM: DROP FRAME\n" + withFrame("20"))});
    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});

    const TestProject project(Framerate(60, 0));
    take({write("b.edl", "FCM: DROP FRAME\n" + withFrame("20"))});
    EXPECT_EQ(messages().size(), 1U);
}

TEST_F(EdlTakingTest, TakesNothingOfAFileWithoutAReadableEvent)
{
    take({write("a.edl", fiveSecondsEdl())});
    const std::wstring before = m_taken->summary();

    take({write("b.edl", edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00", "A001", "A  C  ")),
          write("c.edl", "TITLE: NOTHING\n")});

    EXPECT_EQ(messages(), (Messages{noValidEntries("b.edl"), noValidEntries("c.edl")}));
    EXPECT_EQ(m_alerts.buttons, (Buttons{{}, {}}));
    EXPECT_EQ(m_taken->summary(), before);
}

TEST_F(EdlTakingTest, KeepsWhatWasTakenOfAFileThatHasBecomeUnreadable)
{
    take({write("a.edl", fiveSecondsEdl())});
    take({write("a.edl", "TITLE: NOTHING\n")});

    EXPECT_EQ(m_taken->summary(), std::wstring(LineOfAReel) + L"a.edl\n");
}

TEST_F(EdlTakingTest, TakesSoundEventsForTheChangeEdlAlone)
{
    const std::string sound = edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00", "A001", "A  C  ");
    m_taken = std::make_shared<TakenFiles>(ListKind::Change);

    take({write("a.edl", sound)});

    EXPECT_EQ(messages(), Messages{});
    EXPECT_FALSE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, RemovesAChangeFileOfDissolvesAloneWithoutAWord)
{
    m_taken = std::make_shared<TakenFiles>(ListKind::Change);

    take({write("a.edl", edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00", "A001", "V D 012"))});

    EXPECT_EQ(messages(), Messages{});
    EXPECT_TRUE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, RenamesBRollsWhenItIsAskedTo)
{
    const std::string rolls =
        fiveSecondsEdl() + edlLine("002", "10:00:00:00 10:00:05:00 01:00:05:00 01:00:10:00", "A001B");
    core::DataModel model;

    gui::takeEdls(m_taken, {write("a.edl", rolls)}, false);
    m_taken->appendTo(model, {}, {}, L"/reels");
    EXPECT_EQ(model.oldEdl().at(1).rollName(), "A001B");

    take({write("a.edl", rolls)});
    m_taken->appendTo(model, {}, {}, L"/reels");
    EXPECT_EQ(model.oldEdl().at(3).rollName(), "A001");
}

TEST_F(EdlTakingTest, TellsTheLinesThatCouldNotBeRead)
{
    const std::string broken = "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n";
    take({write("a.edl", fiveSecondsEdl() + broken)});

    EXPECT_EQ(messages(), Messages{L"Some lines of the EDL file " + pathOf("a.edl") +
                                   L" could not be read:\n\nLine 2 misses a field and isn't read: "
                                   L"\"002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\"\n"});
    EXPECT_EQ(m_alerts.buttons, m_question);
    EXPECT_FALSE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, LeavesOutAFileWithLinesThatCouldNotBeReadWhenTheUserAborts)
{
    m_alerts.answer = 2;
    take({write("a.edl", fiveSecondsEdl() + "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n")});

    EXPECT_TRUE(m_taken->isEmpty());
}

TEST_F(EdlTakingTest, TellsTheLinesOfAFileWithoutAnyEvent)
{
    take({write("a.edl", "001  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n")});

    EXPECT_EQ(messages(),
              Messages{noValidEntries("a.edl") + L"\n\nLine 1 misses a field and isn't read: "
                                                 L"\"001  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\"\n"});
    EXPECT_EQ(m_alerts.buttons, m_statement);
}

TEST_F(EdlTakingTest, CountsTheLinesThatAreTooManyForAnAlert)
{
    std::string text = fiveSecondsEdl();
    for (int line = 0; line < 7; ++line)
        text += "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n";

    take({write("a.edl", text)});

    ASSERT_EQ(messages().size(), 1U);
    EXPECT_NE(messages()[0].find(L"Line 6 "), std::wstring::npos);
    EXPECT_EQ(messages()[0].find(L"Line 7 "), std::wstring::npos);
    EXPECT_TRUE(messages()[0].ends_with(L"\nand 2 more\n"));
}

TEST_F(EdlTakingTest, CutsALongLine)
{
    take({write("a.edl", fiveSecondsEdl() + "002  A001 V C 10:00:00:00 10:00:05:00" + std::string(200, ' ') + "x\n")});

    ASSERT_EQ(messages().size(), 1U);
    const std::size_t quote = messages()[0].find(L'"');
    // A hundred characters between the quotes.
    EXPECT_EQ(messages()[0].find(L"\u2026\"\n"), quote + 100);
}

TEST_F(EdlTakingTest, DropsAllThatIsLeftWhenItsOwnerLetsGoDuringAnAlert)
{
    const std::string good = write("b.edl", fiveSecondsEdl());
    const std::string twice = write("a.edl", withFrame("29") + "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n");
    m_alerts.meanwhile = [this] { m_taken.reset(); };

    take({twice, good});

    EXPECT_EQ(messages(), Messages{rateMismatch("a.edl")});
}

TEST_F(EdlTakingTest, DropsAllThatIsLeftWhenItsOwnerLetsGoWhileAFailureIsTold)
{
    m_alerts.meanwhile = [this] { m_taken.reset(); };

    take({(m_folder / "gone.edl").string(), (m_folder / "gone2.edl").string()});

    EXPECT_EQ(messages().size(), 1U);
}

} // namespace
} // namespace cadrel::tests
