// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/FileBrowserDialog.h"

#include "standin/Application.h"
#include "standin/base/FilePath.h"
#include "standin/base/ObjectList.h"
#include "standin/services/FileSelector.h"
#include "tests/support/PlainConverter.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AlteredContext.h"
#include "util/StringUtil.h"
#include "velmark/Editing.h"
#include "velmark/Media.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::PlainConverter;
using cadrel::tests::thrownBy;
using gui::FileBrowserDialogBase;
using standin::FilePath;
using standin::ObjectList;
using util::Result;
using util::StringUtil;

using Paths = std::vector<std::string>;

/// A field of a record, with all its bytes.
template <std::size_t Size>
std::string_view bytesOf(const char (&field)[Size])
{
    return {field, Size};
}

/// The text, and zeroes up to the size of its field.
std::string padded(std::string text, std::size_t size)
{
    text.resize(size, '\0');
    return text;
}

/// File boxes that keep what they were given, choose what the test wants and answer what it wants.
class RecordingSelector : public Implements<RecordingSelector, FObject, IFileSelector> {
public:
    static constexpr const char* ClassName = "RecordingSelector";

    std::vector<Counted<FObject>> choice;
    int32 answer = ResultOk;

    std::u16string title;
    std::optional<FileType> filter;
    int32 filterCount = -1;
    int32 sameCount = -1;
    std::u16string folder;
    int32 flags = -1;

    int32 select(const char16_t* boxTitle, const FileType* filters, int32 count, int32 secondCount, IFilePath* path,
                 int32 boxFlags, IObjectList* chosen) override
    {
        title = boxTitle;
        filter = filters ? std::optional<FileType>(*filters) : std::nullopt;
        filterCount = count;
        sameCount = secondCount;
        char16_t buffer[IFilePath::Capacity] = {};
        path->getPath(buffer);
        folder = buffer;
        flags = boxFlags;
        for (const auto& file : choice)
            chosen->add(file.get(), 0);
        return answer;
    }
};

/// A path that can't be had.
class LostPath : public Implements<LostPath, FObject, IFilePath> {
public:
    static constexpr const char* ClassName = "LostPath";

    int32 setPath(const char16_t*, int32) override { return ResultFalse; }
    int32 getPath(char16_t*) override { return ResultFalse; }
};

/// A list whose elements are gone when they are asked for.
class HollowList : public Implements<HollowList, FObject, IObjectList> {
public:
    static constexpr const char* ClassName = "HollowList";

    int32 add(FUnknown*, int32) override { return ResultOk; }
    int32 count() override { return 1; }
    FUnknown* at(int32) override { return nullptr; }
};

class FileBrowserDialogTest : public testing::Test {
protected:
    FileBrowserDialogTest() { StringUtil::setConverter(&converter); }
    ~FileBrowserDialogTest() override
    {
        FileBrowserDialog::uninstall();
        StringUtil::setConverter(nullptr);
    }

    void browse() { dialog.browse(L"Add EDL to Old List", L"/films", L"edl", L"Edit Decision List", false, results); }
    /// From now on the boxes are the test's own.
    RecordingSelector& record()
    {
        const auto selector = makeCounted<RecordingSelector>();
        context.replace(IFileSelector::iid, selector);
        return *selector;
    }

    PlainConverter converter;
    standin::Application application;
    AlteredContext context{application.context()};
    FileBrowserDialog dialog{&context};
    Paths results{"/films/old.edl"};
};

} // namespace

TEST_F(FileBrowserDialogTest, AppendsTheChosenPathsInTheirOrder)
{
    application.fileSelector().choose({u"/films/reel 2.edl", u"/films/r\u00e9el 1.edl"});

    browse();

    EXPECT_EQ(results, (Paths{"/films/old.edl", "/films/reel 2.edl",
                              "/films/r\xC3\xA9"
                              "el 1.edl"}));
}

