// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/figures/PrintedNotes.h"

#include "tests/app/figures/EdlFrames.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <initializer_list>
#include <set>

namespace cadrel::tests {

using nlohmann::json;

namespace {

constexpr std::size_t ColumnsOfAName = 39;

/// What isn't empty, with a blank between.
std::string line(std::initializer_list<std::string> words)
{
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() || word.empty() ? "" : " ") + word;
    return text;
}

std::string cutTo(const std::string& name, std::size_t columns)
{
    return name.size() <= columns ? name : name.substr(0, columns - 1) + "…";
}

std::string nameOf(const json& shot)
{
    const std::string clip = shot.at("clip");
    return cutTo(clip.empty() ? shot.at("roll").get<std::string>() : clip, ColumnsOfAName);
}

std::string withMore(const std::string& name, std::size_t more)
{
    if (more == 0)
        return name;
    const std::string text = " and " + std::to_string(more) + " more";
    return cutTo(name, ColumnsOfAName - text.size()) + text;
}

std::string counted(std::size_t count, const std::string& what)
{
    return std::to_string(count) + " " + what + (count == 1 ? "" : "s");
}

std::string percent(const json& shot)
{
    return std::to_string(std::lround(shot.at("speed").get<double>() * 100));
}

/// A length with its sign; zero has none.
std::string lengthChange(int frames)
{
    return frames == 0 ? timecodeOfFrames(0) : signedTimecode(frames);
}

std::string length(const json& row, const char* key)
{
    return timecodeOfFrames(row.at(key).get<int>());
}

std::string feet(int frame)
{
    const std::string rest = std::to_string(frame % 16);
    return std::to_string(frame / 16) + "+" + (rest.size() == 1 ? "0" : "") + rest;
}

std::string through(int first, int frames)
{
    return feet(first) + " through " + feet(first + frames - 1);
}

std::string feetOf(const json& step)
{
    const int place = step.at("at").at("frame");
    if (step.at("action") == "move") {
        const auto reelOf = [&step](const char* end) {
            const bool isNamed = step.at("from").at("reel") != step.at("at").at("reel");
            return isNamed ? " of reel " + std::to_string(step.at(end).at("reel").get<int>()) : std::string();
        };
        return "take out " + through(step.at("from").at("frame"), step.at("moveFrames")) + reelOf("from") +
               ", put in from " + feet(place) + reelOf("at");
    }
    const int removed = step.at("deleteFrames");
    const int inserted = step.at("insertFrames");
    if (step.at("action") == "move-reel")
        return {};
    if (step.at("action") == "relabel")
        return "new version from " + through(place, inserted);
    std::string text = removed == 0 ? "" : "delete " + through(place, removed);
    if (inserted > 0)
        text += (text.empty() ? "insert " : ", insert ") + through(place, inserted);
    return text;
}

std::string wipeOrDissolve(const json& shot)
{
    return shot.at("transition").get<std::string>() + " of " + std::to_string(shot.at("transitionFrames").get<int>());
}

/// Nothing where the change doesn't bring or take one with it.
std::string withTransition(const json& change, const char* side, const char* shot, const std::string& with)
{
    if (!change.contains(side))
        return {};
    const char* const frames = change.at(shot).at("transitionFrames") == 1 ? " frame" : " frames";
    return std::string(", ").append(with).append(wipeOrDissolve(change.at(shot))).append(frames);
}

int framesBetween(const json& shot, const char* in, const char* out)
{
    return framesOfTimecode(shot.at(out)) - framesOfTimecode(shot.at(in));
}

/// One frame of source at a speed of its own.
bool isFreeze(const json& shot)
{
    return framesBetween(shot, "srcIn", "srcOut") <= 1 && shot.at("speed") != 1.0;
}

std::string speedOf(const json& shot)
{
    return isFreeze(shot) ? "freeze" : "speed " + percent(shot) + " %";
}

std::string labelOf(const std::string& kind)
{
    static const std::map<std::string, std::string> labels{{"head-trimmed", "head"},
                                                           {"tail-trimmed", "tail"},
                                                           {"doubled", "doubled"},
                                                           {"retimed", "speed"},
                                                           {"version-changed", "version"},
                                                           {"transition-added", "transition"},
                                                           {"transition-removed", "transition"},
                                                           {"transition-changed", "transition"},
                                                           {"reel-moved", "reel"}};
    return labels.contains(kind) ? labels.at(kind) : kind;
}

std::string inQuotes(const std::string& cell)
{
    if (cell.find_first_of(",\"") == std::string::npos)
        return cell;
    std::string text = "\"";
    for (const char letter : cell)
        text += letter == '"' ? std::string("\"\"") : std::string(1, letter);
    return text + "\"";
}

/// Of seconds, to a hundredth of a frame.
std::string exactTimecode(double seconds)
{
    const long hundredths = std::lround(seconds * FramesASecond * 100);
    const std::string rest = std::to_string(100 + hundredths % 100).substr(1);
    return timecodeOfFrames(static_cast<int>(hundredths / 100)) + (rest == "00" ? "" : "." + rest);
}

double lengthOf(const json& range)
{
    return range.at("out").at("seconds").get<double>() - range.at("in").at("seconds").get<double>();
}

/// "a, b, c, d and 2 more".
std::string firstFour(std::vector<std::string> names, std::size_t columns)
{
    const std::size_t more = names.size() - std::min<std::size_t>(4, names.size());
    names.resize(names.size() - more);
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : ", ") + cutTo(name, columns);
    return text + (more == 0 ? "" : " and " + std::to_string(more) + " more");
}

