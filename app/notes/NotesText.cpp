// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesText.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/notes/NotesWording.h"
#include "app/notes/SoundWording.h"
#include "app/settings/SettingsReport.h"

#include <algorithm>

namespace cadrel::app {

using core::NoteEntry;
using core::NoteTotals;
using core::PictureChange;

namespace {

constexpr std::size_t Width = 80;
constexpr std::size_t NumberWidth = 4;
constexpr std::size_t TimeWidth = 13;
constexpr std::size_t ActionWidth = 35;
constexpr std::size_t WhatWidth = 33;
constexpr std::size_t SoundWhatWidth = 25;
constexpr std::size_t SoundTimeWidth = 14;
const std::string Indent(NumberWidth + 2, ' ');

std::string padded(const std::string& text, std::size_t width)
{
    const std::size_t characters = toPrintable(text).width;
    return characters < width ? text + std::string(width - characters, ' ') : text;
}

std::string trimmedEnd(std::string line)
{
    line.erase(line.find_last_not_of(' ') + 1);
    return line + "\n";
}

std::size_t widthOf(const std::string& text)
{
    return toPrintable(text).width;
}

/// The first characters of a text, as many as a line has room for.
std::string firstLineOf(const std::string& text)
{
    const auto isInsideOfACharacter = [](char byte) { return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U; };
    std::size_t end = std::min(text.size(), Width);
    for (std::size_t next = end; next < text.size() && widthOf(text.substr(0, next)) <= Width; ++next)
        end = next;
    while (widthOf(text.substr(0, end)) > Width)
        --end;
    while (end > 1 && end < text.size() && isInsideOfACharacter(text[end]))
        --end;
    return text.substr(0, end);
}

/// Broken at blanks where it is too long, and inside of a word that is longer than a line; the further lines are indented.
std::string wrapped(const std::string& text, const std::string& indent)
{
    std::string lines;
    std::string line;
    bool hasWord = false;
    for (std::size_t start = 0; start <= text.size();) {
        const std::size_t end = std::min(text.find(' ', start), text.size());
        const std::string word = text.substr(start, end - start);
        const bool fitsOnALine = indent.size() + widthOf(word) <= Width;
        if (hasWord && fitsOnALine && widthOf(line) + 1 + widthOf(word) > Width) {
            lines += line + "\n";
            line = indent + word;
        } else {
            line.append(start == 0 ? "" : " ").append(word);
        }
        while (widthOf(line) > Width) {
            const std::string first = firstLineOf(line);
            lines += trimmedEnd(first);
            line.replace(0, first.size(), indent);
        }
        hasWord = hasWord || !word.empty();
        start = end + 1;
    }
    return lines + line + "\n";
}

class TextForm {
public:
    explicit TextForm(const NotesDocument& document) : m_document(document), m_words(document) {}

    void write(const NotesSink& sink) const
    {
        sink(cuts());
        sink(figures());
        sink(soundTotals());
        if (const std::string order = m_words.order(); !order.empty())
            sink(concatenated({"\n", wrapped(order, {})}));
        sink(largest());
        sink(reels());
        for (std::size_t reel = 0; reel < m_document.notes.reels().size(); ++reel) {
            sink(concatenated({"\n", m_words.reelTitle(reel), "\n", m_words.reelLengths(reel), "\n\n"}));
            sink(trimmedEnd(padded("step", Indent.size()) + padded("at", TimeWidth) +
                            padded("what to do", ActionWidth + 1) + padded("      length", TimeWidth) +
                            "      offset"));
            for (const NoteEntry& entry : m_document.notes.reels()[reel].entries)
                sink(rowText(entry, reel));
        }
        sink(elsewhere());
        sink(remarks());
    }

    void writeHead(const NotesSink& sink) const
    {
        sink(figures());
        sink(largest());
    }

private:
    static std::string line(const std::string& title, const std::string& text)
    {
        return padded(title, 12) + text + "\n";
    }

    static std::string longLine(const std::string& title, const std::string& text)
    {
        return wrapped(padded(title, 12) + text, std::string(12, ' '));
    }

    std::string cuts() const
    {
        const std::string titles = m_words.titles();
        return (titles.empty() ? titles : longLine("Titles", titles)) + longLine("Old cut", m_words.cutText(false)) +
               longLine("New cut", m_words.cutText(true)) + line("Frame rate", m_document.rate) +
               m_document.settings.text(padded("Settings", 12), Width);
    }

    std::string figures() const
    {
        const NoteTotals& totals = m_document.notes.totals();
        const auto time = [this](std::int32_t frames) { return m_words.timecode(frames); };
        return line("Length", time(totals.before) + " before, " + time(totals.after) + " after, " +
                                  m_words.change(totals.after - totals.before)) +
               line("Old picture", time(totals.kept) + " kept, " + time(totals.lifted) + " lifted") +
               line("New picture", time(totals.inserted) + " inserted, " + time(totals.doubled) + " doubled") +
               line("Moved", time(totals.moved)) +
               line("Steps", std::to_string(totals.steps) + " in " + counted(m_document.notes.reels().size(), "reel"));
    }

    std::string soundTotals() const
    {
        if (m_document.sound == nullptr)
            return {};
        std::string text;
        for (const std::string& total : SoundWording(*m_document.sound).totals())
            text += longLine(text.empty() ? "Sound" : "", total);
        return text;
    }

