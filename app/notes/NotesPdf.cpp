// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesPdf.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/notes/NotesWording.h"
#include "app/notes/PdfPages.h"
#include "app/notes/SoundWording.h"

#include <algorithm>
#include <array>
#include <functional>
#include <iterator>
#include <numeric>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::app {

using core::FrameSpan;
using core::NoteEntry;
using core::PictureChange;

namespace {

constexpr double Margin = 42;
constexpr double FootHeight = 22;
constexpr double StripHeight = 14;
constexpr double BandHeight = 84;
constexpr double LineHeight = 10.5;
/// A printer with 600 dots to the inch has about as many across the paper. More bands can't be told from each other.
constexpr std::size_t MostBands = 4000;
/// A step with more lines goes on over the page.
constexpr std::size_t MostLinesOfAPiece = 24;
/// Of what stands above the rows of a reel that goes on from the page before.
constexpr double ContinuedHeight = 30;

constexpr PdfColour Ink{0.11, 0.12, 0.13};
constexpr PdfColour White{1.0, 1.0, 1.0};
constexpr PdfColour Dim{0.42, 0.45, 0.48};
constexpr PdfColour Rule{0.85, 0.84, 0.82};
constexpr PdfColour Kept{0.49, 0.58, 0.68};
constexpr PdfColour Staying{0.49, 0.58, 0.68, 0.34};
constexpr PdfColour Moved{0.83, 0.54, 0.12, 0.7};
constexpr PdfColour Doubled{0.54, 0.36, 0.75, 0.7};
constexpr PdfColour Lifted{0.78, 0.27, 0.23};
constexpr PdfColour Inserted{0.18, 0.58, 0.38};
constexpr PdfColour Version{0.23, 0.47, 0.77};

constexpr PdfFont TitleFont{"sans-serif", 19, true};
constexpr PdfFont HeadingFont{"sans-serif", 12, true};
constexpr PdfFont BodyFont{"sans-serif", 8.5};
constexpr PdfFont SmallFont{"sans-serif", 7.5};
constexpr PdfFont TimeFont{"monospace", 8};
constexpr PdfFont ReelFont{"sans-serif", 6.5, true};
constexpr PdfFont SmallTimeFont{"monospace", 7};

/// What can't be broken over two pages.
struct Piece {
    double height;
    std::function<void(PdfPages&, double top)> draw;
    bool goesWithNext = false;       ///< a heading
    std::optional<std::size_t> reel; ///< of whose rows it is one
};

class PdfForm {
public:
    PdfForm(const NotesDocument& document, const NotesSink& sink)
        : m_document(document), m_words(document),
          m_pages(document.layout.isLetter ? 612.0 : 595.28, document.layout.isLetter ? 792.0 : 841.89, sink)
    {
        m_right = m_pages.width() - Margin;
        m_lengthRight = m_right - 78;
    }

    void write()
    {
        addHead();
        add(2 * StripHeight + BandHeight + 44, [this](PdfPages&, double top) { drawPicture(top); });
        addLargest();
        addReels();
        for (std::size_t reel = 0; reel < m_document.notes.reels().size(); ++reel)
            addReel(reel);
        addElsewhere();
        addRemarks();
        drawPages();
        m_pages.finish();
    }

private:
    using Lines = std::vector<std::pair<std::string, PdfColour>>;
    /// From where picture was to where it is.
    struct Band {
        FrameSpan inOld;
        FrameSpan inNew;
        PdfColour colour;
    };
    /// Of a strip of the picture.
    struct Stretch {
        double left;
        double right;
    };

    void add(double height, std::function<void(PdfPages&, double)> draw, bool goesWithNext = false)
    {
        m_pieces.push_back({height, std::move(draw), goesWithNext, {}});
    }

    void addText(const std::string& text, const PdfFont& font, const PdfColour& colour, double height,
                 bool goesWithNext = false)
    {
        const std::vector<std::string> lines = m_pages.wrapped(text, font, m_right - Margin);
        const double leading = font.size * 1.4;
        add(
            height + static_cast<double>(lines.size() - 1) * leading,
            [lines, font, colour, height, leading](PdfPages& pages, double top) {
                double y = top + height - 4;
                for (const std::string& line : lines) {
                    pages.text(Margin, y, line, font, colour);
                    y += leading;
                }
            },
            goesWithNext);
    }