/// As many as have room in 60 columns, and how many more there are.
std::string firstTracks(const std::vector<std::string>& names)
{
    std::string text = cutTo(names.front(), 24);
    std::size_t shown = 1;
    for (; shown < names.size() && text.size() + 2 + cutTo(names[shown], 24).size() <= 60; ++shown)
        text += ", " + cutTo(names[shown], 24);
    return text + (shown == names.size() ? "" : " and " + std::to_string(names.size() - shown) + " more");
}

/// Those numbers that aren't 0, each with its word.
std::string numbersText(std::initializer_list<std::pair<std::size_t, std::string>> numbers)
{
    std::string text;
    for (const auto& [number, word] : numbers) {
        if (number > 0)
            text += (text.empty() ? "" : ", ") + std::to_string(number) + " " + word;
    }
    return text;
}

std::size_t countOf(const json& sound, std::initializer_list<const char*> kinds)
{
    std::size_t count = 0;
    for (const json& change : sound.at("changes"))
        count += std::find(kinds.begin(), kinds.end(), change.at("kind").get<std::string>()) != kinds.end() ? 1 : 0;
    return count;
}

std::string fatesOf(const json& count)
{
    const auto number = [&count](const char* key) { return count.at(key).get<std::size_t>(); };
    const std::string text = numbersText({{number("stay"), "stay"},
                                          {number("moved"), "moved"},
                                          {number("trimmed"), "trimmed"},
                                          {number("split"), "split"},
                                          {number("doubled"), "doubled"},
                                          {number("inNoCut"), "fell out"},
                                          {number("new"), "new"}});
    return text.empty() ? "" : ": " + text;
}

/// The time of day, in whole seconds, from which the project counts: the timecode says it to a frame.
double originOf(const json& placed)
{
    const json& place = placed.contains("was") ? placed.at("was") : placed.contains("now") ? placed.at("now") : placed;
    const json& start = place.at("in");
    return std::round(framesOfTimecode(start.at("timecode")) / double{FramesASecond} -
                      start.at("seconds").get<double>());
}

bool isEmpty(const json& sound)
{
    return sound.at("changes").empty() && sound.at("automationJumps").empty() && sound.at("movedClips") == 0;
}

} // namespace

PrintedNotes::PrintedNotes(const json& notes) : m_notes(notes)
{
    for (std::size_t reel = 0; reel < notes.at("reels").size(); ++reel) {
        for (const json& row : notes.at("reels")[reel].at("rows")) {
            if (row.at("row") == "step")
                m_steps[row.at("number").get<int>()] = {&row, reel};
        }
    }
}

std::string PrintedNotes::cutName(const char* side) const
{
    std::vector<std::string> names = m_notes.at(side).at("files");
    const std::string count = std::to_string(names.size());
    if (names.size() > 3)
        names = {names.front() + " ... " + names.back() + " (" + count + " files)"};
    std::string text;
    for (const std::string& name : names)
        text += (text.empty() ? "" : ", ") + name;
    return text;
}

std::string PrintedNotes::cutLine(const char* side) const
{
    return cutName(side) + ": " + counted(m_notes.at(side).at("events").get<std::size_t>(), "event") + ", all valid";
}

std::string PrintedNotes::cuts() const
{
    const auto titleOf = [this](const char* side) {
        const json& titles = m_notes.at(side).at("titles");
        if (titles.empty())
            return cutName(side);
        const std::string first = titles.front();
        return titles.size() == 1 ? first : first + " ... " + titles.back().get<std::string>();
    };
    const bool areApart = titleOf("old") != titleOf("new");
    return (areApart ? titleOf("old") : cutName("old")) + " to " + (areApart ? titleOf("new") : cutName("new"));
}

