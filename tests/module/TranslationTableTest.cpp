// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include "standin/base/Utf16.h"
#include "standin/services/Translations.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <regex>
#include <set>
#include <string>

namespace fs = std::filesystem;

namespace {

/// What is the same in every language: the beginnings of the names of markers, which the project keeps; what marks a mistake of
/// the program; what a value takes the place of; and the ends of file names.
const std::set<std::string> NotTranslated = {
    "%s", "edl", "Overlap in ", "Audio snippet in ", "Automation warning in ", "Event: ", "INVALID!",
};

/// What a German sound editor calls so too.
const std::set<std::string> SameInGerman = {"Cadrel", "OK",      "EDLs",   "IN",    "OUT",  "SRC IN", "SRC OUT",
                                            "DST IN", "DST OUT", "Normal", "Video", "Name", "SRC",    "DST"};

/// The wide texts of the sources that hold a letter: all that the user reads in the host goes out in this form.
std::set<std::string> textsOfTheSources()
{
    const std::regex literal(R"re(\b[Lu]"((?:[^"\\]|\\n)*[A-Za-z](?:[^"\\]|\\n)*)")re");
    std::set<std::string> texts;
    for (const char* const room : {"src/core", "src/gui", "src/host"}) {
        for (const auto& file : fs::recursive_directory_iterator(cadrel::tests::treePath(room))) {
            if (!file.is_regular_file())
                continue;
            const std::string source = cadrel::tests::contentOf(file.path());
            for (std::sregex_iterator found(source.begin(), source.end(), literal), end; found != end; ++found) {
                // A new line of a source and of the table.
                const std::string text = std::regex_replace((*found)[1].str(), std::regex(R"(\\n)"), "&#10;");
                if (!NotTranslated.contains(text))
                    texts.insert(text);
            }
        }
    }
    return texts;
}

std::set<std::string> textsOfTheTable()
{
    const std::string table = cadrel::tests::contentOf(cadrel::tests::treePath("resources/translation.xml"));
    const std::regex source(R"re(<text source="([^"]*)">)re");
    std::set<std::string> texts;
    for (std::sregex_iterator found(table.begin(), table.end(), source), end; found != end; ++found)
        texts.insert((*found)[1]);
    return texts;
}

} // namespace

TEST(TranslationTable, HasEachTextThatTheUserReadsAndNoOther)
{
    EXPECT_EQ(textsOfTheTable(), textsOfTheSources());
}

TEST(TranslationTable, IsReadByTheHost)
{
    const auto translations = Velmark::makeCounted<standin::Translations>();
    std::string bundle = cadrel::tests::treePath("resources");

    ASSERT_EQ(translations->addTable(bundle.data(), "translation.xml", "Cadrel"), Velmark::ResultOk);
    translations->setLanguage("de");
    for (const std::string& text : textsOfTheTable()) {
        const std::u16string source = standin::toUtf16(std::regex_replace(text, std::regex("&#10;"), "\n"));
        EXPECT_EQ(source == translations->translate(source.c_str()), SameInGerman.contains(text)) << text;
    }
}