    void addHead()
    {
        const core::NoteTotals& totals = m_document.notes.totals();
        const auto time = [this](std::int32_t frames) { return m_words.timecode(frames); };
        const std::string titles = concatenated({m_words.cutTitle(false), " to ", m_words.cutTitle(true)});
        m_pages.describe("Change notes: " + titles,
                         toPrintable("Old cut " + m_words.cutName(false) + ", new cut " + m_words.cutName(true)).text);
        addText("Change notes", TitleFont, Ink, 22);
        add(6, [](PdfPages&, double) {});
        addText(titles, HeadingFont, Ink, 18);
        addText("Old cut: " + m_words.cutText(false), BodyFont, Dim, 13);
        addText("New cut: " + m_words.cutText(true), BodyFont, Dim, 13);
        addText(concatenated({m_document.rate, ", ", time(totals.before), " before, ", time(totals.after), " after, ",
                              m_words.change(totals.after - totals.before), ", ", counted(totals.steps, "step")}),
                BodyFont, Ink, 13);
        addText(concatenated({time(totals.lifted), " lifted, ", time(totals.inserted), " inserted, ",
                              time(totals.moved), " moved, ", time(totals.doubled), " doubled"}),
                BodyFont, Ink, 13);
        if (m_document.sound != nullptr) {
            for (const std::string& total : SoundWording(*m_document.sound).totals())
                addText("Sound: " + total, BodyFont, Ink, 13);
        }
        for (const std::string& line : m_words.settings())
            addText(line, BodyFont, Dim, 13);
        if (const std::string order = m_words.order(); !order.empty())
            addText(order, BodyFont, Ink, 13);
    }

    double xOf(std::int32_t frame) const
    {
        const std::int32_t longest =
            std::max({1, m_document.notes.oldCut().length(), m_document.notes.newCut().length()});
        return Margin + (m_right - Margin) * frame / longest;
    }

    void drawBox(const FrameSpan& frames, double top, const PdfColour& colour)
    {
        const Stretch stretch = stretchOf(frames);
        m_pages.box(stretch.left, top, stretch.right - stretch.left, StripHeight, colour);
    }

    /// The frames are wide enough to be seen.
    Stretch stretchOf(const FrameSpan& frames) const
    {
        const double left = xOf(frames.start);
        return {left, std::max(left + 0.3, xOf(frames.end()))};
    }

    /// Draws stretches that touch as one.
    void drawBoxes(std::vector<Stretch> stretches, double top, const PdfColour& colour)
    {
        std::sort(stretches.begin(), stretches.end(),
                  [](const Stretch& a, const Stretch& b) { return a.left < b.left; });
        for (std::size_t first = 0; first < stretches.size();) {
            double right = stretches[first].right;
            std::size_t next = first + 1;
            for (; next < stretches.size() && stretches[next].left <= right; ++next)
                right = std::max(right, stretches[next].right);
            m_pages.box(stretches[first].left, top, right - stretches[first].left, StripHeight, colour);
            first = next;
        }
    }

    void drawBand(const Band& band, double top)
    {
        m_pages.band(xOf(band.inOld.start), xOf(band.inOld.end()), top, xOf(band.inNew.start), xOf(band.inNew.end()),
                     top + BandHeight, band.colour);
    }

    void drawPicture(double top)
    {
        const double oldTop = top + 18;
        const double bandTop = oldTop + StripHeight;
        const double newTop = bandTop + BandHeight;
        m_pages.text(Margin, oldTop - 4, "old cut", SmallFont, Dim);
        drawLegend(newTop + StripHeight + 10);
        drawBox({0, m_document.notes.oldCut().length()}, oldTop, Kept);
        drawBox({0, m_document.notes.newCut().length()}, newTop, Kept);
        std::vector<Band> bands = allBands();
        std::string below = "new cut";
        if (bands.size() > MostBands) {
            below += concatenated(
                {", the ", std::to_string(MostBands), " longest of ", std::to_string(bands.size()), " bands"});
            keepLongest(bands);
        }
        m_pages.text(Margin, newTop + StripHeight + 10, below, SmallFont, Dim);
        for (const Band& band : bands)
            drawBand(band, bandTop);
        drawChanges(oldTop, newTop);
        if (m_document.notes.reels().size() > 1)
            drawReelStarts(oldTop, newTop);
    }

