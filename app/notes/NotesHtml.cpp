// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesHtml.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/notes/NotesPage.h"
#include "app/notes/NotesWording.h"
#include "app/notes/SoundWording.h"

#include <algorithm>
#include <array>
#include <map>
#include <set>
#include <string>
#include <utility>

namespace cadrel::app {

using core::ChangeKind;
using core::FrameSpan;
using core::NoteEntry;
using core::NoteStep;
using core::PictureChange;

namespace {

/// The strips of the picture, top and bottom.
constexpr int OldTop = 0;
constexpr int OldBottom = 26;
constexpr int NewTop = 164;
constexpr int NewBottom = 190;
constexpr int Middle = (OldBottom + NewTop) / 2;

/// What the boxes of the filter show, and the label on a line.
struct KindLabel {
    const char* filter;
    const char* label;
};

KindLabel labelOf(ChangeKind kind)
{
    switch (kind) {
    case ChangeKind::HeadTrimmed:
        return {"trimmed", "head"};
    case ChangeKind::TailTrimmed:
        return {"trimmed", "tail"};
    case ChangeKind::Lifted:
        return {"lifted", "lifted"};
    case ChangeKind::Inserted:
        return {"inserted", "inserted"};
    case ChangeKind::Replaced:
        return {"replaced", "replaced"};
    case ChangeKind::Moved:
        return {"moved", "moved"};
    case ChangeKind::Doubled:
        return {"doubled", "doubled"};
    case ChangeKind::Retimed:
        return {"retimed", "speed"};
    case ChangeKind::VersionChanged:
        return {"version", "version"};
    case ChangeKind::TransitionAdded:
    case ChangeKind::TransitionRemoved:
    case ChangeKind::TransitionChanged:
        break;
    }
    return {"transition", "transition"};
}

struct Filter {
    const char* value;
    const char* label;
    const char* hue; ///< the colour of its marks
};

constexpr std::array Filters{Filter{"kept", "kept", "kept"},
                             Filter{"trimmed", "trimmed", "lifted"},
                             Filter{"lifted", "lifted", "lifted"},
                             Filter{"inserted", "inserted", "inserted"},
                             Filter{"replaced", "replaced", "other"},
                             Filter{"moved", "moved", "moved"},
                             Filter{"doubled", "doubled", "doubled"},
                             Filter{"retimed", "retimed", "other"},
                             Filter{"version", "VFX version", "other"},
                             Filter{"transition", "transitions", "other"}};

std::string escaped(const std::string& text)
{
    std::string html;
    for (const char letter : toPrintable(text).text) {
        switch (letter) {
        case '&':
            html += "&amp;";
            break;
        case '<':
            html += "&lt;";
            break;
        case '>':
            html += "&gt;";
            break;
        case '"':
            html += "&quot;";
            break;
        default:
            html += letter;
        }
    }
    return html;
}

class HtmlForm {
public:
    HtmlForm(const NotesDocument& document, const NotesSink& sink)
        : m_document(document), m_words(document), m_sink(sink)
    {
    }

    void write()
    {
        const std::string title =
            "Change notes: " + escaped(m_words.cutName(false)) + " to " + escaped(m_words.cutName(true));
        m_sink("<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
               "<meta http-equiv=\"Content-Security-Policy\" content=\"default-src 'none'; style-src 'unsafe-inline'; "
               "script-src 'unsafe-inline'\">\n<meta name=\"viewport\" content=\"width=device-width\">\n<title>" +
               title + "</title>\n<style>");
        m_sink(NotesPage::Style);
        m_sink("</style>\n</head>\n<body>\n<main>\n");
        writeHead();
        writePicture();
        writeTools();
        writeLargest();
        writeReels();
        for (std::size_t reel = 0; reel < m_document.notes.reels().size(); ++reel)
            writeReel(reel);
        writeElsewhere();
        writeRemarks();
        m_sink("</main>\n<script>");
        m_sink(NotesPage::Script);
        m_sink("</script>\n</body>\n</html>\n");
    }

private:
    void writeHead()
    {
        const core::NoteTotals& totals = m_document.notes.totals();
        const auto number = [](const std::string& value, const char* what) {
            return concatenated({"<li><b>", escaped(value), "</b><span>", what, "</span></li>"});
        };
        const auto time = [this](std::int32_t frames) { return m_words.timecode(frames); };
        m_sink("<h1>Change notes</h1>\n<p class=\"dim\">Old cut: " + escaped(m_words.cutText(false)) +
               "<br>New cut: " + escaped(m_words.cutText(true)) + "<br>" + escaped(m_document.rate) +
               "</p>\n<ul class=\"numbers\">" + number(std::to_string(totals.steps), "steps") +
               number(time(totals.before), "before") + number(time(totals.after), "after") +
               number(m_words.change(totals.after - totals.before), "change of length") +
               number(time(totals.lifted), "lifted") + number(time(totals.inserted), "inserted") +
               number(time(totals.moved), "moved") + number(time(totals.doubled), "doubled") + "</ul>\n");
        if (m_document.sound != nullptr)
            writeLines("Sound: ", SoundWording(*m_document.sound).totals());
        writeLines("", m_words.settings());
        m_sink(concatenated({"<p>", NotesWording::Order, "</p>\n"}));
    }

