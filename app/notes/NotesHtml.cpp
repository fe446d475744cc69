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
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

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

/// A mark that is shorter than this part of the picture may be thinner than a pixel, and gets a stroke. Bands can be seen
/// through, so that a stroke makes them darker, and they get one only where they need it at the full width of the page.
constexpr std::int32_t ThinPart = 400;
constexpr std::int32_t ThinPartOfABand = 1200;

/// The box of the filter, which gives the hue, and the label on a line.
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
    case ChangeKind::Unchanged:
        return {"trimmed", "unchanged"};
    case ChangeKind::ReelMoved:
        return {"moved", "reel"};
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
};

constexpr std::array Filters{Filter{"kept", "kept"},           Filter{"trimmed", "trimmed"},
                             Filter{"lifted", "lifted"},       Filter{"inserted", "inserted"},
                             Filter{"replaced", "replaced"},   Filter{"moved", "moved"},
                             Filter{"doubled", "doubled"},     Filter{"retimed", "retimed"},
                             Filter{"version", "VFX version"}, Filter{"transition", "transitions"}};

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

/// A name, whose letters may run from right to left, apart from what stands before and after it.
std::string nameInHtml(const std::string& name)
{
    return concatenated({"<bdi>", escaped(name), "</bdi>"});
}

/// Whether every one of the frames belongs to a change.
bool areTold(const FrameSpan& frames, const std::vector<PictureChange>& changes,
             std::optional<FrameSpan> PictureChange::*span)
{
    std::vector<FrameSpan> told;
    for (const PictureChange& change : changes) {
        if (change.*span)
            told.push_back(*(change.*span));
    }
    std::sort(told.begin(), told.end(), [](const FrameSpan& a, const FrameSpan& b) { return a.start < b.start; });
    std::int32_t next = frames.start;
    for (const FrameSpan& stretch : told)
        next = stretch.start <= next ? std::max(next, stretch.end()) : next;
    return next >= frames.end();
}

class HtmlForm {
public:
    HtmlForm(const NotesDocument& document, const NotesSink& sink)
        : m_document(document), m_words(document), m_sink(sink),
          m_width(std::max({1, document.notes.oldCut().length(), document.notes.newCut().length()}))
    {
        for (std::size_t reel = 0; reel < document.notes.reels().size(); ++reel) {
            std::size_t count = 0;
            for (const NoteEntry& entry : document.notes.reels()[reel].entries) {
                if (entry.moveEnd() != nullptr)
                    m_moveEnds[entry.moveEnd()->step] = moveEndId(reel, ++count);
            }
        }
    }

    void write()
    {
        const std::string title = "Change notes: " + escaped(m_words.bothCuts());
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
        m_sink("<h1>Change notes</h1>\n");
        if (!m_words.titles().empty())
            m_sink(concatenated({"<p class=\"titles\">", nameInHtml(m_words.cutTitle(false)), " to ",
                                 nameInHtml(m_words.cutTitle(true)), "</p>\n"}));
        m_sink("<p class=\"dim\">Old cut: " + cutInHtml(false) + "<br>New cut: " + cutInHtml(true) + "<br>" +
               escaped(m_document.rate) + "</p>\n<ul class=\"numbers\">" +
               number(std::to_string(totals.steps), "steps") + number(time(totals.before), "before") +
               number(time(totals.after), "after") +
               number(m_words.change(totals.after - totals.before), "change of length") +
               number(time(totals.lifted), "lifted") + number(time(totals.inserted), "inserted") +
               number(time(totals.moved), "moved") + number(time(totals.doubled), "doubled") + "</ul>\n");
        if (m_document.sound != nullptr)
            writeLines("Sound: ", SoundWording(*m_document.sound).totals());
        writeLines("", m_words.settings());
        if (const std::string order = m_words.order(); !order.empty())
            m_sink(concatenated({"<p>", escaped(order), "</p>\n"}));
    }

