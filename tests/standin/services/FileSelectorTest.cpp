// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/FileSelector.h"

#include "standin/base/FilePath.h"
#include "standin/base/ObjectList.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

class FileSelectorTest : public testing::Test {
protected:
    int32 open()
    {
        return selector->select(u"Add EDL", nullptr, 0, 0, folder.get(), IFileSelector::Open, chosen.get());
    }

    std::vector<std::u16string> chosenFiles()
    {
        std::vector<std::u16string> files;
        for (int32 index = 0; index < chosen->count(); ++index) {
            char16_t buffer[IFilePath::Capacity] = {};
            query<IFilePath>(chosen->at(index))->getPath(buffer);
            files.emplace_back(buffer);
        }
        return files;
    }

    using Files = std::vector<std::u16string>;

    Counted<FileSelector> fileSelector = makeCounted<FileSelector>();
    Counted<IFileSelector> selector = fileSelector;
    Counted<IFilePath> folder = makeCounted<FilePath>(u"/films");
    Counted<IObjectList> chosen = makeCounted<ObjectList>();
    FileType edl{"edl", "EDL files"};
};

/// A list that takes nothing.
class FullList : public Implements<FullList, FObject, IObjectList> {
public:
    static constexpr const char* ClassName = "FullList";

    int32 add(FUnknown*, int32) override { return ResultFalse; }
    int32 count() override { return 0; }
    FUnknown* at(int32) override { return nullptr; }
};

} // namespace

TEST_F(FileSelectorTest, IsCancelledWithoutAChoice)
{
    EXPECT_EQ(open(), IFileSelector::Cancelled);
    EXPECT_EQ(chosenFiles(), Files{});
}

TEST_F(FileSelectorTest, AnswersOneChoiceAfterTheOther)
{
    fileSelector->choose({u"/films/a.edl", u"/films/b.edl"});
    fileSelector->choose({});
    fileSelector->choose({u"/films/c.edl"});

    EXPECT_EQ(open(), ResultOk);
    EXPECT_EQ(chosenFiles(), (Files{u"/films/a.edl", u"/films/b.edl"}));
    EXPECT_EQ(open(), IFileSelector::Cancelled) << "Nothing was chosen in this box.";
    EXPECT_EQ(open(), ResultOk);
    EXPECT_EQ(chosenFiles(), (Files{u"/films/a.edl", u"/films/b.edl", u"/films/c.edl"}));
    EXPECT_EQ(open(), IFileSelector::Cancelled);
}

TEST_F(FileSelectorTest, TakesFiltersAndBothKindsOfBoxes)
{
    fileSelector->choose({u"/films/new.edl"});

    EXPECT_EQ(selector->select(nullptr, &edl, 1, 1, folder.get(), IFileSelector::Save, chosen.get()), ResultOk);
    EXPECT_EQ(chosenFiles(), Files{u"/films/new.edl"});
}

TEST_F(FileSelectorTest, FailsForArgumentsThatMakeNoBoxAndKeepsTheChoice)
{
    fileSelector->choose({u"/films/a.edl"});
    const auto select = [&](const FileType* filters, int32 count, int32 sameCount, IFilePath* path, int32 flags,
                            IObjectList* list) {
        return selector->select(u"", filters, count, sameCount, path, flags, list);
    };

    EXPECT_EQ(select(nullptr, 1, 1, folder.get(), 0, chosen.get()), FileSelector::Failed);
    EXPECT_EQ(select(&edl, 1, 2, folder.get(), 0, chosen.get()), FileSelector::Failed);
    EXPECT_EQ(select(&edl, -1, -1, folder.get(), 0, chosen.get()), FileSelector::Failed);
    EXPECT_EQ(select(&edl, 1, 1, nullptr, 0, chosen.get()), FileSelector::Failed);
    EXPECT_EQ(select(&edl, 1, 1, folder.get(), 1, chosen.get()), FileSelector::Failed);
    EXPECT_EQ(select(&edl, 1, 1, folder.get(), 0, nullptr), FileSelector::Failed);
    EXPECT_EQ(chosenFiles(), Files{});

    EXPECT_EQ(open(), ResultOk);
    EXPECT_EQ(chosenFiles(), Files{u"/films/a.edl"});
}

TEST_F(FileSelectorTest, FailsWhenTheListTakesNothing)
{
    fileSelector->choose({u"/films/a.edl"});
    const auto full = makeCounted<FullList>();

    EXPECT_EQ(selector->select(u"", nullptr, 0, 0, folder.get(), 0, full.get()), FileSelector::Failed);
}

} // namespace standin::tests
