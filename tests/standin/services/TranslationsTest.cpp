// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/Translations.h"

#include "tests/support/TempFolder.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <string>

using namespace Velmark;
using cadrel::tests::TempFolder;

namespace standin::tests {

namespace {

class TranslationsTest : public testing::Test {
protected:
    TranslationsTest() { table->setLanguage("de"); }

    int32 add(const std::string& content)
    {
        folder.write("translation.xml", content);
        return translations->addTable(bundle(), "translation.xml", "Cadrel");
    }
    /// The bundle handle of a module with its resources in the folder.
    BundleHandle bundle() { return path.data(); }
    std::u16string translate(const char16_t* text) { return translations->translate(text); }

    TempFolder folder;
    std::string path = folder.path().string();
    Counted<Translations> table = makeCounted<Translations>();
    Counted<ITranslationService> translations = table;
};

const std::string Small = R"(<?xml version="1.0" encoding="UTF-8"?>
<translations>
    <!-- What the undo list shows. -->
    <language name="de">
        <text source="Preview">Vorschau</text>
        <text source="Start &amp; stop">Läuft &#x1F600;</text>
    </language>
    <language name="fr">
        <text source="Preview">Aperçu</text>
    </language>
</translations>
)";

} // namespace

TEST_F(TranslationsTest, GivesTheTextsOfTheChosenLanguage)
{
    EXPECT_EQ(add(Small), ResultOk);

    EXPECT_EQ(translate(u"Preview"), u"Vorschau");
    EXPECT_EQ(translate(u"Start & stop"), u"Läuft 😀");
    table->setLanguage("fr");
    EXPECT_EQ(translate(u"Preview"), u"Aperçu");
}

TEST_F(TranslationsTest, GivesBackTheVeryTextThatItHasnt)
{
    add(Small);
    const char16_t* const unknown = u"Undo";

    EXPECT_EQ(translations->translate(unknown), unknown);
    EXPECT_EQ(translations->translate(nullptr), nullptr);

    table->setLanguage("fr");
    const char16_t* const untranslated = u"Start & stop";
    EXPECT_EQ(translations->translate(untranslated), untranslated);
    table->setLanguage("it");
    const char16_t* const known = u"Preview";
    EXPECT_EQ(translations->translate(known), known);
}

TEST_F(TranslationsTest, LeavesTextsAloneUntilALanguageIsChosen)
{
    const auto fresh = makeCounted<Translations>();
    folder.write("translation.xml", Small);
    const char16_t* const text = u"Preview";

    EXPECT_EQ(fresh->addTable(bundle(), "translation.xml", "Cadrel"), ResultOk);
    EXPECT_EQ(fresh->translate(text), text);
}

TEST_F(TranslationsTest, ReadsTextsToTheLetter)
{
    EXPECT_EQ(add("<translations><language name='de'>"
                  "<text source='One&#10;two'> eins\r\nzwei </text>"
                  "<text source='Both'>bei<!-- and -->de <![CDATA[<3]]></text>"
                  "<text source='Empty'></text>"
                  "<text source='Apart'>eins<!-- and --> <![CDATA[zwei]]></text>"
                  "<text source='Blank'> </text>"
                  "<text source='\uFEFFMarked'>\uFEFF</text>"
                  "</language></translations>"),
              ResultOk);

    EXPECT_EQ(translate(u"One\ntwo"), u" eins\nzwei ");
    EXPECT_EQ(translate(u"Both"), u"beide <3");
    EXPECT_EQ(translate(u"Empty"), u"Empty");
    EXPECT_EQ(translate(u"Apart"), u"eins zwei");
    EXPECT_EQ(translate(u"Blank"), u" ");
    EXPECT_EQ(translate(u"\uFEFFMarked"), u"\uFEFF") << "A byte order mark within the table is a character.";
}

TEST_F(TranslationsTest, KeepsTheFirstTranslationAndThePointerToIt)
{
    add(Small);
    const char16_t* const first = translations->translate(u"Preview");

    EXPECT_EQ(add("<translations><language name='de'>"
                  "<text source='Preview'>Probelauf</text><text source='End'>Ende</text>"
                  "</language></translations>"),
              ResultOk);
    EXPECT_EQ(std::u16string(first), u"Vorschau");
    EXPECT_EQ(add(Small), ResultOk) << "A table may come again.";

    EXPECT_EQ(translations->translate(u"Preview"), first);
    EXPECT_EQ(std::u16string(first), u"Vorschau");
    EXPECT_EQ(translate(u"End"), u"Ende");
}

TEST_F(TranslationsTest, RefusesATableThatIsntThere)
{
    EXPECT_NE(translations->addTable(bundle(), "translation.xml", "Cadrel"), ResultOk);
    EXPECT_NE(translations->addTable(bundle(), "", "Cadrel"), ResultOk) << "This is the folder.";
    folder.write("translation.xml", Small);
    EXPECT_NE(translations->addTable(nullptr, "translation.xml", "Cadrel"), ResultOk) << "No resources, no table.";
    EXPECT_NE(translations->addTable(bundle(), nullptr, "Cadrel"), ResultOk);

    EXPECT_EQ(translate(u"Preview"), u"Preview");
    EXPECT_EQ(translations->addTable(bundle(), "translation.xml", nullptr), ResultOk) << "The domain doesn't count.";
}

TEST_F(TranslationsTest, RefusesABrokenTableAsAWhole)
{
    const std::string good = "<text source='Preview'>Vorschau</text>";
    const auto inLanguage = [](const std::string& texts) {
        return "<translations><language name='de'>" + texts + "</language></translations>";
    };
    ASSERT_EQ(add(inLanguage("<text source='End'>Ende</text>")), ResultOk);

    EXPECT_NE(add(""), ResultOk);
    EXPECT_NE(add("Vorschau"), ResultOk);
    EXPECT_NE(add("<translations><language name='de'>" + good), ResultOk) << "Cut off.";
    EXPECT_NE(add("<texts>" + good + "</texts>"), ResultOk);
    EXPECT_NE(add(inLanguage(good) + "<more/>"), ResultOk);
    EXPECT_NE(add("<translations><language>" + good + "</language></translations>"), ResultOk) << "No name.";
    EXPECT_NE(add("<translations><language name=''>" + good + "</language></translations>"), ResultOk);
    EXPECT_NE(add("<translations>" + good + "</translations>"), ResultOk) << "In no language.";
    EXPECT_NE(add(inLanguage(good + "<text>Ende</text>")), ResultOk) << "No source.";
    EXPECT_NE(add(inLanguage(good + "<note>Ende</note>")), ResultOk);
    EXPECT_NE(add(inLanguage(good + "Ende")), ResultOk);
    EXPECT_NE(add(inLanguage(good + "<text source='A'>very <b>loud</b></text>")), ResultOk);
    EXPECT_NE(add(inLanguage(good + "<text source='A'>L\xe4uft</text>")), ResultOk) << "No UTF-8.";
    EXPECT_NE(add(inLanguage(good + "<text source='L\xe4uft'>runs</text>")), ResultOk);
    EXPECT_NE(
        add("<?xml version='1.0' encoding='ISO-8859-1'?>" + inLanguage(good + "<text source='A'>L\xe4uft</text>")),
        ResultOk)
        << "Whatever it says of itself.";

    EXPECT_EQ(translate(u"Preview"), u"Preview");
    EXPECT_EQ(translate(u"End"), u"Ende") << "What was read before stays.";
}

} // namespace standin::tests
