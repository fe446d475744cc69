// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/figures/NotesReplay.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <stdexcept>
#include <utility>

namespace cadrel::tests {

using nlohmann::json;

namespace {

int timeOf(const json& timecode)
{
    return framesOfTimecode(timecode.get<std::string>());
}

int intOf(const json& row, const char* key)
{
    return row.at(key).get<int>();
}

bool isConsecutive(const std::vector<int>& frames, int first, int count)
{
    for (int frame = first; frame < first + count; ++frame) {
        if (std::find(frames.begin(), frames.end(), frame) == frames.end())
            return false;
    }
    return count > 0;
}

std::string framesText(int frames)
{
    return std::string(frames < 0 ? "-" : "+") + std::to_string(std::abs(frames)) +
           (std::abs(frames) == 1 ? " frame" : " frames");
}

} // namespace

NotesReplay::NotesReplay(const json& notes, const EdlFrames& oldCut, const EdlFrames& newCut)
    : m_notes(notes), m_oldCut(oldCut), m_newCut(newCut)
{
    for (const json& reel : notes.at("reels")) {
        Table table;
        if (!reel.at("old").is_null()) {
            const std::size_t place = oldCut.reelAt(timeOf(reel.at("old").at("start")));
            const int count = static_cast<int>(oldCut.reels()[place].frames.size());
            check(intOf(reel.at("old"), "frames") == count, "old length", reel.at("old"));
            for (int frame = 0; frame < count; ++frame)
                table.push_back({oldCut.startOf(place) + frame, false});
        }
        m_bases.push_back(timeOf((reel.at("old").is_null() ? reel.at("new") : reel.at("old")).at("start")));
        m_before.push_back(static_cast<int>(table.size()));
        m_tables.push_back(std::move(table));
    }
    for (std::size_t reel = 0; reel < m_tables.size(); ++reel) {
        for (const json& row : notes.at("reels")[reel].at("rows"))
            carryOutRow(row, reel);
    }
    lookAtResult();
    lookAtMoves();
    lookAtTotals();
}

void NotesReplay::check(bool isRight, const std::string& what, const json& where)
{
    if (!isRight)
        m_faults.push_back(what + ": " + where.dump());
}

/// The reel of a place whose figures agree. An empty reel begins where its first picture is put.
std::size_t NotesReplay::placeIn(const json& place)
{
    const auto reel = static_cast<std::size_t>(intOf(place, "reel") - 1);
    if (m_tables.at(reel).empty())
        m_bases.at(reel) = timeOf(place.at("timecode")) - intOf(place, "frame");
    check(timeOf(place.at("timecode")) == m_bases.at(reel) + intOf(place, "frame"), "timecode of a place", place);
    if (place.contains("feet")) {
        const int frame = intOf(place, "frame");
        const std::string rest = std::to_string(frame % 16);
        check(place.at("feet") == std::to_string(frame / 16) + "+" + (rest.size() == 1 ? "0" : "") + rest, "feet",
              place);
    }
    return reel;
}

void NotesReplay::carryOutRow(const json& row, std::size_t reel)
{
    if (row.at("row") == "kept") {
        check(intOf(row, "offsetFrames") == timeOf(row.at("newIn")) - timeOf(row.at("oldIn")), "offset of kept", row);
    } else if (row.at("row") == "moved") {
        lookAtMoveEnd(row, reel);
    } else {
        carryOut(row, reel);
        const int offset = static_cast<int>(m_tables[reel].size()) - m_before[reel];
        check(intOf(row, "offsetFrames") == offset, "offset is " + std::to_string(offset), row);
    }
    showRow(row, reel);
}

/// The other end of a step of a reel before this one. What has come stands there, and what has gone doesn't.
void NotesReplay::lookAtMoveEnd(const json& row, std::size_t reel)
{
    ++m_moveEnds;
    const bool isTarget = row.contains("fromReel");
    const auto step = std::find_if(m_moveSteps.begin(), m_moveSteps.end(),
                                   [&row](const json& move) { return move.at("number") == row.at("step"); });
    check(step != m_moveSteps.end(), "the other end of no move", row);
    if (step == m_moveSteps.end())
        return;
    const json& here = step->at(isTarget ? "at" : "from");
    const json& there = step->at(isTarget ? "from" : "at");
    check(placeIn(row.at("at")) == reel && here.at("reel") == row.at("at").at("reel") &&
              there.at("reel") == row.at(isTarget ? "fromReel" : "toReel") &&
              row.at("frames") == step->at("moveFrames"),
          "the other end of another move", row);
    check(intOf(row, "offsetFrames") == static_cast<int>(m_tables[reel].size()) - m_before[reel], "offset", row);
    if (!isTarget)
        return;
    const int first = m_oldCut.frameAt(timeOf(step->at("changes").at(0).at("old").at("in")));
    const Piece& piece = m_tables[reel].at(static_cast<std::size_t>(intOf(row.at("at"), "frame")));
    check(!piece.isNew && piece.frame == first, "what is moved isn't at its other end", row);
}

void NotesReplay::carryOut(const json& step, std::size_t reel)
{
    check(intOf(step, "number") == ++m_steps, "number", step);
    const int before = static_cast<int>(m_tables[reel].size());
    m_removed.clear();
    m_inserted.clear();
    if (step.at("action") == "move-reel")
        moveReel(step);
    placeIn(step.at("at"));
    if (step.at("action") == "move")
        move(step);
    else if (step.at("action") == "replace")
        replace(step);
    check(intOf(step, "lengthChangeFrames") == static_cast<int>(m_tables[reel].size()) - before, "change of length",
          step);
    lookAtChanges(step);
    lookAtTimeline(step);
}

/// No reel lies on another where all of them are on one timeline.
void NotesReplay::lookAtTimeline(const json& step)
{
    std::vector<std::pair<int, int>> reels;
    for (std::size_t reel = 0; reel < m_tables.size(); ++reel) {
        if (!m_tables[reel].empty())
            reels.emplace_back(m_bases[reel], m_bases[reel] + static_cast<int>(m_tables[reel].size()));
    }
    std::sort(reels.begin(), reels.end());
    for (std::size_t next = 1; next < reels.size(); ++next)
        check(reels[next - 1].second <= reels[next].first, "a reel lies on another", step);
}

/// Before it the reel begins where it did until then.
void NotesReplay::moveReel(const json& step)
{
    const auto reel = static_cast<std::size_t>(intOf(step.at("at"), "reel") - 1);
    check(placeIn(step.at("from")) == reel && intOf(step.at("from"), "frame") == 0, "where a reel began", step);
    check(!m_tables.at(reel).empty(), "a reel without picture is moved", step);
    m_bases.at(reel) += intOf(step.at("changes").at(0), "frames");
    check(placeIn(step.at("at")) == reel && intOf(step.at("at"), "frame") == 0, "where a reel begins", step);
    m_extents[m_steps] = 0;
}

void NotesReplay::replace(const json& step)
{
    Table& table = m_tables.at(placeIn(step.at("at")));
    const int place = intOf(step.at("at"), "frame");
    const int removed = intOf(step, "deleteFrames");
    const int inserted = intOf(step, "insertFrames");
    if (place < 0 || place + removed > static_cast<int>(table.size()))
        throw std::runtime_error("a step that can't be carried out: " + step.dump());
    const auto at = table.begin() + place;
    for (auto piece = at; piece != at + removed; ++piece) {
        check(!piece->isNew, "deletes what was put in", step);
        m_removed.push_back(piece->frame);
    }
    table.erase(at, at + removed);
    Table pieces;
    if (inserted > 0) {
        const int first = m_newCut.frameAt(timeOf(step.at("insertFrom")));
        for (int frame = first; frame < first + inserted; ++frame) {
            pieces.push_back({frame, true});
            m_inserted.push_back(frame);
        }
    }
    table.insert(table.begin() + place, pieces.begin(), pieces.end());
    m_deletedFrames += removed;
    m_insertedFrames += inserted;
    m_extents[m_steps] = std::max(removed, inserted);
}

void NotesReplay::move(const json& step)
{
    const int length = intOf(step, "moveFrames");
    const int place = intOf(step.at("at"), "frame");
    const int from = intOf(step.at("from"), "frame");
    Table& source = m_tables.at(placeIn(step.at("from")));
    if (from < 0 || from + length > static_cast<int>(source.size()))
        throw std::runtime_error("a move that can't be carried out: " + step.dump());
    const Table pieces(source.begin() + from, source.begin() + from + length);
    source.erase(source.begin() + from, source.begin() + from + length);
    Table& target = m_tables.at(placeIn(step.at("at")));
    if (place < 0 || place > static_cast<int>(target.size()))
        throw std::runtime_error("a move that can't be carried out: " + step.dump());
    target.insert(target.begin() + place, pieces.begin(), pieces.end());
    check(intOf(step, "deleteFrames") == 0 && intOf(step, "insertFrames") == 0, "a move that deletes", step);
    const json& change = step.at("changes").at(0);
    m_moves.push_back(change);
    if (step.at("at").at("reel") != step.at("from").at("reel"))
        m_moveSteps.push_back(step);
    check(change.at("kind") == "moved" && intOf(change, "frames") == length &&
              intOf(change.at("old"), "frames") == length &&
              pieces.front().frame == m_oldCut.frameAt(timeOf(change.at("old").at("in"))),
          "what is moved", step);
    m_movedFrames += length;
    m_extents[m_steps] = length;
}

void NotesReplay::lookAtChanges(const json& step)
{
    int lost = 0;
    int won = 0;
    bool isSimple = step.at("action") == "replace";
    for (const json& change : step.at("changes")) {
        lookAtChange(change, step);
        const std::string kind = change.at("kind");
        const int frames = intOf(change, "frames");
        const bool isInPlace = kind == "replaced" || kind == "unchanged" || kind == "version-changed";
        if (kind == "head-trimmed" || kind == "tail-trimmed") {
            lost += std::max(0, -frames);
            won += std::max(0, frames);
        } else if (kind == "lifted" || isInPlace) {
            lost += frames;
        }
        if (kind == "inserted" || kind == "doubled" || isInPlace)
            won += frames;
        // A shot that is retimed, or a transition, changes frames without a loss of its own.
        isSimple = isSimple && kind != "retimed" && !kind.starts_with("transition");
    }
    if (isSimple)
        check(lost == intOf(step, "deleteFrames") && won == intOf(step, "insertFrames"),
              "the changes don't make the step: " + std::to_string(lost) + ", " + std::to_string(won), step);
}

void NotesReplay::lookAtChange(const json& change, const json& step)
{
    const std::string kind = change.at("kind");
    const int frames = intOf(change, "frames");
    if (change.contains("oldShot"))
        lookAtShot(change.at("oldShot"), m_oldCut);
    if (change.contains("newShot"))
        lookAtShot(change.at("newShot"), m_newCut);
    const auto oldIn = [&change] { return timeOf(change.at("old").at("in")); };
    const auto newIn = [&change] { return timeOf(change.at("new").at("in")); };
    const std::string length = timecodeOfFrames(std::abs(frames));
    if (kind == "lifted" || kind == "replaced" || kind == "unchanged")
        check(intOf(change.at("old"), "frames") == frames &&
                  isConsecutive(m_removed, m_oldCut.frameAt(oldIn()), frames),
              "what is lifted", step);
    if (kind == "inserted" || kind == "replaced" || kind == "doubled" || kind == "unchanged")
        check(intOf(change.at("new"), "frames") == frames &&
                  isConsecutive(m_inserted, m_newCut.frameAt(newIn()), frames),
              "what is inserted", step);
    if (kind == "lifted") {
        m_phrases.push_back((change.contains("part") ? "lifted part " : "lifted ") + length);
        m_phrases.push_back(" at " + timecodeOfFrames(oldIn()));
    } else if (kind == "inserted") {
        m_phrases.push_back("inserted " + length);
        lookAtSource(change);
    } else if (kind == "replaced") {
        m_phrases.push_back("replaced " + length);
        lookAtSource(change);
    } else if (kind == "moved") {
        m_phrases.push_back("moved " + length);
        m_phrases.push_back("in the old cut at " + timecodeOfFrames(oldIn()));
    } else if (kind == "unchanged") {
        ++m_unchanged;
        m_phrases.push_back("unchanged " + length);
        for (int frame = 0; frame < frames; ++frame)
            check(m_oldCut.at(m_oldCut.frameAt(oldIn()) + frame)
                      .looksLike(m_newCut.at(m_newCut.frameAt(newIn()) + frame)),
                  "what is unchanged", step);
    } else if (kind == "doubled") {
        m_doubledFrames += frames;
        for (int frame = 0; frame < frames; ++frame)
            check(m_oldCut.at(m_oldCut.frameAt(oldIn()) + frame)
                      .looksLike(m_newCut.at(m_newCut.frameAt(newIn()) + frame)),
                  "what is doubled", step);
        m_phrases.push_back("once more " + length);
    } else if (kind == "version-changed") {
        for (int frame = 0; frame < frames; ++frame) {
            const PictureFrame& was = m_oldCut.at(m_oldCut.frameAt(oldIn()) + frame);
            const PictureFrame& now = m_newCut.at(m_newCut.frameAt(newIn()) + frame);
            check(was.looksLike(now) && was.version != now.version, "no other version", step);
        }
    } else if (kind == "retimed") {
        const int was = static_cast<int>(std::lround(change.at("oldShot").at("speed").get<double>() * 100));
        const int now = static_cast<int>(std::lround(change.at("newShot").at("speed").get<double>() * 100));
        check(was != now, "no other speed", step);
        const auto isFreeze = [&change](const char* shot) {
            return timeOf(change.at(shot).at("srcOut")) - timeOf(change.at(shot).at("srcIn")) <= 1;
        };
        if (!isFreeze("oldShot") && !isFreeze("newShot"))
            m_phrases.push_back("speed " + std::to_string(was) + " now " + std::to_string(now) + " %");
        lookAtSource(change);
    } else if (kind == "head-trimmed" || kind == "tail-trimmed") {
        lookAtTrim(change);
        m_phrases.push_back((kind == "head-trimmed" ? "head " : "tail ") + framesText(frames));
    }
}

/// The source that new picture begins with, in the line of its EDL.
void NotesReplay::lookAtSource(const json& change)
{
    check(change.contains("sourceIn") == change.contains("newShot"), "a source without a shot", change);
    if (!change.contains("sourceIn"))
        return;
    const int first = timeOf(change.at("new").at("in"));
    const WrittenEvent& event = *m_newCut.at(m_newCut.frameAt(first)).event;
    const double source = event.srcIn + (first - event.dstIn) * event.speed;
    check(std::abs(timeOf(change.at("sourceIn")) - source) < (event.speed == 1.0 ? 1e-6 : 1.0),
          "the source is " + timecodeOfFrames(static_cast<int>(source)), change);
    m_phrases.push_back("source " + change.at("sourceIn").get<std::string>());
}

/// Of a shot between two cuts, at its own speed, the source tells what was trimmed.
void NotesReplay::lookAtTrim(const json& change)
{
    if (!change.contains("oldShot") || !change.contains("newShot"))
        return;
    const json& was = change.at("oldShot");
    const json& now = change.at("newShot");
    const bool isHead = change.at("kind") == "head-trimmed";
    const char* const key = isHead ? "srcIn" : "srcOut";
    const auto isPlain = [](const json& shot) { return shot.at("transition") == "cut" && shot.at("speed") == 1.0; };
    // Its other end may meet a transition, which takes a half of it, and a part of it may stand elsewhere.
    if (!isPlain(was) || !isPlain(now) || !change.contains("old") || !change.contains("new"))
        return;
    const int won = isHead ? timeOf(was.at(key)) - timeOf(now.at(key)) : timeOf(now.at(key)) - timeOf(was.at(key));
    check(won == intOf(change, "frames"), "the trim is " + std::to_string(won), change);
}

/// Every figure of a shot stands in a line of its EDL.
void NotesReplay::lookAtShot(const json& shot, const EdlFrames& cut)
{
    const auto& events = cut.events();
    const auto isWritten = [&shot](const WrittenEvent& event) {
        // The timecodes decide, whatever the motion line says.
        const double speed = static_cast<double>(event.srcOut - event.srcIn) / (event.dstOut - event.dstIn);
        const char* const transition = event.transition == "C" ? "cut" : event.transition == "D" ? "dissolve" : "wipe";
        return event.number == shot.at("event") && event.roll == shot.at("roll") && event.clip == shot.at("clip") &&
               timecodeOfFrames(event.srcIn) == shot.at("srcIn") &&
               timecodeOfFrames(event.srcOut) == shot.at("srcOut") && transition == shot.at("transition") &&
               event.duration == shot.at("transitionFrames") && event.file == shot.at("edlFile") &&
               std::abs(speed - shot.at("speed").get<double>()) < 0.01;
    };
    check(std::any_of(events.begin(), events.end(), isWritten), "no such shot", shot);
}

/// The table is the new cut now, and what is kept on it is what the rows say.
void NotesReplay::lookAtResult()
{
    std::vector<KeptRun> runs;
    std::vector<KeptRun> told;
    int kept = 0;
    for (std::size_t reel = 0; reel < m_tables.size(); ++reel) {
        const json& pair = m_notes.at("reels")[reel];
        for (const json& row : pair.at("rows")) {
            if (row.at("row") == "kept")
                told.push_back({m_oldCut.frameAt(timeOf(row.at("oldIn"))), m_newCut.frameAt(timeOf(row.at("newIn"))),
                                intOf(row, "frames")});
        }
        if (pair.at("new").is_null()) {
            check(m_tables[reel].empty(), "a reel that is gone has frames", pair.at("old"));
            continue;
        }
        const std::size_t place = m_newCut.reelAt(timeOf(pair.at("new").at("start")));
        const int first = m_newCut.startOf(place);
        const auto length = m_newCut.reels()[place].frames.size();
        check(m_tables[reel].size() == length && pair.at("new").at("frames") == length, "new length", pair.at("new"));
        check(timeOf(pair.at("new").at("start")) == m_bases[reel], "a reel begins elsewhere", pair.at("new"));
        bool isRunning = false;
        for (int frame = 0; frame < static_cast<int>(std::min(length, m_tables[reel].size())); ++frame) {
            const Piece& piece = m_tables[reel][static_cast<std::size_t>(frame)];
            if (piece.isNew) {
                check(piece.frame == first + frame, "a frame of another place", pair.at("new"));
                isRunning = false;
                continue;
            }
            ++kept;
            check(m_oldCut.at(piece.frame).looksLike(m_newCut.at(first + frame)),
                  "another picture at frame " + std::to_string(frame), pair.at("new"));
            // A run lies within one reel of the old cut, too.
            if (isRunning &&
                m_oldCut.timecodeOf(piece.frame) == m_oldCut.timecodeOf(runs.back().inOld) + runs.back().length)
                ++runs.back().length;
            else
                runs.push_back({piece.frame, first + frame, 1});
            isRunning = true;
        }
    }
    check(runs == told, "the kept stretches are others", json(runs.size()));
    check(intOf(m_notes.at("totals"), "keptFrames") == kept, "kept is " + std::to_string(kept), m_notes.at("totals"));
}

/// Where the first and the last frame of a move have come to lie, whatever was put in or taken out between them.
void NotesReplay::lookAtMoves()
{
    std::map<int, int> placeOfOld;
    int place = 0;
    std::vector<const Table*> inOrder(m_newCut.reels().size());
    for (std::size_t reel = 0; reel < m_tables.size(); ++reel) {
        const json& now = m_notes.at("reels")[reel].at("new");
        if (!now.is_null())
            inOrder[m_newCut.reelAt(timeOf(now.at("start")))] = &m_tables[reel];
    }
    for (const Table* const table : inOrder) {
        for (const Piece& piece : *table) {
            if (!piece.isNew)
                placeOfOld[piece.frame] = place;
            ++place;
        }
    }
    for (const json& move : m_moves) {
        const int first = m_oldCut.frameAt(timeOf(move.at("old").at("in")));
        const int last = first + intOf(move.at("old"), "frames") - 1;
        const int newFirst = m_newCut.frameAt(timeOf(move.at("new").at("in")));
        check(placeOfOld.contains(first) && placeOfOld.at(first) == newFirst, "where a move begins", move);
        check(placeOfOld.contains(last) && placeOfOld.at(last) == newFirst + intOf(move.at("new"), "frames") - 1,
              "where a move ends", move);
    }
}

void NotesReplay::lookAtTotals()
{
    const json& totals = m_notes.at("totals");
    const int kept = intOf(totals, "keptFrames");
    check(intOf(totals, "framesBefore") == m_oldCut.length(), "length before", totals);
    check(intOf(totals, "framesAfter") == m_newCut.length(), "length after", totals);
    check(intOf(totals, "liftedFrames") == m_deletedFrames && m_deletedFrames == m_oldCut.length() - kept, "lifted",
          totals);
    check(intOf(totals, "doubledFrames") == m_doubledFrames, "doubled", totals);
    check(intOf(totals, "insertedFrames") == m_insertedFrames - m_doubledFrames, "inserted", totals);
    check(intOf(totals, "movedFrames") == m_movedFrames, "moved", totals);
    check(intOf(totals, "steps") == m_steps, "steps", totals);
    check(totals.at("reels") == m_tables.size(), "reels", totals);
    check(m_moveEnds == static_cast<int>(m_moveSteps.size()), "other ends of moves", totals);
    check(m_notes.at("largest").get<std::vector<int>>() == largest(), "largest", m_notes.at("largest"));
    for (const auto& [side, cut] : {std::pair{"old", &m_oldCut}, std::pair{"new", &m_newCut}})
        check(m_notes.at(side).at("events") == cut->events().size() && m_notes.at(side).at("invalid") == 0,
              "number of events", m_notes.at(side));
}

std::vector<int> NotesReplay::largest() const
{
    constexpr std::size_t Most = 10;
    std::vector<std::pair<int, int>> byExtent;
    for (int step = 1; step <= m_steps; ++step)
        byExtent.emplace_back(m_extents.contains(step) ? -m_extents.at(step) : 0, step);
    std::sort(byExtent.begin(), byExtent.end());
    std::vector<int> numbers;
    for (std::size_t place = 0; place < std::min(Most, byExtent.size()); ++place)
        numbers.push_back(byExtent[place].second);
    return numbers;
}

void NotesReplay::showRow(const json& row, std::size_t reel)
{
    const auto length = [&row](const char* key) { return timecodeOfFrames(intOf(row, key)); };
    const std::string offset = signedTimecode(static_cast<int>(m_tables[reel].size()) - m_before[reel]);
    if (row.at("row") == "kept") {
        m_rows.push_back({row.at("newIn"), length("frames"), row.at("oldIn")});
        // By how much later it stands, which tells nothing of what has come from another reel.
        const json& old = m_notes.at("reels")[reel].at("old");
        const int place = old.is_null() ? -1 : timeOf(row.at("oldIn")) - timeOf(old.at("start"));
        if (place >= 0 && place < intOf(old, "frames"))
            m_rows.back().push_back(signedTimecode(timeOf(row.at("newIn")) - timeOf(row.at("oldIn"))));
        return;
    }
    if (row.at("row") == "moved") {
        m_rows.push_back({row.at("at").at("timecode"), length("frames"), offset});
        return;
    }
    std::vector<std::string> times{row.at("at").at("timecode")};
    if (row.at("action") == "move") {
        const json& at = row.at("at");
        const json& from = row.at("from");
        const bool isFromThisReel = from.at("reel") == static_cast<int>(reel) + 1;
        const bool goesOn = at.at("reel") != static_cast<int>(reel) + 1 ||
                            (isFromThisReel && intOf(from, "frame") < intOf(at, "frame"));
        times = {(goesOn ? from : at).at("timecode"), length("moveFrames"), (goesOn ? at : from).at("timecode")};
    } else if (row.at("action") == "move-reel") {
        times = {row.at("from").at("timecode"), row.at("at").at("timecode")};
    } else if (row.at("action") == "relabel") {
        times.push_back(length("insertFrames"));
    } else {
        const int deleted = intOf(row, "deleteFrames");
        if (deleted > 0)
            times.push_back(length("deleteFrames"));
        if (intOf(row, "insertFrames") > 0 && intOf(row, "insertFrames") != deleted)
            times.push_back(length("insertFrames"));
    }
    if (intOf(row, "lengthChangeFrames") != 0)
        times.push_back(signedTimecode(intOf(row, "lengthChangeFrames")));
    times.push_back(offset);
    m_rows.push_back(times);
}

} // namespace cadrel::tests