    std::string largest() const
    {
        const auto steps = m_document.notes.largestSteps();
        if (steps.empty())
            return "\n" + m_words.nothingHasChanged() + "\n";
        std::string text = "\nThe largest changes\n";
        for (const NoteEntry* const entry : steps) {
            text += trimmedEnd(padded(numberText(entry->number), Indent.size()) +
                               padded(m_words.action(*entry), ActionWidth) + m_words.shotsOf(*entry));
            if (const core::StepSound* const sound = m_words.soundOf(*entry); sound != nullptr && !sound->isEmpty())
                text += wrapped(Indent + "sound: " + SoundWording::shortSummary(*sound), Indent + "  ");
        }
        return text;
    }

    /// A line a reel where there are several.
    std::string reels() const
    {
        const auto& all = m_document.notes.reels();
        if (all.size() < 2)
            return {};
        std::string text = "\nThe reels\n  reel  begins       before       after        change        steps\n";
        for (std::size_t reel = 0; reel < all.size(); ++reel)
            text += numberText(reel + 1) + "    " + m_words.reelStart(reel) + "  " +
                    m_words.timecode(all[reel].before) + "  " + m_words.timecode(all[reel].after) + " " +
                    m_words.changeInColumn(all[reel].after - all[reel].before) + "  " +
                    numberText(m_words.stepsOf(reel)) + "\n";
        return text;
    }

    static std::string numberText(std::size_t number)
    {
        const std::string digits = std::to_string(number);
        return std::string(NumberWidth - std::min(NumberWidth, digits.size()), ' ') + digits;
    }

    std::string rowText(const NoteEntry& entry, std::size_t reel) const
    {
        const std::string number = entry.number == 0 ? "" : numberText(entry.number);
        const std::string start = padded(number, Indent.size()) + padded(m_words.timeOf(entry, reel), TimeWidth);
        // Only a step has a change of length, so that there is room for longer words in its place.
        if (entry.step() == nullptr)
            return trimmedEnd(start + padded(m_words.action(entry), ActionWidth + 1 + TimeWidth) +
                              m_words.offsetInColumn(entry, reel)) +
                   moveText(entry);
        std::string text =
            trimmedEnd(start + padded(m_words.action(entry), ActionWidth + 1) +
                       padded(entry.lengthChange == 0 ? "" : m_words.change(entry.lengthChange), TimeWidth) +
                       m_words.offsetInColumn(entry, reel));
        for (const PictureChange& change : entry.step()->changes) {
            const ChangeWords words = m_words.describe(change);
            text += trimmedEnd(Indent + padded(words.what, WhatWidth) + "  " + words.shot);
            if (!words.more.empty())
                text += wrapped(Indent + "  " + words.more, Indent + "  ");
        }
        if (entry.step()->joined > 1)
            text += Indent + "joined from " + std::to_string(entry.step()->joined) + " steps whose trims cancel out\n";
        if (const std::string feet = m_words.inFeet(entry); m_document.layout.showsFeet && !feet.empty())
            text += wrapped(Indent + feet, Indent + "  ");
        if (const core::StepSound* const sound = m_words.soundOf(entry))
            text += soundText(*sound);
        return text;
    }

    /// The shots at the other end of a move; empty for a kept stretch.
    std::string moveText(const NoteEntry& entry) const
    {
        return entry.moveEnd() == nullptr ? "" : Indent + m_words.describe(entry.moveEnd()->move).shot + "\n";
    }

    std::string soundText(const core::StepSound& sound) const
    {
        std::string text;
        if (!sound.scenes.empty())
            text += wrapped(Indent + "scene: " + SoundWording::scenes(sound), Indent + "  ");
        if (sound.isEmpty())
            return text;
        const SoundWording words(*m_document.sound);
        text += wrapped(Indent + "sound: " + words.summary(sound), Indent + "  ");
        for (const SoundLine& line : words.lines(sound))
            text +=
                wrapped(Indent + "  " + padded(line.what, SoundWhatWidth) + " " + padded(line.time, SoundTimeWidth) +
                            " " + line.name + (line.more.empty() ? "" : ", " + line.more),
                        Indent + "    ");
        if (const std::string rest = SoundWording::rest(sound); !rest.empty())
            text += Indent + "  " + rest + "\n";
        return text;
    }

    std::string elsewhere() const
    {
        if (m_document.sound == nullptr || m_document.sound->notes.elsewhere().isEmpty())
            return {};
        return "\n" + std::string(SoundWording::ElsewhereTitle) + "\n" + soundText(m_document.sound->notes.elsewhere());
    }

    std::string remarks() const
    {
        const std::vector<std::string> lines = m_words.remarks();
        if (lines.empty())
            return {};
        std::string text = "\nHealed, doubted and passed over\n";
        for (const std::string& line : lines)
            text += wrapped("  " + line, "    ");
        return text;
    }

    const NotesDocument& m_document;
    NotesWording m_words;
};

} // namespace

void writeNotesText(const NotesDocument& document, const NotesSink& sink)
{
    TextForm(document).write(sink);
}

void writeNotesHead(const NotesDocument& document, const NotesSink& sink)
{
    TextForm(document).writeHead(sink);
}

} // namespace cadrel::app
