// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/Terminal.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>

namespace standin::tests {

namespace {

/// What a terminal with redrawable lines was sent.
std::string drawn(const std::u16string& text)
{
    std::ostringstream out;
    Terminal(out, true).drawProgress(text);
    return out.str();
}

std::string written(const std::u16string& text)
{
    std::ostringstream out;
    Terminal(out, true).writeMessage(text);
    return out.str();
}

} // namespace

TEST(Terminal, WritesAMessageAsALineOfUtf8)
{
    EXPECT_EQ(written(u"Größe 😀"), "Größe 😀\n");
    EXPECT_EQ(written(u""), "\n");
}

TEST(Terminal, KeepsTheLineBreaksOfAMessage)
{
    EXPECT_EQ(written(u"No tracks selected.\nPlease select some."), "No tracks selected.\nPlease select some.\n");
}

TEST(Terminal, LetsNoMessageControlIt)
{
    EXPECT_EQ(written(u"a\x1b[2Jb\rc\td"), "a?[2Jb?c?d\n");
    EXPECT_EQ(written(u"a\u009bb\u202ec"), "a?b?c\n")
        << "Neither the other escape nor a turn of the writing direction.";
    EXPECT_EQ(written(u"a\U000e0041b"), "a?b\n") << "An invisible tag beyond the first plane.";
    EXPECT_EQ(drawn(u"a\nb"), "\r\033[Ka?b") << "The progress is one line.";
}

TEST(Terminal, ShowsThatATextIsIllFormed)
{
    EXPECT_EQ(written(std::u16string(1, char16_t{0xD800})), "<StrErr_4>\n");
}

TEST(Terminal, DrawsTheProgressOverTheFormerOne)
{
    std::ostringstream out;
    Terminal terminal(out, true);

    terminal.drawProgress(u"first");
    terminal.drawProgress(u"second");

    EXPECT_EQ(out.str(), "\r\033[Kfirst\r\033[Ksecond");
}

TEST(Terminal, CutsTheProgressToALineByCharacters)
{
    std::u16string smiles;
    std::string shown;
    for (int count = 0; count < 100; ++count) {
        smiles += u"😀";
        shown += count < 79 ? "😀" : "";
    }

    EXPECT_EQ(drawn(smiles), "\r\033[K" + shown);
    EXPECT_EQ(drawn(std::u16string(79, u'x')), "\r\033[K" + std::string(79, 'x'));
    EXPECT_EQ(drawn(std::u16string(80, u'x')), "\r\033[K" + std::string(79, 'x'));
}

TEST(Terminal, CutsTheProgressToTheLineOfANarrowTerminal)
{
    std::ostringstream out;
    Terminal terminal(out, true, nullptr, 5);

    terminal.drawProgress(u"12345");
    terminal.drawProgress(u"123456");

    EXPECT_EQ(out.str(), "\r\033[K12345\r\033[K12345");
}

TEST(Terminal, MakesRoomForAMessage)
{
    std::ostringstream out;
    Terminal terminal(out, true);

    terminal.drawProgress(u"half");
    terminal.writeMessage(u"Stop.");
    terminal.eraseProgress();

    EXPECT_EQ(out.str(), "\r\033[Khalf\r\033[KStop.\n") << "There was nothing left to erase at the end.";
}

TEST(Terminal, WritesMessagesAloneWhereLinesCantBeRedrawn)
{
    std::ostringstream out;
    Terminal terminal(out, false);

    terminal.drawProgress(u"half");
    terminal.writeMessage(u"Stop.");
    terminal.eraseProgress();

    EXPECT_EQ(out.str(), "Stop.\n");
}

TEST(Terminal, WithoutAStreamTakesEverythingInSilence)
{
    Terminal terminal;

    terminal.drawProgress(u"half");
    terminal.writeMessage(u"Stop.");
    terminal.eraseProgress();

    EXPECT_FALSE(terminal.isInterrupted());
}

TEST(Terminal, IsInterruptedAsSoonAsTheSignalHandlerSaysSo)
{
    std::ostringstream out;
    volatile std::sig_atomic_t interrupted = 0;
    const Terminal terminal(out, true, &interrupted);

    EXPECT_FALSE(terminal.isInterrupted());
    interrupted = SIGINT;
    EXPECT_TRUE(terminal.isInterrupted());
}

} // namespace standin::tests
