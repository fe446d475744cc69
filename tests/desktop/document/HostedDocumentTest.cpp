// SPDX-License-Identifier: GPL-3.0-or-later

// A document on which Cadrel works, with its settings and videos.

#include "core/model/DataModel.h"
#include "host/Host.h"
#include "standin/project/ClipEvent.h"
#include "tests/desktop/document/DocumentHost.h"
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

} // namespace desktop::tests