    /// What the colours mean, up to the right margin.
    void drawLegend(double y)
    {
        constexpr std::array Legend{std::pair{"kept", Kept},       std::pair{"moved", Moved},
                                    std::pair{"doubled", Doubled}, std::pair{"lifted", Lifted},
                                    std::pair{"new", Inserted},    std::pair{"new version", Version}};
        double right = m_right;
        for (auto entry = Legend.rbegin(); entry != Legend.rend(); ++entry) {
            const auto& [word, colour] = *entry;
            m_pages.textToRight(right, y, word, SmallFont, Dim);
            right -= m_pages.widthOf(word, SmallFont) + 9;
            m_pages.box(right, y - 6, 6, 6, colour);
            right -= 10;
        }
    }

    void drawReelStarts(double oldTop, double newTop)
    {
        const auto& reels = m_document.notes.reels();
        const auto mark = [this](const core::Programme& cut, std::size_t place, std::size_t reel, double top) {
            const double x = xOf(cut.reels()[place].start);
            m_pages.box(x, top, 0.7, StripHeight, Ink);
            const std::string number = std::to_string(reel + 1);
            // A short reel has no room for it.
            if (x + 2 + m_pages.widthOf(number, ReelFont) <= xOf(cut.reels()[place].end()))
                m_pages.text(x + 2, top + 9.5, number, ReelFont, White);
        };
        for (std::size_t reel = 0; reel < reels.size(); ++reel) {
            if (reels[reel].pair.oldReel)
                mark(m_document.notes.oldCut(), *reels[reel].pair.oldReel, reel, oldTop);
            if (reels[reel].pair.newReel)
                mark(m_document.notes.newCut(), *reels[reel].pair.newReel, reel, newTop);
        }
    }

    /// What the steps take out of the old strip and put into the new one.
    void drawChanges(double oldTop, double newTop)
    {
        std::vector<Stretch> lifted;
        std::vector<Stretch> inserted;
        std::vector<Stretch> versions;
        for (const core::ReelNotes& reel : m_document.notes.reels()) {
            for (const NoteEntry& entry : reel.entries) {
                const core::NoteStep* const step = entry.step();
                if (step == nullptr || step->action == core::StepAction::Move)
                    continue;
                for (const FrameSpan& removed : step->removedFrames)
                    lifted.push_back(stretchOf(removed));
                if (step->inserted.length > 0)
                    (step->action == core::StepAction::Relabel ? versions : inserted)
                        .push_back(stretchOf(step->inserted));
            }
        }
        drawBoxes(std::move(lifted), oldTop, Lifted);
        drawBoxes(std::move(inserted), newTop, Inserted);
        drawBoxes(std::move(versions), newTop, Version);
    }

    /// In the new cut, in order.
    std::vector<FrameSpan> spansOfMoves() const
    {
        std::vector<FrameSpan> moves;
        for (const core::ReelNotes& reel : m_document.notes.reels()) {
            for (const NoteEntry& entry : reel.entries) {
                if (entry.step() != nullptr && entry.step()->action == core::StepAction::Move)
                    moves.push_back(*entry.step()->changes.front().inNew);
            }
        }
        std::sort(moves.begin(), moves.end(), [](const FrameSpan& a, const FrameSpan& b) { return a.start < b.start; });
        return moves;
    }

    /// In the order in which they are drawn: what has moved lies over what stays.
    std::vector<Band> allBands() const
    {
        const std::vector<FrameSpan> moves = spansOfMoves();
        std::vector<Band> bands;
        std::vector<Band> over;
        for (const core::ReelNotes& reel : m_document.notes.reels()) {
            for (const NoteEntry& entry : reel.entries) {
                if (const core::KeptStretch* const kept = entry.kept()) {
                    const bool isMoved = isIn(moves, kept->newStart);
                    (isMoved ? over : bands)
                        .push_back({{kept->oldStart, kept->length},
                                    {kept->newStart, kept->length},
                                    isMoved ? Moved : Staying});
                }
                addDoubled(entry, over);
            }
        }
        bands.insert(bands.end(), over.begin(), over.end());
        return bands;
    }

