// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"

#include <cstddef>
#include <gtest/gtest.h>
#include <map>
#include <regex>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;

/// What programs show of a PDF, a line each.
std::string propertiesOf(const std::string& file)
{
    const Outcome outcome = runProgram("pdfinfo", {file});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return outcome.out;
}

/// The film with so many shots after it, of those names.
std::string withShots(const std::vector<std::string>& names)
{
    std::string text = oldCut();
    for (std::size_t shot = 0; shot < names.size(); ++shot)
        text += cut("01" + std::to_string(shot), "B00" + std::to_string(shot), "05:00:00:00 05:00:01:00",
                    secondsOn(30 + static_cast<int>(shot)) + " " + secondsOn(31 + static_cast<int>(shot))) +
                clipName(names[shot]);
    return text;
}

TEST(NotesPdf, NamesInOtherScriptsAreWholeInItsText)
{
    const std::vector<std::string> names{"海岸の場面 12A", "مشهد البحر", "Сцена на мосту", "Étude in Köln", "😀 take"};
    const Cuts film(oldCut(), withShots(names));

    film.file(".pdf");

    // The program that reads it puts marks around what is written from right to left.
    const std::regex marks("\xE2\x80[\xAB\xAC]");
    const std::string text = std::regex_replace(unbroken(textOfPdf(film.folder / "notes.pdf")), marks, "");
    for (const std::string& name : names)
        EXPECT_NE(text.find(name + ": inserted 00:00:01:00"), std::string::npos) << name << "\n" << text;
}

TEST(NotesPdf, ALetterThatNoFontHasStandsAsItsNumber)
{
    // The last letter for private use, of which no font knows the picture.
    const Cuts film(oldCut(), withShots({"BOAT \xF4\x8F\xBF\xBD 7"}));

    film.file(".pdf");

    const std::string text = textOfPdf(film.folder / "notes.pdf");
    EXPECT_NE(text.find("BOAT [U+10FFFD] 7: inserted"), std::string::npos) << text;
}

TEST(NotesPdf, ALongNameOfAnotherScriptIsCutBetweenLetters)
{
    std::string name;
    for (int letter = 0; letter < 40; ++letter)
        name += "海";
    const Cuts film(oldCut(), withShots({name}));

    film.file(".pdf");

    // A name has 48 columns, of which a Chinese character takes two.
    const std::string text = textOfPdf(film.folder / "notes.pdf");
    EXPECT_TRUE(std::regex_search(text, std::regex("(海)+…: inserted"))) << text;
}

TEST(NotesPdf, TheTitlesOfBothCutsStandInItsHeadAndItsProperties)
{
    const Cuts film("TITLE:   REEL 3 PICTURE v07\n" + oldCut(), "TITLE: Größe & Höhe\n" + newCut());

    film.file(".pdf");

    const std::string properties = propertiesOf(film.folder / "notes.pdf");
    const std::string text = unbroken(textOfPdf(film.folder / "notes.pdf"));
    EXPECT_NE(properties.find("Change notes: REEL 3 PICTURE v07 to Größe & Höhe\n"), std::string::npos) << properties;
    EXPECT_NE(properties.find("Old cut old.edl, new cut new.edl\n"), std::string::npos) << properties;
    EXPECT_EQ(properties.find("Author"), std::string::npos) << properties;
    EXPECT_TRUE(text.starts_with("Change notes REEL 3 PICTURE v07 to Größe & Höhe Old cut: old.edl: ")) << text;
}

TEST(NotesPdf, FilesWithoutATitleAreCalledByTheirNames)
{
    const std::string shot = cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const Cuts film(shot, "TITLE:\n" + shot);

    film.file(".pdf", {"--rate", "24 fps"});

    const std::string text = unbroken(textOfPdf(film.folder / "notes.pdf"));
    EXPECT_TRUE(text.starts_with("Change notes old.edl to new.edl Old cut: ")) << text;
}

TEST(NotesPdf, OfSeveralTitlesTheFirstAndTheLastStandInTheHead)
{
    const TempFolder folder;
    const auto reel = [&folder](const std::string& hour, const std::string& title) {
        return folder.write(hour + title + ".edl", "TITLE: " + title + "\n" +
                                                       cut("001", "A0" + hour, "10:00:00:00 10:00:10:00",
                                                           hour + ":00:00:00 " + hour + ":00:10:00"));
    };

    const std::string file = folder / "notes.pdf";
    const Outcome outcome =
        runCadrel({"notes", "--old", reel("01", "ONE"), reel("02", "TWO"), reel("03", "THREE"), "--new",
                   reel("01", "SAME"), reel("02", "SAME"), reel("03", "SAME"), "--rate", "24 fps", "-o", file});

    // The files of the new cut have other names, and the same title.
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    const std::string text = unbroken(textOfPdf(file));
    EXPECT_TRUE(text.starts_with("Change notes ONE ... THREE to SAME Old cut: ")) << text;
}