std::string PrintedNotes::headBeforeSettings(Form form) const
{
    const json& totals = m_notes.at("totals");
    const auto time = [&totals](const char* key) { return length(totals, key); };
    const std::string change = lengthChange(totals.at("framesAfter").get<int>() - totals.at("framesBefore").get<int>());
    const std::size_t steps = totals.at("steps");
    const std::string rate = m_notes.at("rate");
    const std::string oldCut = cutLine("old");
    const std::string newCut = cutLine("new");
    if (form == Form::Text)
        return line({"Old cut", oldCut, "New cut", newCut, "Frame rate", rate});
    if (form == Form::Page)
        return line({"Old cut:",
                     oldCut,
                     "New cut:",
                     newCut,
                     rate,
                     std::to_string(steps),
                     "steps",
                     time("framesBefore"),
                     "before",
                     time("framesAfter"),
                     "after",
                     change,
                     "change of length",
                     time("liftedFrames"),
                     "lifted",
                     time("insertedFrames"),
                     "inserted",
                     time("movedFrames"),
                     "moved",
                     time("doubledFrames"),
                     "doubled",
                     soundTotals(form)});
    return line({"Old cut:",
                 oldCut,
                 "New cut:",
                 newCut,
                 rate + ",",
                 time("framesBefore"),
                 "before,",
                 time("framesAfter"),
                 "after,",
                 change + ",",
                 counted(steps, "step"),
                 time("liftedFrames"),
                 "lifted,",
                 time("insertedFrames"),
                 "inserted,",
                 time("movedFrames"),
                 "moved,",
                 time("doubledFrames"),
                 "doubled",
                 soundTotals(form)});
}

std::string PrintedNotes::headAfterSettings(Form form) const
{
    const json& totals = m_notes.at("totals");
    const auto time = [&totals](const char* key) { return length(totals, key); };
    if (form != Form::Text)
        return {};
    return line({"Length",
                 time("framesBefore"),
                 "before,",
                 time("framesAfter"),
                 "after,",
                 lengthChange(totals.at("framesAfter").get<int>() - totals.at("framesBefore").get<int>()),
                 "Old picture",
                 time("keptFrames"),
                 "kept,",
                 time("liftedFrames"),
                 "lifted New picture",
                 time("insertedFrames"),
                 "inserted,",
                 time("doubledFrames"),
                 "doubled Moved",
                 time("movedFrames"),
                 "Steps",
                 std::to_string(totals.at("steps").get<int>()),
                 "in",
                 counted(m_notes.at("reels").size(), "reel"),
                 soundTotals(form)});
}

std::string PrintedNotes::materialOf(const json& change) const
{
    if (!change.contains("sourceIn"))
        return {};
    const std::string roll = change.at("newShot").at("roll");
    return (roll.empty() ? "" : "roll " + roll + ", ") + "source " + change.at("sourceIn").get<std::string>();
}

std::string PrintedNotes::formerVersion(const json& change) const
{
    const char* const key = m_notes.at("match") == "clip" ? "clip" : "roll";
    const std::string was = change.at("oldShot").at(key);
    return was == change.at("newShot").at(key) ? "" : ", as " + cutTo(was, ColumnsOfAName);
}