    /// Whether one of the spans, which are in order, has the frame.
    static bool isIn(const std::vector<FrameSpan>& spans, std::int32_t frame)
    {
        const auto after = std::upper_bound(spans.begin(), spans.end(), frame,
                                            [](std::int32_t at, const FrameSpan& span) { return at < span.start; });
        return after != spans.begin() && frame < std::prev(after)->end();
    }

    static void addDoubled(const NoteEntry& entry, std::vector<Band>& bands)
    {
        if (entry.step() == nullptr || entry.step()->action == core::StepAction::Move)
            return;
        for (const PictureChange& change : entry.step()->changes) {
            if (change.kind == core::ChangeKind::Doubled)
                bands.push_back({*change.inOld, *change.inNew, Doubled});
        }
    }

    /// Of equal ones the first. They stay in their order.
    static void keepLongest(std::vector<Band>& bands)
    {
        std::vector<std::size_t> order(bands.size());
        std::iota(order.begin(), order.end(), std::size_t{0});
        std::stable_sort(order.begin(), order.end(), [&bands](std::size_t a, std::size_t b) {
            return bands[a].inNew.length > bands[b].inNew.length;
        });
        order.resize(MostBands);
        std::sort(order.begin(), order.end());
        std::vector<Band> longest;
        longest.reserve(order.size());
        for (const std::size_t index : order)
            longest.push_back(bands[index]);
        bands = std::move(longest);
    }

    void addLargest()
    {
        const auto steps = m_document.notes.largestSteps();
        if (steps.empty()) {
            addText(m_words.nothingHasChanged(), BodyFont, Ink, 16);
            return;
        }
        addText("The largest changes", HeadingFont, Ink, 24, true);
        for (const NoteEntry* const entry : steps) {
            addText(concatenated({"step ", std::to_string(entry->number), ": ", m_words.action(*entry), ", ",
                                  m_words.shotsOf(*entry)}),
                    BodyFont, Ink, 12.5);
            if (const core::StepSound* const sound = m_words.soundOf(*entry); sound != nullptr && !sound->isEmpty())
                addText("        sound: " + SoundWording::shortSummary(*sound), SmallFont, Dim, 11);
        }
    }

    /// A line a reel where there are several.
    void addReels()
    {
        const auto& reels = m_document.notes.reels();
        if (reels.size() < 2)
            return;
        addText("The reels", HeadingFont, Ink, 24, true);
        const auto line = [this](const std::array<std::string, 6>& cells, const PdfFont& font,
                                 const PdfColour& colour) {
            add(11.5, [cells, font, colour](PdfPages& pages, double top) {
                constexpr std::array Rights{24.0, 98.0, 172.0, 246.0, 324.0, 364.0};
                for (std::size_t cell = 0; cell < cells.size(); ++cell)
                    pages.textToRight(Margin + Rights[cell], top + 8.5, cells[cell], font, colour);
            });
        };
        line({"reel", "begins", "before", "after", "change", "steps"}, SmallFont, Dim);
        for (std::size_t reel = 0; reel < reels.size(); ++reel) {
            const std::size_t steps = m_words.stepsOf(reel);
            line({std::to_string(reel + 1), m_words.reelStart(reel), m_words.timecode(reels[reel].before),
                  m_words.timecode(reels[reel].after), m_words.change(reels[reel].after - reels[reel].before),
                  std::to_string(steps)},
                 TimeFont, reels[reel].isUnchanged() ? Dim : Ink);
        }
    }

    void addReel(std::size_t reel)
    {
        addText(m_words.reelTitle(reel), HeadingFont, Ink, 32, true);
        addText(m_words.reelLengths(reel), BodyFont, Dim, 13, true);
        add(
            18, [this](PdfPages&, double top) { drawColumnTitles(top); }, true);
        const std::size_t first = m_pieces.size();
        for (const NoteEntry& entry : m_document.notes.reels()[reel].entries)
            addRow(entry, reel);
        for (std::size_t piece = first; piece < m_pieces.size(); ++piece)
            m_pieces[piece].reel = reel;
        // No heading stands alone with what is kept at the start of the reel.
        if (m_pieces.size() > first + 1)
            m_pieces[first].goesWithNext = true;
    }