    void writeLines(const std::string& title, const std::vector<std::string>& lines)
    {
        m_sink("<p class=\"dim\">" + title);
        const char* separator = "";
        for (const std::string& line : lines) {
            m_sink(separator + escaped(line));
            separator = "<br>";
        }
        m_sink("</p>\n");
    }

    /// Old and new programme as strips, each kept stretch as a band from one to the other.
    void writePicture()
    {
        const auto& notes = m_document.notes;
        const std::int32_t width = std::max({1, notes.oldCut().length(), notes.newCut().length()});
        m_sink("<div class=\"strip\"><div><span>old cut</span><span class=\"tc\">" + timesOf(notes.oldCut()) +
               "</span></div>\n" + numbersOf(true) + "<svg viewBox=\"0 0 " + std::to_string(width) +
               " 190\" preserveAspectRatio=\"none\" tabindex=\"0\" role=\"img\" aria-label=\"Old and new programme; "
               "plus and minus zoom, the arrows go along\">\n" +
               box({0, notes.oldCut().length()}, true, "base", {}, {}) +
               box({0, notes.newCut().length()}, false, "base", {}, {}));
        for (const bool movesAlone : {false, true}) {
            for (std::size_t reel = 0; reel < notes.reels().size(); ++reel)
                drawReel(reel, movesAlone);
        }
        for (const bool isOld : {true, false}) {
            for (const core::Reel& reel : (isOld ? notes.oldCut() : notes.newCut()).reels()) {
                const std::string x = std::to_string(reel.start);
                m_sink("<line class=\"reel\" x1=\"" + x + "\" x2=\"" + x + "\" y1=\"" +
                       std::to_string(isOld ? OldTop : NewTop) + "\" y2=\"" +
                       std::to_string(isOld ? OldBottom : NewBottom) + "\"/>\n");
            }
        }
        m_sink("</svg>\n" + numbersOf(false) + "<div><span>new cut</span><span class=\"tc\">" +
               timesOf(notes.newCut()) + "</span></div></div>\n");
    }

    /// The numbers of the reels, where the script puts them over their starts.
    std::string numbersOf(bool isOld) const
    {
        const auto& reels = m_document.notes.reels();
        if (reels.size() < 2)
            return {};
        std::string html = "<div class=\"reels\">";
        for (std::size_t reel = 0; reel < reels.size(); ++reel) {
            const auto& place = isOld ? reels[reel].pair.oldReel : reels[reel].pair.newReel;
            if (place)
                html += concatenated(
                    {"<b data-at=\"",
                     std::to_string(
                         (isOld ? m_document.notes.oldCut() : m_document.notes.newCut()).reels()[*place].start),
                     "\">", std::to_string(reel + 1), "</b>"});
        }
        return html + "</div>\n";
    }

    std::string timesOf(const core::Programme& cut) const
    {
        if (cut.reels().empty())
            return {};
        const core::Reel& last = cut.reels().back();
        return m_words.timecode(cut.reels().front().timecodeStart) + " to " +
               m_words.timecode(last.timecodeStart + last.length);
    }