PrintedNotes::Words PrintedNotes::wordsOf(const json& change) const
{
    const std::string kind = change.at("kind");
    const int frames = change.at("frames");
    const std::string time = timecodeOfFrames(std::abs(frames));
    const json none;
    const json& was = change.contains("oldShot") ? change.at("oldShot") : none;
    const json& now = change.contains("newShot") ? change.at("newShot") : none;
    const std::string oldName = was.is_null() ? "no picture" : nameOf(was);
    const std::string name = now.is_null() ? oldName : nameOf(now);
    const auto at = [&change] { return " at " + change.at("old").at("in").get<std::string>(); };
    const std::size_t moreShots = change.value("shots", std::size_t(1)) - 1;
    if (kind == "head-trimmed" || kind == "tail-trimmed")
        return {kind.substr(0, 4) + (frames < 0 ? " -" : " +") +
                    counted(static_cast<std::size_t>(std::abs(frames)), "frame"),
                name,
                {}};
    const std::string newTransition = withTransition(change, "newTransition", "newShot", "with a ");
    const std::string oldTransition = withTransition(change, "oldTransition", "oldShot", "with a ");
    const auto withoutComma = [](const std::string& text) { return text.starts_with(", ") ? text.substr(2) : text; };
    if (kind == "lifted" && change.contains("part"))
        return {"lifted part " + time, oldName, "in the old cut" + at() + oldTransition};
    if (kind == "lifted")
        return {"lifted " + time + at(), oldName, withoutComma(oldTransition)};
    if (kind == "inserted") {
        const bool isRetimed = !now.is_null() && now.at("speed") != 1.0;
        return {"inserted " + time, name, materialOf(change) + (isRetimed ? ", " + speedOf(now) : "") + newTransition};
    }
    if (kind == "replaced")
        return {"replaced " + time, name,
                withoutComma(materialOf(change) + newTransition + ", was " + oldName + at() + oldTransition)};
    if (kind == "moved")
        return {"moved " + time, withMore(name, moreShots),
                "in the old cut" + at() +
                    (change.contains("outOfTheWay") ? ", at a free place until its reel's steps" : "")};
    if (kind == "unchanged")
        return {"unchanged " + time, withMore(name, moreShots), {}};
    if (kind == "doubled")
        return {"once more " + time, withMore(name, moreShots),
                "stood once in the old cut" + at() + formerVersion(change)};
    const char* const matched = m_notes.at("match") == "clip" ? "clip" : "roll";
    if (kind == "retimed") {
        const bool isSameVersion = was.at(matched) == now.at(matched);
        const std::string speeds = isFreeze(was) || isFreeze(now)
                                       ? speedOf(was) + " now " + speedOf(now)
                                       : "speed " + percent(was) + " now " + percent(now) + " %";
        const std::string former = oldTransition == newTransition
                                       ? std::string()
                                       : withTransition(change, "oldTransition", "oldShot", "had a ");
        return {speeds, isSameVersion ? name : cutTo(now.at(matched), ColumnsOfAName),
                "was " + (isSameVersion ? "" : cutTo(was.at(matched), ColumnsOfAName) + ", ") +
                    length(change.at("old"), "frames") + " long, is " + length(change.at("new"), "frames") + ", " +
                    materialOf(change) + newTransition + former};
    }
    if (kind == "reel-moved")
        return {time + (frames < 0 ? " earlier" : " later"), "the whole reel",
                !change.contains("outOfTheWay") ? ""
                : change.contains("new")        ? "out of the way until its own steps"
                                                : "out of the way until it is gone"};
    if (kind == "version-changed")
        return {"was " + cutTo(was.at(matched), 28), cutTo(now.at(matched), ColumnsOfAName), {}};
    if (kind == "transition-added")
        return {wipeOrDissolve(now) + " frames added", name, {}};
    if (kind == "transition-removed")
        return {wipeOrDissolve(was) + " frames removed", oldName, {}};
    if (was.at("transition") != now.at("transition"))
        return {wipeOrDissolve(was) + " now " + wipeOrDissolve(now), name, {}};
    if (was.at("transitionFrames") == now.at("transitionFrames"))
        return {wipeOrDissolve(was) + ", other picture", name, {}};
    return {
        wipeOrDissolve(was) + " now " + std::to_string(now.at("transitionFrames").get<int>()) + " frames", name, {}};
}

std::string PrintedNotes::changeOf(const json& change, Form form) const
{
    const Words words = wordsOf(change);
    const std::string more = words.more.empty() ? "" : ", " + words.more;
    if (form == Form::Text)
        return line({words.what, words.shot, words.more});
    if (form == Form::Paper)
        return words.shot + ": " + words.what + more;
    const std::string label = labelOf(change.at("kind"));
    const bool isTwice = words.what.starts_with(label + " ");
    return line({label, words.shot, isTwice ? words.what.substr(label.size() + 1) + more : words.what + more});
}

namespace {

/// Where a move is told from: the place that comes first in this reel.
bool goesOn(const json& step, std::size_t reel)
{
    const int number = static_cast<int>(reel) + 1;
    const json& at = step.at("at");
    const json& from = step.at("from");
    return at.at("reel") != number || (from.at("reel") == number && from.at("frame") < at.at("frame"));
}

/// The change that stands for a step: the first of the longest.
const json& largestOf(const json& step)
{
    const auto extentOf = [](const json& change) {
        return change.at("kind") == "unchanged" ? 0 : std::abs(change.at("frames").get<int>());
    };
    const json* largest = &step.at("changes")[0];
    for (const json& change : step.at("changes"))
        largest = extentOf(change) > extentOf(*largest) ? &change : largest;
    return *largest;
}

/// The shot of a change, as each cut that has it writes it. What is replaced is another shot.
std::set<json> shotsIn(const json& change)
{
    std::set<json> shots;
    if (change.contains("newShot"))
        shots.insert(json{"new", change.at("newShot")});
    if (change.contains("oldShot") && (shots.empty() || change.at("kind") != "replaced"))
        shots.insert(json{"old", change.at("oldShot")});
    return shots;
}

} // namespace