TEST_F(FileBrowserDialogTest, LeavesTheResultsAsTheyWereWhenTheUserCancels)
{
    application.fileSelector().choose({});

    EXPECT_NO_THROW(browse());

    EXPECT_EQ(results, Paths{"/films/old.edl"});
}

TEST_F(FileBrowserDialogTest, DoesntTakeWhatACancelledBoxHasChosen)
{
    RecordingSelector& selector = record();
    selector.choice = {makeCounted<FilePath>(u"/films/new.edl")};
    selector.answer = IFileSelector::Cancelled;

    browse();

    EXPECT_EQ(results, Paths{"/films/old.edl"});
}

TEST_F(FileBrowserDialogTest, GivesTheHostItsTitleItsFolderAndOneFilter)
{
    const RecordingSelector& selector = record();

    browse();

    EXPECT_EQ(selector.title, u"Add EDL to Old List");
    EXPECT_EQ(selector.folder, u"/films");
    EXPECT_EQ(selector.filterCount, 1);
    EXPECT_EQ(selector.sameCount, 1);
    EXPECT_EQ(selector.flags, 0);
    ASSERT_TRUE(selector.filter);
    EXPECT_EQ(bytesOf(selector.filter->extension), padded("edl", 8));
    EXPECT_EQ(bytesOf(selector.filter->description), padded("Edit Decision List", 64));
}

TEST_F(FileBrowserDialogTest, OpensABoxForSavingWithTheFlagFour)
{
    const RecordingSelector& selector = record();

    dialog.browse(L"Save Change EDL", L"/films", L"edl", L"Edit Decision List", true, results);

    EXPECT_EQ(selector.flags, 4);
}

TEST_F(FileBrowserDialogTest, HasNoFilterWithoutAnExtension)
{
    const RecordingSelector& selector = record();

    dialog.browse(L"Choose", L"", L"", L"Every file", false, results);

    EXPECT_FALSE(selector.filter);
    EXPECT_EQ(selector.filterCount, 0);
    EXPECT_EQ(selector.sameCount, 0);
    EXPECT_EQ(selector.folder, u"");
}

TEST_F(FileBrowserDialogTest, CutsAnExtensionToSevenBytesAndAZero)
{
    const RecordingSelector& selector = record();
    const auto extensionFor = [&](const std::wstring& extension) {
        dialog.browse(L"", L"", extension, L"", false, results);
        return std::string(bytesOf(selector.filter->extension));
    };

    EXPECT_EQ(extensionFor(L"1234567"), padded("1234567", 8));
    EXPECT_EQ(extensionFor(L"12345678"), padded("1234567", 8));
    EXPECT_EQ(extensionFor(L"123456789"), padded("1234567", 8));
}

TEST_F(FileBrowserDialogTest, CutsADescriptionToSixtyThreeBytesAndAZero)
{
    const RecordingSelector& selector = record();

    dialog.browse(L"", L"", L"edl", std::wstring(64, L'd'), false, results);

    EXPECT_EQ(bytesOf(selector.filter->description), padded(std::string(63, 'd'), 64));
}

TEST_F(FileBrowserDialogTest, CutsBetweenCharacters)
{
    const RecordingSelector& selector = record();
    const auto extensionFor = [&](const std::wstring& extension) {
        dialog.browse(L"", L"", extension, L"", false, results);
        return std::string(bytesOf(selector.filter->extension));
    };

    // The last character has two bytes and would end with the eighth, then with the seventh.
    EXPECT_EQ(extensionFor(L"123456\u00e9"), padded("123456", 8));
    EXPECT_EQ(extensionFor(L"12345\u00e9"), padded("12345\xC3\xA9", 8));
    // Four bytes, of which three would fit.
    EXPECT_EQ(extensionFor(L"1234\U0001F3AC"), padded("1234", 8));
}