    void drawColumnTitles(double top)
    {
        const double y = top + 11;
        m_pages.textToRight(Margin + 20, y, "step", SmallFont, Dim);
        m_pages.text(Margin + 28, y, "at", SmallFont, Dim);
        m_pages.text(Margin + 92, y, "what to do, and what changes", SmallFont, Dim);
        m_pages.textToRight(m_lengthRight, y, "length", SmallFont, Dim);
        m_pages.textToRight(m_right, y, "offset", SmallFont, Dim);
        m_pages.rule(Margin, top + 15, m_right - Margin, 0.5, Rule);
    }

    /// Above the rows of a reel that goes on from the page before.
    void drawContinued(std::size_t reel)
    {
        m_pages.text(Margin, Margin + 8, concatenated({"Reel ", std::to_string(reel + 1), ", continued"}), SmallFont,
                     Dim);
        drawColumnTitles(Margin + 10);
    }

    void addRow(const NoteEntry& entry, std::size_t reel)
    {
        if (entry.step() == nullptr) {
            Lines shots;
            if (entry.moveEnd() != nullptr)
                shots.emplace_back(m_words.describe(entry.moveEnd()->move).shot, Dim);
            const double height = 10.5 + static_cast<double>(shots.size()) * LineHeight;
            add(height, [this, &entry, reel, shots = std::move(shots)](PdfPages& pages, double top) {
                drawTimes(entry, reel, top + 8, SmallTimeFont, Dim);
                drawLines(pages, shots, top + 8);
            });
            return;
        }
        const Lines lines = linesOf(entry);
        for (std::size_t first = 0; first < lines.size(); first += MostLinesOfAPiece) {
            const std::size_t end = std::min(lines.size(), first + MostLinesOfAPiece);
            Lines piece(lines.begin() + static_cast<std::ptrdiff_t>(first),
                        lines.begin() + static_cast<std::ptrdiff_t>(end));
            const double head = first == 0 ? 10 : 0;
            const double foot = end == lines.size() ? 5 : 0;
            const double height = head + static_cast<double>(piece.size()) * LineHeight + foot;
            add(height, [this, &entry, reel, head, foot, piece = std::move(piece)](PdfPages& pages, double top) {
                if (head > 0)
                    drawTimes(entry, reel, top + head, TimeFont, Ink);
                const double bottom = drawLines(pages, piece, top + head);
                if (foot > 0)
                    pages.rule(Margin, bottom + 4, m_right - Margin, 0.4, Rule);
            });
        }
    }

    /// Gives the base line of the last one.
    double drawLines(PdfPages& pages, const Lines& lines, double y)
    {
        for (const auto& [text, colour] : lines) {
            y += LineHeight;
            pages.text(Margin + 92, y, pages.fitting(text, SmallFont, m_right - Margin - 92), SmallFont, colour);
        }
        return y;
    }

    Lines linesOf(const NoteEntry& entry)
    {
        Lines lines;
        for (const PictureChange& change : entry.step()->changes) {
            const ChangeWords words = m_words.describe(change);
            const std::string text =
                concatenated({words.shot, ": ", words.what, words.more.empty() ? "" : ", ", words.more});
            addWrapped(text, Ink, lines);
        }
        if (entry.step()->joined > 1)
            lines.emplace_back(
                concatenated({"joined from ", std::to_string(entry.step()->joined), " steps whose trims cancel out"}),
                Dim);
        if (const std::string feet = m_words.inFeet(entry); m_document.layout.showsFeet && !feet.empty())
            addWrapped(feet, Dim, lines);
        if (const core::StepSound* const sound = m_words.soundOf(entry))
            addSound(*sound, lines);
        return lines;
    }

    void addWrapped(const std::string& text, const PdfColour& colour, Lines& lines)
    {
        for (const std::string& line : m_pages.wrapped(text, SmallFont, m_right - Margin - 92))
            lines.emplace_back(line, colour);
    }