std::string PrintedNotes::placeOf(const json& row, std::size_t reel) const
{
    if (row.at("row") == "kept")
        return row.at("newIn");
    const bool isFrom = row.at("row") == "step" &&
                        ((row.at("action") == "move" && goesOn(row, reel)) || row.at("action") == "move-reel");
    return row.at(isFrom ? "from" : "at").at("timecode");
}

std::string PrintedNotes::actionOf(const json& row, std::size_t reel) const
{
    if (row.at("row") == "kept")
        return "kept " + length(row, "frames") + ", was " + row.at("oldIn").get<std::string>();
    if (row.at("row") == "moved") {
        const bool isTarget = row.contains("fromReel");
        return "moved " + length(row, "frames") + (isTarget ? " from reel " : " to reel ") +
               std::to_string(row.at(isTarget ? "fromReel" : "toReel").get<int>()) + ", step " +
               std::to_string(row.at("step").get<int>());
    }
    if (row.at("action") == "move")
        return "move " + length(row, "moveFrames") +
               (goesOn(row, reel) ? " to " + row.at("at").at("timecode").get<std::string>()
                                  : " from " + row.at("from").at("timecode").get<std::string>());
    if (row.at("action") == "move-reel")
        return line({"move", wholeReel(row), "to", row.at("at").at("timecode")});
    if (row.at("action") == "relabel")
        return "new version, " + length(row, "insertFrames");
    const int removed = row.at("deleteFrames");
    const int inserted = row.at("insertFrames");
    if (removed == 0)
        return "insert " + timecodeOfFrames(inserted);
    if (inserted == 0)
        return "delete " + timecodeOfFrames(removed);
    return "replace " + timecodeOfFrames(removed) + (inserted == removed ? "" : " by " + timecodeOfFrames(inserted));
}

/// Of several reels, its number.
std::string PrintedNotes::wholeReel(const json& step) const
{
    if (m_notes.at("reels").size() == 1)
        return "the whole reel";
    return std::string("all of reel ").append(std::to_string(step.at("at").at("reel").get<int>()));
}

std::string PrintedNotes::action(int step) const
{
    return actionOf(stepOf(step), m_steps.at(step).reel);
}

/// Whether a kept stretch stood in the old cut outside of this reel.
bool PrintedNotes::isFromAnotherReel(const json& kept, std::size_t reel) const
{
    const json& old = m_notes.at("reels")[reel].at("old");
    if (old.is_null())
        return true;
    const int place = framesOfTimecode(kept.at("oldIn")) - framesOfTimecode(old.at("start"));
    return place < 0 || place >= old.at("frames").get<int>();
}

std::string PrintedNotes::rowOf(const json& row, std::size_t reel, int offset, Form form) const
{
    const std::string start = line({placeOf(row, reel), actionOf(row, reel)});
    if (row.at("row") == "kept")
        return line({start, isFromAnotherReel(row, reel) ? "" : lengthChange(row.at("offsetFrames"))});
    if (row.at("row") == "moved") {
        const std::string shot = wordsOf(stepOf(row.at("step")).at("changes")[0]).shot;
        if (form == Form::Page)
            return line({start, shot, lengthChange(offset)});
        return line({start, lengthChange(offset), shot});
    }
    std::string below;
    for (const json& change : row.at("changes"))
        below = line({below, changeOf(change, form)});
    if (row.at("joinedSteps") > 1)
        below = line(
            {below, "joined from", std::to_string(row.at("joinedSteps").get<int>()), "steps whose trims cancel out"});
    below = line({below, row.at("at").contains("feet") ? feetOf(row) : "",
                  row.contains("sound") ? soundOf(row.at("sound"), form) : ""});
    const int changed = row.at("lengthChangeFrames");
    const std::string lengths = line({changed == 0 ? "" : signedTimecode(changed), lengthChange(offset)});
    const std::string number = std::to_string(row.at("number").get<int>());
    return form == Form::Page ? line({number, start, below, lengths}) : line({number, start, lengths, below});
}

std::string PrintedNotes::shotsOf(const json& step) const
{
    const json& largest = largestOf(step);
    if (largest.at("kind") == "reel-moved")
        return wordsOf(largest).what;
    std::set<json> told = shotsIn(largest);
    std::size_t more = 0;
    for (const json& change : step.at("changes")) {
        const std::set<json> shots = shotsIn(change);
        const bool isTold =
            change.at("kind") == "unchanged" || shots.empty() ||
            std::any_of(shots.begin(), shots.end(), [&](const json& shot) { return told.contains(shot); });
        more += isTold ? 0 : change.value("shots", std::size_t(1));
        if (change.at("kind") != "unchanged")
            told.insert(shots.begin(), shots.end());
    }
    const std::size_t others = largest.value("shots", std::size_t(1)) - 1;
    return others == 0 ? withMore(wordsOf(largest).shot, more) : withMore(nameOf(largest.at("newShot")), others + more);
}

