// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/StringTranslator.h"

#include "standin/Application.h"
#include "standin/services/Translations.h"
#include "tests/support/TempFolder.h"
#include "tests/support/host/AlteredContext.h"
#include "util/StringUtil.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

#include <string>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::TempFolder;
using util::StringUtil;

/// A host whose user reads German, and the translator on it.
class StringTranslatorTest : public testing::Test {
protected:
    StringTranslatorTest()
    {
        folder.write("translation.xml", R"xml(<?xml version="1.0" encoding="UTF-8"?>
<translations>
    <language name="de">
        <text source="Preview">Vorschau</text>
        <text source="Apply Cadrel (incomplete)">Cadrel anwenden (unvollständig)</text>
        <text source="Memo 📌">Notiz 🎬</text>
    </language>
</translations>
)xml");
        application.translations().addTable(path.data(), "translation.xml", "Cadrel");
        application.translations().setLanguage("de");
    }

    TempFolder folder;
    std::string path = folder.path().string();
    standin::Application application;
    AlteredContext context{application.context()};
    StringTranslator translator{&context};
};

/// A service that has lost its tables.
class NullTranslations : public Implements<NullTranslations, FObject, ITranslationService> {
public:
    static constexpr const char* ClassName = "NullTranslations";

    int32 addTable(BundleHandle, const char*, const char*) override { return ResultOk; }
    const char16_t* translate(const char16_t*) override { return nullptr; }
};

} // namespace

TEST_F(StringTranslatorTest, GivesTheTextInTheLanguageOfTheHostsUser)
{
    EXPECT_EQ(translator.translate(L"Preview"), L"Vorschau");
    EXPECT_EQ(translator.translate(L"Apply Cadrel (incomplete)"), L"Cadrel anwenden (unvollst\u00e4ndig)");
    EXPECT_EQ(translator.translate(L"Memo \U0001F4CC"), L"Notiz \U0001F3AC")
        << "These characters are pairs in the host's texts.";
}

TEST_F(StringTranslatorTest, LeavesATextThatTheHostDoesntKnowAsItIs)
{
    EXPECT_EQ(translator.translate(L"Overlap"), L"Overlap");
    EXPECT_EQ(translator.translate(L""), L"");
}

TEST_F(StringTranslatorTest, ShowsThatATextIsNoneThatTheHostCouldBeAskedFor)
{
    const std::wstring illFormed = {L'a', static_cast<wchar_t>(0xD800), L'b'};

    EXPECT_EQ(translator.translate(illFormed), L"<StrErr_2>");
    context.hide(ITranslationService::iid);
    EXPECT_EQ(translator.translate(illFormed), illFormed) << "Nobody is asked.";
}

TEST_F(StringTranslatorTest, GivesTheHostsOwnFormForTheHostsCalls)
{
    const char16_t* const unknown = u"Overlap";

    EXPECT_EQ(std::u16string(translator.translate(u"Preview")), u"Vorschau");
    EXPECT_EQ(translator.translate(unknown), unknown);
}

TEST_F(StringTranslatorTest, LeavesEveryTextAsItIsWithoutTheService)
{
    const char16_t* const name = u"Preview";

    context.hide(ITranslationService::iid);

    EXPECT_EQ(translator.translate(L"Preview"), L"Preview");
    EXPECT_EQ(translator.translate(name), name);
}

TEST_F(StringTranslatorTest, LeavesEveryTextAsItIsWhenTheServiceAnswersNothing)
{
    context.replace(ITranslationService::iid, makeCounted<NullTranslations>());

    EXPECT_EQ(translator.translate(L"Preview"), L"Preview");
    EXPECT_EQ(std::u16string(translator.translate(u"Preview")), u"Preview");
}

TEST_F(StringTranslatorTest, ServesTheProcessAsItsConverter)
{
    StringUtil::setConverter(&translator);

    EXPECT_EQ(StringUtil::translate(L"Preview"), L"Vorschau");
    EXPECT_EQ(StringUtil::toUtf8(L"M\u00fcller"), "M\xC3\xBCller");
    EXPECT_EQ(StringUtil::toWide("M\xC3\xBCller"), L"M\u00fcller");

    StringUtil::setConverter(nullptr);
}

} // namespace cadrel::host::tests
