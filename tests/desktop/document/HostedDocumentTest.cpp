// SPDX-License-Identifier: GPL-3.0-or-later

// A document on which Cadrel works, with its settings and videos.

#include "core/model/DataModel.h"
#include "core/protect/ProtectedRun.h"
#include "host/Host.h"
#include "standin/project/ClipEvent.h"
#include "tests/desktop/document/DocumentHost.h"
#include "tests/standin/ardour/SessionText.h"
#include "tests/support/core/EventMaking.h"

namespace desktop::tests {

class HostedDocumentTest : public DocumentTest {
protected:
    cadrel::core::DataModel& model() { return *host->getProjectModel(); }
    cadrel::core::Settings& settings() { return model().settings(); }

    Velmark::Counted<cadrel::host::Host> host = Velmark::makeCounted<cadrel::host::Host>(application.context());
    OpenDocument& document = documents.open(writeProject("reel3.stage"));
};

TEST_F(HostedDocumentTest, IsSavedAfterOpening)
{
    idle();
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_FALSE(document.settleUnsaved());
}

TEST_F(HostedDocumentTest, IsUnsavedAfterAChangeOfASettingAndSavedWhenThatIsTakenBack)
{
    settings().setCreateInsertMarkers(!settings().createInsertMarkers());
    idle();
    EXPECT_TRUE(document.isUnsaved());
    settings().setCreateInsertMarkers(!settings().createInsertMarkers());
    idle();
    EXPECT_FALSE(document.isUnsaved());
}

TEST_F(HostedDocumentTest, KeepsSettingsAndVideosInTheAutosaveAndInTheFile)
{
    using cadrel::core::Timecode;
    using cadrel::core::VideoList;
    model().videoList().add(VideoList::Entry("/video/reel.mov", Timecode("01:00:00:00"), Timecode("00:20:00:00")),
                            false);
    idle();
    EXPECT_TRUE(document.isUnsaved());
    const auto autosave = Autosave::read(document.path());
    ASSERT_TRUE(autosave);
    EXPECT_EQ(autosave->content, bytesOf(document));

    ASSERT_TRUE(documents.save(document).isSaved());
    EXPECT_EQ(contentOf(document.path()), autosave->content);
    const std::filesystem::path path = document.path();
    documents.close(document);
    OpenDocument& again = documents.open(path);
    EXPECT_EQ(model().videoList().size(), 1U);
    EXPECT_FALSE(again.settleUnsaved());
}

TEST_F(HostedDocumentTest, IsUnsavedAfterARunAndSavedAgainAfterItsUndo)
{
    edit(document.project(), u"Clip", [&] {
        auto clip = Velmark::makeCounted<standin::ClipEvent>();
        clip->setSpan(10.0, 20.0);
        clip->insertInto(trackOf(document));
    });
    model().changeEdl().add(
        cadrel::tests::makeEvent("A", "00:00:10:00", "00:00:20:00", "00:00:30:00", "00:00:40:00", 1));
    ASSERT_EQ(host->canStart(), cadrel::util::Result::Ok);
    ASSERT_EQ(host->startCadrel(), cadrel::util::Result::Ok);
    ASSERT_TRUE(documents.save(document).isSaved());
    application.idle();
    ASSERT_EQ(document.undoNames().back(), u"Apply Cadrel");

    EXPECT_TRUE(document.isUnsaved());
    idle();
    EXPECT_TRUE(document.isUnsaved());
    ASSERT_TRUE(document.goToUndoPosition(document.undoPosition() - 1));
    EXPECT_FALSE(document.settleUnsaved());
    ASSERT_TRUE(document.goToUndoPosition(document.undoPosition() + 1));
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(document.settleUnsaved());
}

/// A session of Ardour with four seconds of sound, which ends with them, in the window.
class HostedSessionTest : public DocumentTest {
protected:
    /// The end of its range once it has been carried over to a new cut that takes so much of the old one, and saved; the new
    /// cut goes on with other picture up to `newEnd`. In seconds.
    double endAfterRun(const char* taken, const char* newEnd)
    {
        using cadrel::core::ProtectedRun;
        using cadrel::tests::makeEvent;
        cadrel::core::DataModel& model = *host->getProjectModel();
        model.oldEdl().add(makeEvent("A", "10:00:00:00", "10:00:04:00", "00:00:00:00", "00:00:04:00", 1));
        const std::string sourceEnd = std::string("10").append(std::string(taken).substr(2));
        model.newEdl().add(makeEvent("A", "10:00:00:00", sourceEnd.c_str(), "00:00:00:00", taken, 1));
        if (std::string(taken) != newEnd)
            model.newEdl().add(makeEvent("B", "11:00:00:00", "11:00:02:00", taken, newEnd, 2));
        EXPECT_EQ(model.generateChangeEdl(), cadrel::util::Result::Ok);
        const ProtectedRun run(model, {{0.0, 4.0}}, ProtectedRun::Source::Generated);
        EXPECT_EQ(host->startCadrelWithin(run.bounds(), run.startableList(model)), cadrel::util::Result::Ok);
        application.idle();
        EXPECT_TRUE(documents.save(document).isSaved());
        return savedEnd();
    }
    double savedEnd() const
    {
        const std::string session = contentOf(document.path());
        const std::size_t range = session.find(R"(name="session")");
        const std::string end = R"(end="a)";
        return std::stod(session.substr(session.find(end, range) + end.size())) / 282'240'000.0;
    }

    Velmark::Counted<cadrel::host::Host> host = Velmark::makeCounted<cadrel::host::Host>(application.context());
    const standin::tests::SessionText text{.locations =
                                               standin::tests::location(61, "session", 0, 192000, "IsSessionRange"),
                                           .regions = standin::tests::region(51, 0, 192000)};
    OpenDocument& document = documents.open(folder.write("reel.ardour", std::string(text)));
};

TEST_F(HostedSessionTest, EndsLaterWhenNewPictureAtTheEndMakesTheProgrammeLonger)
{
    EXPECT_EQ(endAfterRun("00:00:04:00", "00:00:06:00"), 6.0);
}

TEST_F(HostedSessionTest, EndsEarlierWhenTheProgrammeHasBecomeShorter)
{
    EXPECT_EQ(endAfterRun("00:00:03:00", "00:00:03:00"), 3.0);
}

TEST_F(HostedSessionTest, EndsWhereItDidWhenNewPictureTakesThePlaceOfTheLastSound)
{
    EXPECT_EQ(endAfterRun("00:00:02:00", "00:00:04:00"), 4.0);
}

TEST_F(HostedSessionTest, EndsWhereItDidAfterTheUndoOfARun)
{
    ASSERT_EQ(endAfterRun("00:00:04:00", "00:00:06:00"), 6.0);
    ASSERT_TRUE(document.goToUndoPosition(0));
    ASSERT_TRUE(documents.save(document).isSaved());
    EXPECT_EQ(savedEnd(), 4.0);
}

TEST_F(HostedSessionTest, EndsWhereItDidAfterAPreview)
{
    host->setPreviewActive(true);
    ASSERT_TRUE(documents.save(document).isSaved());
    EXPECT_EQ(savedEnd(), 4.0);
    host->setPreviewActive(false);
    ASSERT_TRUE(documents.save(document).isSaved());
    EXPECT_EQ(savedEnd(), 4.0);
}

} // namespace desktop::tests