std::string PrintedNotes::largest(Form form) const
{
    std::string text = "The largest changes";
    for (const int number : m_notes.at("largest")) {
        const json& step = stepOf(number);
        std::string shots = shotsOf(step);
        if (step.contains("sound") && !isEmpty(step.at("sound")))
            shots += " sound: " + soundSummary(step.at("sound"), false);
        text = form == Form::Text ? line({text, std::to_string(number), action(number), shots})
                                  : line({text, "step", std::to_string(number) + ":", action(number) + ",", shots});
    }
    return text;
}

int PrintedNotes::framesOf(std::size_t reel, const char* side) const
{
    const json& pair = m_notes.at("reels")[reel];
    return pair.at(side).is_null() ? 0 : pair.at(side).at("frames").get<int>();
}

std::string PrintedNotes::startOf(std::size_t reel) const
{
    const json& pair = m_notes.at("reels")[reel];
    return pair.at(pair.at("new").is_null() ? "old" : "new").at("start");
}

std::string PrintedNotes::reelList(Form form) const
{
    const json& reels = m_notes.at("reels");
    if (reels.size() < 2)
        return {};
    std::string text = "The reels reel begins before after change steps";
    for (std::size_t reel = 0; reel < reels.size(); ++reel) {
        const auto steps = std::count_if(reels[reel].at("rows").begin(), reels[reel].at("rows").end(),
                                         [](const json& row) { return row.at("row") == "step"; });
        text = line({text, form == Form::Page ? "Reel" : "", std::to_string(reel + 1), startOf(reel),
                     timecodeOfFrames(framesOf(reel, "old")), timecodeOfFrames(framesOf(reel, "new")),
                     lengthChange(framesOf(reel, "new") - framesOf(reel, "old")), std::to_string(steps)});
    }
    return text;
}

/// The last step of an earlier reel that has moved all of a reel, or else the first one that has moved picture into it at a
/// free place.
std::string PrintedNotes::moverOf(std::size_t reel) const
{
    std::string text;
    for (const auto& [number, step] : m_steps) {
        const json& row = *step.row;
        const bool isMove = row.at("action") == "move";
        const bool isAside = row.at("changes")[0].contains("outOfTheWay");
        if (step.reel == reel || row.at("at").at("reel") != static_cast<int>(reel) + 1)
            continue;
        if (row.at("action") == "move-reel" || (isMove && isAside && text.empty()))
            text = (isAside ? ", out of the way since step " : ", moved by step ") + std::to_string(number);
    }
    return text;
}

std::string PrintedNotes::reelHeading(std::size_t reel, Form form) const
{
    const json& pair = m_notes.at("reels")[reel];
    std::string text = "Reel " + std::to_string(reel + 1) + ", " + startOf(reel);
    if (pair.at("new").is_null())
        text += ", is gone";
    else if (pair.at("old").is_null())
        text += ", is new";
    else if (pair.at("old").at("start") != pair.at("new").at("start"))
        text += ", began at " + pair.at("old").at("start").get<std::string>();
    text += moverOf(reel);
    const int before = framesOf(reel, "old");
    const int after = framesOf(reel, "new");
    const bool isUnchanged = std::all_of(pair.at("rows").begin(), pair.at("rows").end(),
                                         [](const json& row) { return row.at("row") == "kept"; });
    if (before == after)
        text += " " + timecodeOfFrames(before) + " before and after" + (isUnchanged ? ", nothing has changed" : "");
    else
        text += " " + timecodeOfFrames(before) + " before, " + timecodeOfFrames(after) + " after, " +
                lengthChange(after - before);
    // On paper the titles of the columns come again on each page.
    if (form == Form::Text)
        text += " step at what to do length offset";
    else if (form == Form::Page)
        text += " step at what to do what changes length offset";
    return text;
}

std::string PrintedNotes::remarks() const
{
    const json& healed = m_notes.at("healed");
    const std::size_t events = healed.at("events");
    const std::size_t gaps = healed.at("bridgedGaps");
    std::size_t joined = 0;
    for (const auto& [number, step] : m_steps)
        joined += step.row->at("joinedSteps") > 1 ? step.row->at("joinedSteps").get<std::size_t>() : 0;
    std::string text;
    if (events > 0)
        text = (m_notes.contains("sound") ? "Of the change EDL that was applied: "
                                          : "For the change EDL that cadrel makes of these cuts: ") +
               counted(events, "event") + " healed from " + std::to_string(healed.at("members").get<int>()) +
               (gaps > 0 ? ", " + counted(gaps, "gap") + " covered" : "") +
               (m_steps.empty() ? "" : "; the steps above are not healed");
    if (joined > 0)
        text = line({text, std::to_string(joined), "steps whose trims cancel out within",
                     counted(m_notes.at("simplifyFrames").get<std::size_t>(), "frame"), "are joined"});
    return text.empty() ? "" : "Healed, doubted and passed over " + text;
}