    void addSound(const core::StepSound& sound, Lines& lines)
    {
        if (!sound.scenes.empty())
            addWrapped("scene: " + SoundWording::scenes(sound), Dim, lines);
        if (sound.isEmpty())
            return;
        const SoundWording words(*m_document.sound);
        addWrapped("sound: " + words.summary(sound), Ink, lines);
        for (const SoundLine& line : words.lines(sound))
            addWrapped(concatenated({"    ", line.time, "  ", line.name, ": ", line.whatAndMore()}), Dim, lines);
        if (const std::string rest = SoundWording::rest(sound); !rest.empty())
            lines.emplace_back("    " + rest, Dim);
    }

    void addElsewhere()
    {
        if (m_document.sound == nullptr || m_document.sound->notes.elsewhere().isEmpty())
            return;
        addText(std::string(SoundWording::ElsewhereTitle), HeadingFont, Ink, 32, true);
        Lines lines;
        addSound(m_document.sound->notes.elsewhere(), lines);
        for (const auto& [text, colour] : lines)
            addText(text, SmallFont, colour, 10.5);
    }

    void drawTimes(const NoteEntry& entry, std::size_t reel, double y, const PdfFont& font, const PdfColour& colour)
    {
        if (entry.number > 0)
            m_pages.textToRight(Margin + 20, y, std::to_string(entry.number), BodyFont, colour);
        m_pages.text(Margin + 28, y, m_words.timeOf(entry, reel), font, colour);
        m_pages.text(Margin + 92, y, m_words.action(entry), font, colour);
        if (entry.lengthChange != 0)
            m_pages.textToRight(m_lengthRight, y, m_words.change(entry.lengthChange), font, colour);
        m_pages.textToRight(m_right, y, m_words.offsetInColumn(entry, reel), font, colour);
    }

    void addRemarks()
    {
        const std::vector<std::string> lines = m_words.remarks();
        if (lines.empty())
            return;
        addText("Healed, doubted and passed over", HeadingFont, Ink, 32, true);
        for (const std::string& line : lines)
            addText(line, BodyFont, Ink, 12.5);
    }

    /// The places of the pieces after the last one of each page.
    std::vector<std::size_t> pageEnds() const
    {
        const double room = m_pages.height() - 2 * Margin - FootHeight;
        std::vector<std::size_t> ends;
        double used = 0;
        for (std::size_t piece = 0; piece < m_pieces.size(); ++piece) {
            double needed = m_pieces[piece].height;
            for (std::size_t next = piece; m_pieces[next].goesWithNext && next + 1 < m_pieces.size(); ++next)
                needed += m_pieces[next + 1].height;
            if (used > 0 && used + needed > room) {
                ends.push_back(piece);
                used = m_pieces[piece].reel ? ContinuedHeight : 0;
            }
            used += m_pieces[piece].height;
        }
        ends.push_back(m_pieces.size());
        return ends;
    }

    void drawPages()
    {
        const std::vector<std::size_t> ends = pageEnds();
        const std::string cuts = m_words.bothCuts();
        std::size_t piece = 0;
        for (std::size_t page = 0; page < ends.size(); ++page) {
            double top = Margin;
            if (piece < m_pieces.size() && m_pieces[piece].reel) {
                drawContinued(*m_pieces[piece].reel);
                top += ContinuedHeight;
            }
            for (; piece < ends[page]; ++piece) {
                m_pieces[piece].draw(m_pages, top);
                top += m_pieces[piece].height;
            }
            const double y = m_pages.height() - Margin;
            m_pages.text(Margin, y, m_pages.fitting(cuts, SmallFont, m_right - Margin - 70), SmallFont, Dim);
            m_pages.textToRight(m_right, y,
                                concatenated({"page ", std::to_string(page + 1), " of ", std::to_string(ends.size())}),
                                SmallFont, Dim);
            m_pages.endPage();
        }
    }

    const NotesDocument& m_document;
    NotesWording m_words;
    PdfPages m_pages;
    double m_right;
    double m_lengthRight;
    std::vector<Piece> m_pieces;
};

} // namespace

void writeNotesPdf(const NotesDocument& document, const NotesSink& sink)
{
    PdfForm(document, sink).write();
}

} // namespace cadrel::app