    /// What keeps its order, or what moves, which lies on top of it.
    void drawReel(std::size_t reel, bool movesAlone)
    {
        const NoteEntry* move = nullptr;
        std::size_t kept = 0;
        for (const NoteEntry& entry : m_document.notes.reels()[reel].entries) {
            if (const core::KeptStretch* const stretch = entry.kept()) {
                move = m_moves.contains(stretch->newStart) ? m_moves.at(stretch->newStart) : move;
                const bool isMoved = move != nullptr && stretch->newStart >= rangeOf(*move).start &&
                                     stretch->newEnd() <= rangeOf(*move).end();
                ++kept;
                if (isMoved == movesAlone)
                    drawKept(*stretch, isMoved ? "moved" : "kept", isMoved ? idOf(*move) : keptId(reel, kept));
                continue;
            }
            if (entry.step()->action == core::StepAction::Move)
                m_moves[rangeOf(entry).start] = &entry;
            else if (movesAlone)
                drawStep(entry);
        }
    }

    static const FrameSpan& rangeOf(const NoteEntry& move) { return *move.step()->changes.front().inNew; }
    static std::string idOf(const NoteEntry& entry) { return concatenated({"s", std::to_string(entry.number)}); }
    static std::string keptId(std::size_t reel, std::size_t kept)
    {
        return concatenated({"k", std::to_string(reel + 1), "-", std::to_string(kept)});
    }

    void drawKept(const core::KeptStretch& kept, const std::string& kind, const std::string& id)
    {
        const FrameSpan inOld{kept.oldStart, kept.length};
        const FrameSpan inNew{kept.newStart, kept.length};
        const std::string boxKind = kind == "moved" ? "moved" : "seen";
        m_sink(box(inOld, true, boxKind, id, {}) + box(inNew, false, boxKind, id, {}) + band(inOld, inNew, kind, id));
    }

    void drawStep(const NoteEntry& entry)
    {
        const NoteStep& step = *entry.step();
        const std::string title = m_words.action(entry);
        for (const FrameSpan& removed : step.removedFrames)
            m_sink(box(removed, true, "lifted", idOf(entry), title));
        if (step.inserted.length > 0)
            m_sink(box(step.inserted, false, step.action == core::StepAction::Relabel ? "version" : "inserted",
                       idOf(entry), title));
        for (const PictureChange& change : step.changes) {
            if (change.kind == ChangeKind::Doubled)
                m_sink(band(*change.inOld, *change.inNew, "doubled", idOf(entry)));
        }
    }

    static std::string box(const FrameSpan& frames, bool isOld, const std::string& kind, const std::string& id,
                           const std::string& title)
    {
        return "<rect class=\"" + kind + "\" x=\"" + std::to_string(frames.start) + "\" y=\"" +
               std::to_string(isOld ? OldTop : NewTop) + "\" width=\"" + std::to_string(frames.length) +
               "\" height=\"" + std::to_string(OldBottom - OldTop) + "\"" + dataOf(id) +
               (title.empty() ? "/>\n" : "><title>" + escaped(title) + "</title></rect>\n");
    }

    static std::string dataOf(const std::string& id)
    {
        return id.empty() ? "" : concatenated({" data-step=\"", id, "\""});
    }

    static std::string band(const FrameSpan& inOld, const FrameSpan& inNew, const std::string& kind,
                            const std::string& id)
    {
        const auto point = [](std::int32_t x, int y) { return std::to_string(x) + " " + std::to_string(y); };
        const auto curve = [&point](std::int32_t fromX, std::int32_t toX, int toY) {
            return concatenated({"C", point(fromX, Middle), " ", point(toX, Middle), " ", point(toX, toY)});
        };
        return "<path class=\"" + kind + "\"" + dataOf(id) + " d=\"M" + point(inOld.start, OldBottom) +
               curve(inOld.start, inNew.start, NewTop) + "L" + point(inNew.end(), NewTop) +
               curve(inNew.end(), inOld.end(), OldBottom) + "Z\"/>\n";
    }

    void writeTools()
    {
        m_sink("<div class=\"tools\"><button data-zoom=\"0.6\">zoom in</button><button data-zoom=\"1.7\">zoom "
               "out</button><button data-zoom=\"1e9\">all</button>");
        const std::set<std::string> kinds = kindsOfAll();
        for (const auto& [value, label, hue] : Filters) {
            if (kinds.contains(value))
                m_sink(concatenated({"<label><input type=\"checkbox\" checked value=\"", value,
                                     "\"><i style=\"--hue: var(--", hue, ")\"></i>", label, "</label>"}));
        }
        if (m_document.sound != nullptr)
            m_sink("<button data-sound>all sound</button>");
        m_sink("<span class=\"dim\">n and p: next and previous step; + and -: zoom</span></div>\n"
               "<p class=\"left\" hidden></p>\n");
    }