std::string PrintedNotes::trackName(int number) const
{
    return m_notes.at("sound").at("tracks")[static_cast<std::size_t>(number - 1)].at("name");
}

std::string PrintedNotes::soundTotals(Form form) const
{
    if (!m_notes.contains("sound"))
        return {};
    const json& sound = m_notes.at("sound");
    const json& clips = sound.at("clips");
    const json& markers = sound.at("markers");
    const std::string first =
        sound.at("project").get<std::string>() + ", " + counted(clips.at("all"), "clip") + fatesOf(clips);
    const std::string second = counted(markers.at("all"), "own marker") +
                               (sound.at("sceneTrack").is_null() ? "" : " besides the scenes") + fatesOf(markers);
    // The paper says on each line what it is about.
    return form == Form::Paper ? "Sound: " + first + " Sound: " + second
                               : (form == Form::Text ? "Sound " : "Sound: ") + first + " " + second;
}

std::string PrintedNotes::soundSummary(const json& sound, bool namesTracks) const
{
    std::vector<std::string> tracks;
    for (const int track : sound.at("tracks"))
        tracks.push_back(trackName(track));
    const std::size_t jumps = sound.at("automationJumps").size();
    std::string text = numbersText({{countOf(sound, {"head-trimmed", "tail-trimmed"}), "trimmed"},
                                    {countOf(sound, {"split"}), "split"},
                                    {countOf(sound, {"doubled"}), "doubled"},
                                    {countOf(sound, {"fell-out"}), "fell out"},
                                    {countOf(sound, {"added"}), "new"},
                                    {sound.at("movedClips").get<std::size_t>(), "moved along"}});
    if (!tracks.empty())
        text += ", on " + (namesTracks ? firstFour(tracks, 24) : counted(tracks.size(), "track"));
    if (jumps > 0)
        text += (text.empty() ? "" : "; ") + counted(jumps, "automation jump");
    return text;
}

std::vector<PrintedNotes::SoundLine> PrintedNotes::soundLines(const json& sound) const
{
    std::vector<SoundLine> lines;
    for (const json& change : sound.at("changes")) {
        const std::string kind = change.at("kind");
        const double lost = change.contains("lost") ? lengthOf(change.at("lost")) : 0.0;
        const std::string frames = exactTimecode(lost);
        const bool hasLost = lost > 1e-5;
        const auto start = [&change](const char* when) {
            return exactTimecode(change.at(when).at("in").at("seconds").get<double>() + originOf(change));
        };
        std::string what = "new";
        if (kind == "head-trimmed" || kind == "tail-trimmed")
            what = kind.substr(0, 4) + " -" + frames;
        else if (kind == "split")
            what = hasLost ? "split, -" + frames : "split";
        else if (kind == "doubled")
            what = "once more";
        else if (kind == "fell-out")
            what = hasLost ? "fell out, " + frames : "fell out";
        const std::string part = change.contains("part") ? " (in " + cutTo(change.at("part"), 40) + ")" : std::string();
        const std::string name = change.at("name");
        lines.push_back(
            {what, start(kind == "added" ? "now" : "was"),
             cutTo(change.at("trackName"), 24) + ": " + (name.empty() ? "(no name)" : cutTo(name, 40)) + part,
             kind == "doubled" ? ", now at " + start("now") : ""});
    }
    for (const json& jump : sound.at("automationJumps")) {
        lines.push_back({"automation jumps", exactTimecode(jump.at("in").at("seconds").get<double>() + originOf(jump)),
                         firstTracks(jump.at("tracks")), ""});
    }
    return lines;
}

std::string PrintedNotes::soundOf(const json& sound, Form form) const
{
    constexpr std::size_t MostLines = 30;
    std::string text;
    if (!sound.at("scenes").empty())
        text = "scene: " + firstFour(sound.at("scenes"), 40);
    if (isEmpty(sound))
        return text;
    text = line({text, form == Form::Page ? "sound" : "sound:", soundSummary(sound, true)});
    const std::vector<SoundLine> lines = soundLines(sound);
    for (std::size_t index = 0; index < std::min(lines.size(), MostLines); ++index) {
        const auto& [what, time, name, more] = lines[index];
        if (form == Form::Text) {
            text = line({text, what, time, name + more});
        } else if (form == Form::Page) {
            text = line({text, time, name, what + more});
        } else {
            text = line({text, time, name + ": " + what + more});
        }
    }
    if (lines.size() > MostLines)
        text = line({text, "and", std::to_string(lines.size() - MostLines), "more, which the JSON lists"});
    return text;
}