    /// What is told of a cut, which begins with its name.
    std::string cutInHtml(bool isNew) const
    {
        const std::string name = m_words.cutName(isNew);
        const std::string text = m_words.cutText(isNew);
        return text.starts_with(name) ? nameInHtml(name) + escaped(text.substr(name.size())) : escaped(text);
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
        m_sink("<div class=\"strip\"><div><span>old cut</span><span class=\"tc\">" + timesOf(notes.oldCut()) +
               "</span></div>\n" + numbersOf(true) + "<svg viewBox=\"0 0 " + std::to_string(m_width) +
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
                    drawKept({stretch->oldStart, stretch->length}, {stretch->newStart, stretch->length},
                             isMoved ? "moved" : "kept", (isMoved ? idsOf(*move) + " " : "") + keptId(reel, kept));
                continue;
            }
            if (entry.step() == nullptr)
                continue;
            const core::StepAction action = entry.step()->action;
            if (action == core::StepAction::Move)
                m_moves[rangeOf(entry).start] = &entry;
            else if (movesAlone && action != core::StepAction::MoveReel)
                drawStep(entry);
        }
    }

    static const FrameSpan& rangeOf(const NoteEntry& move) { return *move.step()->changes.front().inNew; }
    static std::string idOf(const NoteEntry& entry) { return concatenated({"s", std::to_string(entry.number)}); }
    static std::string keptId(std::size_t reel, std::size_t kept)
    {
        return concatenated({"k", std::to_string(reel + 1), "-", std::to_string(kept)});
    }
    static std::string moveEndId(std::size_t reel, std::size_t number)
    {
        return concatenated({"m", std::to_string(reel + 1), "-", std::to_string(number)});
    }

    /// The lines of a move: its step, and that of its other end.
    std::string idsOf(const NoteEntry& move) const
    {
        const auto end = m_moveEnds.find(move.number);
        return end == m_moveEnds.end() ? idOf(move) : concatenated({idOf(move), " ", end->second});
    }

    void drawKept(const FrameSpan& inOld, const FrameSpan& inNew, const std::string& kind, const std::string& ids)
    {
        m_sink(box(inOld, true, kind, ids, {}) + box(inNew, false, kind, ids, {}) + band(inOld, inNew, kind, ids));
    }

    /// Each change in the hue of its kind. What no change tells of has that of the largest one.
    void drawStep(const NoteEntry& entry)
    {
        const NoteStep& step = *entry.step();
        const std::string id = idOf(entry);
        const std::string title = m_words.action(entry);
        const char* const kind = labelOf(NotesWording::largestChange(entry).kind).filter;
        for (const FrameSpan& removed : step.removedFrames) {
            if (!areTold(removed, step.changes, &PictureChange::inOld))
                m_sink(box(removed, true, kind, id, title));
        }
        if (!areTold(step.inserted, step.changes, &PictureChange::inNew))
            m_sink(box(step.inserted, false, kind, id, title));
        for (const PictureChange& change : step.changes)
            drawChange(change, step, id, title);
    }

    void drawChange(const PictureChange& change, const NoteStep& step, const std::string& id, const std::string& title)
    {
        if (change.kind == ChangeKind::Unchanged) {
            drawKept(*change.inOld, *change.inNew, "kept", id);
            return;
        }
        const char* const kind = labelOf(change.kind).filter;
        if (change.kind == ChangeKind::Doubled)
            m_sink(band(*change.inOld, *change.inNew, kind, id));
        else if (change.inOld && step.action == core::StepAction::Replace)
            m_sink(box(*change.inOld, true, kind, id, title));
        if (change.inNew)
            m_sink(box(*change.inNew, false, kind, id, title));
    }

    std::string classOf(const std::string& kind, std::int32_t frames, std::int32_t thinPart) const
    {
        return frames < m_width / thinPart ? kind + " thin" : kind;
    }

    std::string box(const FrameSpan& frames, bool isOld, const std::string& kind, const std::string& ids,
                    const std::string& title) const
    {
        return "<rect class=\"" + classOf(kind, frames.length, ThinPart) + "\" x=\"" + std::to_string(frames.start) +
               "\" y=\"" + std::to_string(isOld ? OldTop : NewTop) + "\" width=\"" + std::to_string(frames.length) +
               "\" height=\"" + std::to_string(OldBottom - OldTop) + "\"" + dataOf(ids) +
               (title.empty() ? "/>\n" : "><title>" + escaped(title) + "</title></rect>\n");
    }

    /// The lines of the table that a mark belongs to.
    static std::string dataOf(const std::string& ids)
    {
        return ids.empty() ? "" : concatenated({" data-rows=\"", ids, "\""});
    }

    std::string band(const FrameSpan& inOld, const FrameSpan& inNew, const std::string& kind,
                     const std::string& ids) const
    {
        const auto point = [](std::int32_t x, int y) { return std::to_string(x) + " " + std::to_string(y); };
        const auto curve = [&point](std::int32_t fromX, std::int32_t toX, int toY) {
            return concatenated({"C", point(fromX, Middle), " ", point(toX, Middle), " ", point(toX, toY)});
        };
        return "<path class=\"" + classOf(kind, inNew.length, ThinPartOfABand) + "\"" + dataOf(ids) + " d=\"M" +
               point(inOld.start, OldBottom) + curve(inOld.start, inNew.start, NewTop) + "L" +
               point(inNew.end(), NewTop) + curve(inNew.end(), inOld.end(), OldBottom) + "Z\"/>\n";
    }

    void writeTools()
    {
        m_sink("<div class=\"tools\"><button data-zoom=\"0.6\">zoom in</button><button data-zoom=\"1.7\">zoom "
               "out</button><button data-zoom=\"1e9\">all</button>");
        const std::set<std::string> kinds = kindsOfAll();
        for (const auto& [value, label] : Filters) {
            if (kinds.contains(value))
                m_sink(concatenated({"<label><input type=\"checkbox\" checked value=\"", value, "\"><i class=\"", value,
                                     "\"></i>", label, "</label>"}));
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
                if (entry.kept() != nullptr)
                    kinds.insert("kept");
                if (entry.step() == nullptr)
                    continue;
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
            m_sink("<p>" + escaped(m_words.nothingHasChanged()) + "</p>\n");
            return;
        }
        m_sink("<h2>The largest changes</h2>\n<ol class=\"largest\">\n");
        for (const NoteEntry* const entry : steps) {
            m_sink(
                concatenated({"<li><a href=\"#", idOf(*entry), "\">step ", std::to_string(entry->number), "</a>: "}) +
                escaped(m_words.action(*entry)) + ", " + nameInHtml(m_words.shotsOf(*entry)) + soundSummary(*entry) +
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
            m_sink(concatenated({"<tr", reels[reel].isUnchanged() ? " class=\"k\"" : "", "><td><a href=\"#r", number,
                                 "\">Reel ", number, "</a></td><td class=\"tc\">", m_words.reelStart(reel),
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
            m_sink(rowOf(entry, reel,
                         entry.step() != nullptr   ? idOf(entry)
                         : entry.kept() != nullptr ? keptId(reel, ++kept)
                                                   : m_moveEnds.at(entry.moveEnd()->step)));
        m_sink("</tbody>\n</table></div>\n");
    }

    std::string rowOf(const NoteEntry& entry, std::size_t reel, const std::string& id) const
    {
        const bool isStep = entry.step() != nullptr;
        const auto cell = [](const std::string& kind, const std::string& html) {
            return concatenated({"<td class=\"", kind, "\">", html, "</td>"});
        };
        std::string feet;
        if (const std::string words = m_words.inFeet(entry); m_document.layout.showsFeet && !words.empty())
            feet = "<p class=\"change\"><small>" + words + "</small></p>";
        return "<tr id=\"" + id + "\" tabindex=\"0\"" + (isStep ? "" : " class=\"k\"") + " data-kinds=\"" +
               filtersOf(entry) + "\">" + cell("num", isStep ? std::to_string(entry.number) : "") +
               cell("tc", m_words.timeOf(entry, reel)) + cell("tc", escaped(m_words.action(entry))) +
               cell("", isStep ? changesOf(*entry.step()) + feet + soundOf(entry) : moveOf(entry)) +
               cell("tc num", entry.lengthChange == 0 ? "" : m_words.change(entry.lengthChange)) +
               cell("tc num", m_words.offsetInColumn(entry, reel)) + "</tr>\n";
    }

    static std::string filtersOf(const NoteEntry& entry)
    {
        if (entry.step() == nullptr)
            return entry.kept() != nullptr ? "kept" : "moved";
        std::string kinds;
        for (const PictureChange& change : entry.step()->changes)
            kinds.append(kinds.empty() ? "" : " ").append(labelOf(change.kind).filter);
        return kinds;
    }

    /// The shots at the other end of a move, which lead to its step; empty for a kept stretch.
    std::string moveOf(const NoteEntry& entry) const
    {
        const core::MoveEnd* const end = entry.moveEnd();
        if (end == nullptr)
            return {};
        return concatenated(
            {"<a href=\"#s", std::to_string(end->step), "\">", nameInHtml(m_words.describe(end->move).shot), "</a>"});
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
            const auto [filter, label] = labelOf(change.kind);
            html += concatenated({"<p class=\"change\"><span class=\"tag ",
                                  change.kind == ChangeKind::Unchanged ? "kept" : filter, "\">", label, "</span>",
                                  nameInHtml(words.shot), " <small>", escaped(withoutLabel(words.what, label))}) +
                    (words.more.empty() ? "" : ", " + escaped(words.more)) + "</small></p>";
        }
        if (step.joined > 1)
            html += "<p class=\"change\"><small>joined from " + std::to_string(step.joined) +
                    " steps whose trims cancel out</small></p>";
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
            html += "<p class=\"change\"><small>scene: " + nameInHtml(SoundWording::scenes(*sound)) + "</small></p>";
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
            html += "<li><span class=\"tc\">" + escaped(line.time) + "</span> " + nameInHtml(line.name) + " <small>" +
                    escaped(line.whatAndMore()) + "</small></li>";
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
    const std::int32_t m_width;                       ///< of the picture, in frames
    std::map<std::size_t, std::string> m_moveEnds;    ///< the lines of other ends, by the numbers of their steps
    std::map<std::int32_t, const NoteEntry*> m_moves; ///< by their place in the new programme
};

} // namespace

void writeNotesHtml(const NotesDocument& document, const NotesSink& sink)
{
    HtmlForm(document, sink).write();
}

} // namespace cadrel::app