    std::set<std::string> kindsOfAll() const
    {
        std::set<std::string> kinds;
        for (const core::ReelNotes& reel : m_document.notes.reels()) {
            for (const NoteEntry& entry : reel.entries) {
                if (entry.step() == nullptr)
                    kinds.insert("kept");
                else
                    for (const PictureChange& change : entry.step()->changes)
                        kinds.insert(labelOf(change.kind).filter);
            }
        }
        return kinds;
    }

    void writeLargest()
    {
        const auto steps = m_document.notes.largestSteps();
        if (steps.empty()) {
            m_sink("<p>Nothing has changed.</p>\n");
            return;
        }
        m_sink("<h2>The largest changes</h2>\n<ol class=\"largest\">\n");
        for (const NoteEntry* const entry : steps) {
            m_sink(
                concatenated({"<li><a href=\"#", idOf(*entry), "\">step ", std::to_string(entry->number), "</a>: "}) +
                escaped(m_words.action(*entry)) + ", " + escaped(m_words.shotsOf(*entry)) + soundSummary(*entry) +
                "</li>\n");
        }
        m_sink("</ol>\n");
    }

    /// A line a reel where there are several.
    void writeReels()
    {
        const auto& reels = m_document.notes.reels();
        if (reels.size() < 2)
            return;
        m_sink("<h2>The reels</h2>\n<div class=\"wide\"><table "
               "class=\"overview\">\n<thead><tr><th>reel</th><th>begins</th>"
               "<th>before</th><th>after</th><th class=\"num\">change</th><th class=\"num\">steps</th></tr></thead>\n"
               "<tbody>\n");
        for (std::size_t reel = 0; reel < reels.size(); ++reel) {
            const std::string number = std::to_string(reel + 1);
            const std::size_t steps = m_words.stepsOf(reel);
            m_sink(concatenated({"<tr", steps == 0 ? " class=\"k\"" : "", "><td><a href=\"#r", number, "\">Reel ",
                                 number, "</a></td><td class=\"tc\">", m_words.reelStart(reel),
                                 "</td><td class=\"tc\">", m_words.timecode(reels[reel].before),
                                 "</td><td class=\"tc\">", m_words.timecode(reels[reel].after),
                                 "</td><td class=\"tc num\">", m_words.change(reels[reel].after - reels[reel].before),
                                 "</td><td class=\"num\">", std::to_string(steps), "</td></tr>\n"}));
        }
        m_sink("</tbody>\n</table></div>\n");
    }

    void writeReel(std::size_t reel)
    {
        m_sink("<h2 id=\"r" + std::to_string(reel + 1) + "\">" + escaped(m_words.reelTitle(reel)) +
               "</h2>\n<p class=\"dim\">" + escaped(m_words.reelLengths(reel)) +
               "</p>\n<div class=\"wide\"><table class=\"steps\">\n<thead><tr><th "
               "class=\"num\">step</th><th>at</th><th>what to "
               "do</th><th>what "
               "changes</th><th class=\"num\">length</th><th class=\"num\">offset</th></tr></thead>\n<tbody>\n");
        std::size_t kept = 0;
        for (const NoteEntry& entry : m_document.notes.reels()[reel].entries)
            m_sink(entry.step() == nullptr ? rowOf(entry, reel, keptId(reel, ++kept))
                                           : rowOf(entry, reel, idOf(entry)));
        m_sink("</tbody>\n</table></div>\n");
    }

    std::string rowOf(const NoteEntry& entry, std::size_t reel, const std::string& id) const
    {
        const bool isKept = entry.step() == nullptr;
        const auto cell = [](const std::string& kind, const std::string& html) {
            return concatenated({"<td class=\"", kind, "\">", html, "</td>"});
        };
        std::string feet;
        if (m_document.layout.showsFeet && !isKept)
            feet = "<p class=\"change\"><small>" + escaped(m_words.inFeet(entry)) + "</small></p>";
        return "<tr id=\"" + id + "\" tabindex=\"0\"" + (isKept ? " class=\"k\"" : "") + " data-kinds=\"" +
               (isKept ? "kept" : filtersOf(*entry.step())) + "\">" +
               cell("num", isKept ? "" : std::to_string(entry.number)) +
               cell("tc", m_words.timecode(m_document.notes.timecodeOf(m_words.placeOf(entry, reel)))) +
               cell("tc", escaped(m_words.action(entry))) +
               cell("", isKept ? "" : changesOf(*entry.step()) + feet + soundOf(entry)) +
               cell("tc num", entry.lengthChange == 0 ? "" : m_words.change(entry.lengthChange)) +
               cell("tc num", m_words.change(entry.runningOffset)) + "</tr>\n";
    }

