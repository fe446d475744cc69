// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/AlertService.h"
#include "standin/services/FileSelector.h"
#include "standin/services/ProgressService.h"

#include "standin/base/FilePath.h"
#include "standin/base/ObjectList.h"
#include "tests/support/standin/FakeBoxes.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace Velmark;

namespace standin::tests {

namespace {

/// The services of a host with windows, which write nothing on its terminal.
class UserBoxesTest : public testing::Test {
protected:
    UserBoxesTest()
    {
        alerts->setBoxes(&boxes);
        files->setBoxes(&boxes);
        progress->setBoxes(&boxes);
    }
    ~UserBoxesTest() override { EXPECT_EQ(out.str(), ""); }

    FakeBoxes boxes;
    std::ostringstream out;
    Terminal terminal{out, true};
    Counted<AlertService> alerts = makeCounted<AlertService>(terminal);
    Counted<FileSelector> files = makeCounted<FileSelector>();
    Counted<ProgressService> progress = makeCounted<ProgressService>(terminal);
    bool cancelled = false;
};

} // namespace

TEST_F(UserBoxesTest, AnswerWhichButtonOfAnAlertWasUsed)
{
    boxes.answers = {u"No", u"Cancel"};
    EXPECT_EQ(alerts->show(u"Overwrite?", u"Yes", u"No", nullptr), 2);
    EXPECT_EQ(alerts->show(u"Overwrite?", nullptr, u"No", u"Cancel"), 3) << "Buttons that are left out count.";
    EXPECT_EQ(boxes.messages, (std::vector<std::u16string>{u"Overwrite?", u"Overwrite?"}));
}

TEST_F(UserBoxesTest, HaveAButtonOfTheHostWhereAnAlertNamesNone)
{
    boxes.answers = {u"OK"};
    EXPECT_EQ(alerts->show(u"An error occurred.", nullptr, nullptr, nullptr), 1);
    EXPECT_EQ(alerts->show(nullptr, u"Yes", nullptr, nullptr), 0) << "An alert without a message isn't shown.";
    EXPECT_EQ(boxes.messages.size(), 1U);
}

TEST_F(UserBoxesTest, AreAskedForFilesAsTheModuleWantsThem)
{
    const FileType edl{"edl", "EDL files"};
    const Counted<IFilePath> folder = makeCounted<FilePath>(u"/films");
    const Counted<IObjectList> chosen = makeCounted<ObjectList>();
    boxes.choices = {{u"/films/a.edl", u"/films/b.edl"}};

    EXPECT_EQ(files->select(u"Add EDL", &edl, 1, 1, folder.get(), IFileSelector::Open, chosen.get()), ResultOk);
    EXPECT_EQ(chosen->count(), 2);
    EXPECT_EQ(files->select(u"Save", nullptr, 0, 0, folder.get(), IFileSelector::Save, chosen.get()),
              IFileSelector::Cancelled);
    EXPECT_EQ(chosen->count(), 2);

    ASSERT_EQ(boxes.questions.size(), 2U);
    EXPECT_EQ(boxes.questions[0].title, u"Add EDL");
    EXPECT_EQ(boxes.questions[0].folder, u"/films");
    ASSERT_EQ(boxes.questions[0].filters.size(), 1U);
    EXPECT_EQ(boxes.questions[0].filters[0].extension, "edl");
    EXPECT_EQ(boxes.questions[0].filters[0].description, "EDL files");
    EXPECT_FALSE(boxes.questions[0].isSave);
    EXPECT_TRUE(boxes.questions[1].isSave);
    EXPECT_TRUE(boxes.questions[1].filters.empty());
}

TEST_F(UserBoxesTest, AreNotOpenedForArgumentsThatDoNotFit)
{
    const Counted<IObjectList> chosen = makeCounted<ObjectList>();
    EXPECT_EQ(files->select(u"Add EDL", nullptr, 0, 0, nullptr, IFileSelector::Open, chosen.get()),
              FileSelector::Failed);
    EXPECT_TRUE(boxes.questions.empty());
}

TEST_F(UserBoxesTest, ShowProgressFromItsShowOnUntilItsEnd)
{
    progress->begin(IProgressService::Modal, u"Cadrel", &cancelled);
    progress->setRange(4);
    EXPECT_TRUE(boxes.shown.empty());
    progress->setText(u"Processing");
    progress->show();
    progress->tick(1);
    ASSERT_FALSE(boxes.shown.empty());
    EXPECT_EQ(boxes.shown.back().title, u"Cadrel");
    EXPECT_EQ(boxes.shown.back().text, u"Processing");
    EXPECT_EQ(boxes.shown.back().percentage, 25);
    EXPECT_TRUE(boxes.shown.back().canCancel);
    EXPECT_EQ(boxes.ended, 0);
    progress->end();
    EXPECT_EQ(boxes.ended, 1);
    EXPECT_FALSE(cancelled);
}

TEST_F(UserBoxesTest, CancelWhatCanBeCancelled)
{
    boxes.cancels = true;
    progress->begin(IProgressService::Modal, u"Cadrel", nullptr);
    progress->show();
    EXPECT_FALSE(boxes.shown.back().canCancel);
    progress->end();

    progress->begin(IProgressService::Modal, u"Cadrel", &cancelled);
    progress->setRange(10);
    EXPECT_FALSE(cancelled) << "Nobody can cancel what isn't seen.";
    progress->show();
    EXPECT_TRUE(cancelled);
    progress->end();
}

TEST_F(UserBoxesTest, AreNotEndedForProgressThatWasNeverShown)
{
    progress->begin(IProgressService::Modal, u"Cadrel", &cancelled);
    progress->end();
    EXPECT_EQ(boxes.ended, 0);
}

} // namespace standin::tests