TEST_F(FileBrowserDialogTest, OpensTheBoxEvenWhenTheHostCantTakeTheFolder)
{
    const RecordingSelector& selector = record();

    dialog.browse(L"Choose", std::wstring(1025, L'f'), L"", L"", false, results);

    EXPECT_EQ(selector.title, u"Choose");
    EXPECT_EQ(selector.folder, u"");
}

TEST_F(FileBrowserDialogTest, TakesTheLongestPathThatTheHostCanGive)
{
    application.fileSelector().choose({std::u16string(1024, u'p')});

    browse();

    EXPECT_EQ(results, (Paths{"/films/old.edl", std::string(1024, 'p')}));
}

TEST_F(FileBrowserDialogTest, IsNotAvailableWithoutAnythingThatItNeedsOfTheHost)
{
    for (const Identifier& id :
         {Identifier(IFileSelector::iid), Identifier(IFilePath::iid), Identifier(IObjectList::iid)}) {
        AlteredContext lacking(application.context());
        lacking.hide(id);
        application.fileSelector().choose({u"/films/new.edl"});
        FileBrowserDialog boxes(&lacking);

        EXPECT_EQ(thrownBy([&] { boxes.browse(L"", L"", L"edl", L"", false, results); }), Result::NotAvailable);
    }
    EXPECT_EQ(results, Paths{"/films/old.edl"});
}

TEST_F(FileBrowserDialogTest, IsNotAvailableWhenTheBoxFails)
{
    RecordingSelector& selector = record();
    selector.choice = {makeCounted<FilePath>(u"/films/new.edl")};
    for (const int32 failure : {2, 3, -1}) {
        selector.answer = failure;

        EXPECT_EQ(thrownBy([&] { browse(); }), Result::NotAvailable) << failure;
    }
    EXPECT_EQ(results, Paths{"/films/old.edl"});
}

TEST_F(FileBrowserDialogTest, TakesNoneOfThePathsWhenOneCantBeHad)
{
    RecordingSelector& selector = record();

    selector.choice = {makeCounted<FilePath>(u"/films/new.edl"), makeCounted<LostPath>()};
    EXPECT_EQ(thrownBy([&] { browse(); }), Result::HostCallFailed);
    selector.choice = {makeCounted<FilePath>(u"/films/new.edl"), makeCounted<ObjectList>()};
    EXPECT_EQ(thrownBy([&] { browse(); }), Result::HostObjectMissing) << "A list is no path.";
    context.replace(IObjectList::iid, makeCounted<HollowList>());
    EXPECT_EQ(thrownBy([&] { browse(); }), Result::HostObjectMissing);

    EXPECT_EQ(results, Paths{"/films/old.edl"});
}

TEST_F(FileBrowserDialogTest, IsReachedByTheWholeProcessWhileItIsInstalled)
{
    EXPECT_EQ(thrownBy([] { FileBrowserDialogBase::instance(); }), Result::NotAvailable);

    FileBrowserDialog::install(&context);
    application.fileSelector().choose({u"/films/new.edl"});
    FileBrowserDialogBase::instance().browse(L"", L"", L"", L"", false, results);
    FileBrowserDialog::uninstall();

    EXPECT_EQ(results, (Paths{"/films/old.edl", "/films/new.edl"}));
    EXPECT_EQ(thrownBy([] { FileBrowserDialogBase::instance(); }), Result::NotAvailable);
}

TEST_F(FileBrowserDialogTest, IsInstalledOnceAtATime)
{
    AlteredContext lacking(application.context());
    lacking.hide(IFileSelector::iid);
    FileBrowserDialog::install(&context);

    EXPECT_EQ(thrownBy([&] { FileBrowserDialog::install(&lacking); }), Result::NotAvailable);

    EXPECT_NO_THROW(FileBrowserDialogBase::instance().browse(L"", L"", L"", L"", false, results)) << "The first stays.";
}

} // namespace cadrel::host::tests