    static std::string filtersOf(const NoteStep& step)
    {
        std::string kinds;
        for (const PictureChange& change : step.changes)
            kinds.append(kinds.empty() ? "" : " ").append(labelOf(change.kind).filter);
        return kinds;
    }

    /// The label stands before it already.
    static std::string withoutLabel(const std::string& what, const std::string& label)
    {
        return what.starts_with(label + " ") ? what.substr(label.size() + 1) : what;
    }

    std::string changesOf(const NoteStep& step) const
    {
        std::string html;
        for (const PictureChange& change : step.changes) {
            const ChangeWords words = m_words.describe(change);
            const bool isLonger =
                change.frames > 0 && (change.kind == ChangeKind::HeadTrimmed || change.kind == ChangeKind::TailTrimmed);
            html += "<p class=\"change\"><span class=\"tag " + (isLonger ? "plus" : std::string(wordOf(change.kind))) +
                    "\">" + labelOf(change.kind).label + "</span>" + escaped(words.shot) + " <small>" +
                    escaped(withoutLabel(words.what, labelOf(change.kind).label)) +
                    (words.more.empty() ? "" : ", " + escaped(words.more)) + "</small></p>";
        }
        if (step.joined > 1)
            html += "<p class=\"change\"><small>joined from " + std::to_string(step.joined) +
                    " trims that cancel out</small></p>";
        return html;
    }

    std::string soundSummary(const NoteEntry& entry) const
    {
        const core::StepSound* const sound = m_words.soundOf(entry);
        if (sound == nullptr || sound->isEmpty())
            return {};
        return "<br><small>sound: " + escaped(SoundWording::shortSummary(*sound)) + "</small>";
    }

    std::string soundOf(const NoteEntry& entry) const
    {
        const core::StepSound* const sound = m_words.soundOf(entry);
        if (sound == nullptr)
            return {};
        std::string html;
        if (!sound->scenes.empty())
            html += "<p class=\"change\"><small>scene: " + escaped(SoundWording::scenes(*sound)) + "</small></p>";
        return sound->isEmpty() ? html : html + soundDetails(*sound);
    }

    /// Folded, but for what it is all about.
    std::string soundDetails(const core::StepSound& sound) const
    {
        const SoundWording words(*m_document.sound);
        const std::vector<SoundLine> lines = words.lines(sound);
        if (lines.empty())
            return "<p class=\"change\"><span class=\"tag sound\">sound</span><small>" + escaped(words.summary(sound)) +
                   "</small></p>";
        std::string html = "<details class=\"sound\"><summary><span class=\"tag sound\">sound</span>" +
                           escaped(words.summary(sound)) + "</summary><ul>";
        for (const SoundLine& line : lines)
            html += "<li><span class=\"tc\">" + escaped(line.time) + "</span> " + escaped(line.name) + " <small>" +
                    escaped(line.what) + "</small></li>";
        if (const std::string rest = SoundWording::rest(sound); !rest.empty())
            html += "<li>" + rest + "</li>";
        return html + "</ul></details>";
    }

    void writeElsewhere()
    {
        if (m_document.sound == nullptr || m_document.sound->notes.elsewhere().isEmpty())
            return;
        m_sink(concatenated({"<h2>", SoundWording::ElsewhereTitle, "</h2>\n",
                             soundDetails(m_document.sound->notes.elsewhere()), "\n"}));
    }

    void writeRemarks()
    {
        const std::vector<std::string> lines = m_words.remarks();
        if (lines.empty())
            return;
        m_sink("<h2>Healed, doubted and passed over</h2>\n<ul>\n");
        for (const std::string& line : lines)
            m_sink(concatenated({"<li>", escaped(line), "</li>\n"}));
        m_sink("</ul>\n");
    }

    const NotesDocument& m_document;
    NotesWording m_words;
    const NotesSink& m_sink;
    std::map<std::int32_t, const NoteEntry*> m_moves; ///< by their place in the new programme
};

} // namespace

void writeNotesHtml(const NotesDocument& document, const NotesSink& sink)
{
    HtmlForm(document, sink).write();
}

} // namespace cadrel::app