/// The colours of the starts of reels in the list of reels, from above.
std::vector<std::string> coloursInListOfReels(const std::string& file)
{
    const Outcome outcome = runProgram("pdftohtml", {"-xml", "-stdout", "-i", file});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    static const std::regex Font("<fontspec id=\"([0-9]+)\"[^>]*color=\"(#[0-9a-f]{6})\"");
    static const std::regex Text("<text top=\"([0-9]+)\"[^>]*font=\"([0-9]+)\">(.*)</text>");
    const std::sregex_iterator end;
    std::map<std::string, std::string> colours;
    for (std::sregex_iterator match(outcome.out.begin(), outcome.out.end(), Font); match != end; ++match)
        colours[(*match)[1]] = (*match)[2];
    int first = 0;
    int last = 0;
    for (std::sregex_iterator match(outcome.out.begin(), outcome.out.end(), Text); match != end; ++match) {
        if ((*match)[3] == "<b>The reels</b>")
            first = std::stoi((*match)[1]);
        if ((*match)[3] == "<b>Reel 1, 01:00:00:00</b>")
            last = std::stoi((*match)[1]);
    }
    std::map<int, std::string> fromAbove;
    for (std::sregex_iterator match(outcome.out.begin(), outcome.out.end(), Text); match != end; ++match) {
        const int top = std::stoi((*match)[1]);
        if (top > first && top < last && (*match)[3].str().find(":00:00:00") != std::string::npos)
            fromAbove[top] = colours[(*match)[2]];
    }
    std::vector<std::string> inOrder;
    for (const auto& [top, colour] : fromAbove)
        inOrder.push_back(colour);
    return inOrder;
}

TEST(NotesPdf, OnlyAReelWhereNothingHasChangedIsGrey)
{
    const auto reels = [](bool isMoved) {
        return cut("001", "ONE", "10:00:00:00 10:00:20:00", "01:00:00:00 01:00:20:00") +
               cut("002", "MOVED", "10:00:00:00 10:00:10:00",
                   isMoved ? "01:00:20:00 01:00:30:00" : "02:00:20:00 02:00:30:00") +
               cut("003", "TWO", "10:00:00:00 10:00:20:00", "02:00:00:00 02:00:20:00") +
               cut("004", "THREE", "10:00:00:00 10:00:20:00", "03:00:00:00 03:00:20:00");
    };
    const Cuts film(reels(false), reels(true));

    film.file(".pdf", {"--rate", "24 fps"});

    // The second reel has no step of its own, and has lost a shot. Ink is 11, 12 and 13 hundredths of 255, and grey 42, 45
    // and 48 hundredths, each without what is less than 1.
    EXPECT_EQ(coloursInListOfReels(film.folder / "notes.pdf"),
              (std::vector<std::string>{"#1c1e21", "#1c1e21", "#6b727a"}));
}

/// The shots of `manyShots`, the last one first.
std::string shotsInReverse(int count)
{
    std::string text;
    for (int shot = 0; shot < count; ++shot)
        text += cut("001", std::string("R").append(std::to_string(count - 1 - shot)), "10:00:00:12 10:00:01:12",
                    secondsOn(shot) + " " + secondsOn(shot + 1));
    return text;
}

TEST(NotesPdf, OfMoreBandsThanThePaperHasDotsTheLongestAreDrawn)
{
    const auto textOf = [](int shots) {
        const Cuts film(manyShots(shots), shotsInReverse(shots));
        film.file(".pdf", {"--rate", "24 fps"});
        return unbroken(textOfPdf(film.folder / "notes.pdf"));
    };

    EXPECT_EQ(textOf(4000).find(" longest"), std::string::npos);
    EXPECT_NE(textOf(4001).find("new cut, the 4000 longest of 4001 bands kept moved"), std::string::npos);
}

TEST(NotesPdf, TheSameNotesAreTheSameFileWhateverTheTime)
{
    const Cuts film(oldCut(), newCut());

    const std::string pdf = film.file(".pdf");

    EXPECT_EQ(propertiesOf(film.folder / "notes.pdf").find("Date"), std::string::npos);
    EXPECT_EQ(film.file(".pdf", {"--overwrite"}), pdf);
}

} // namespace