std::string PrintedNotes::soundCells(const json& sound) const
{
    std::string tracks;
    for (const int track : sound.at("tracks"))
        tracks += (tracks.empty() ? "" : ", ") + trackName(track);
    std::string lines;
    for (const SoundLine& line : soundLines(sound))
        lines += (lines.empty() ? "" : "; ") + line.name + " at " + line.time + ": " + line.what + line.more;
    const auto number = [](std::size_t count) { return std::to_string(count); };
    std::string row;
    for (const std::string& cell :
         {firstFour(sound.at("scenes"), 40), number(countOf(sound, {"head-trimmed", "tail-trimmed"})),
          number(countOf(sound, {"split"})), number(countOf(sound, {"doubled"})), number(countOf(sound, {"fell-out"})),
          number(countOf(sound, {"added"})), number(sound.at("movedClips")), tracks,
          number(sound.at("automationJumps").size()), lines})
        row.append(",").append(inQuotes(cell));
    return row;
}

std::string PrintedNotes::body(Form form) const
{
    std::string text = line({largest(form), reelList(form)});
    for (std::size_t reel = 0; reel < m_notes.at("reels").size(); ++reel) {
        text = line({text, reelHeading(reel, form)});
        int offset = 0;
        for (const json& row : m_notes.at("reels")[reel].at("rows")) {
            offset = row.at("row") == "kept" ? offset : row.at("offsetFrames").get<int>();
            text = line({text, rowOf(row, reel, offset, form)});
        }
    }
    const bool hasElsewhere = m_notes.contains("sound") && !isEmpty(m_notes.at("sound").at("elsewhere"));
    return line({text,
                 hasElsewhere
                     ? "Sound that changed where no picture did " + soundOf(m_notes.at("sound").at("elsewhere"), form)
                     : "",
                 remarks()});
}

std::string PrintedNotes::tableRow(const json& step, std::size_t reel) const
{
    const bool isMove = step.at("action") == "move";
    const bool hasFrom = isMove || step.at("action") == "move-reel";
    const int moved = isMove ? step.at("moveFrames").get<int>() : 0;
    const int removed = step.at("deleteFrames");
    const int inserted = step.at("insertFrames");
    const auto time = [](int frames) { return frames == 0 ? "" : timecodeOfFrames(frames); };
    const json& largest = largestOf(step);
    const auto placeIn = [&largest](const char* side) {
        return largest.contains(side) ? largest.at(side).at("in").get<std::string>() : "";
    };
    const json none{{"roll", ""}, {"clip", ""}};
    const json& shot = largest.contains("newShot")   ? largest.at("newShot")
                       : largest.contains("oldShot") ? largest.at("oldShot")
                                                     : none;
    std::string kinds;
    std::string changes;
    for (const json& change : step.at("changes")) {
        kinds = line({kinds, change.at("kind")});
        changes += (changes.empty() ? "" : "; ") + changeOf(change, Form::Paper);
    }
    const std::vector<std::string> cells{std::to_string(step.at("number").get<int>()),
                                         std::to_string(reel + 1),
                                         step.at("action"),
                                         step.at("at").at("timecode"),
                                         hasFrom ? step.at("from").at("timecode").get<std::string>() : "",
                                         time(removed),
                                         time(inserted),
                                         time(moved),
                                         std::to_string(removed),
                                         std::to_string(inserted),
                                         std::to_string(moved),
                                         std::to_string(step.at("lengthChangeFrames").get<int>()),
                                         std::to_string(step.at("offsetFrames").get<int>()),
                                         kinds,
                                         shot.at("roll"),
                                         shot.at("clip"),
                                         placeIn("old"),
                                         placeIn("new"),
                                         changes,
                                         feet(step.at("at").at("frame")),
                                         hasFrom ? feet(step.at("from").at("frame")) : "",
                                         std::to_string(step.at("at").at("reel").get<int>()),
                                         hasFrom ? std::to_string(step.at("from").at("reel").get<int>()) : "",
                                         m_notes.at("rate"),
                                         largest.value("sourceIn", "")};
    std::string row;
    for (const std::string& cell : cells)
        row.append(row.empty() ? "" : ",").append(inQuotes(cell));
    return row + (step.contains("sound") ? soundCells(step.at("sound")) : "");
}

std::vector<std::string> PrintedNotes::table() const
{
    std::vector<std::string> rows;
    for (const auto& [number, step] : m_steps)
        rows.push_back(tableRow(*step.row, step.reel));
    return rows;
}

} // namespace cadrel::tests
