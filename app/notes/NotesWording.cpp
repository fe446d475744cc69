// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesWording.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/edl/GenerationReport.h"
#include "app/edl/ScreenTimecode.h"
#include "app/settings/SettingsReport.h"
#include "core/edl/EventBase.h"
#include "core/edl/MatchedName.h"
#include "core/notes/EventPicture.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>

namespace cadrel::app {

using core::ChangeKind;
using core::EventBase;
using core::NoteEntry;
using core::NoteStep;
using core::PictureChange;
using core::PictureDoubt;
using core::StepAction;
using core::Timecode;
using core::TransitionType;
using core::WorkPlace;

namespace {

constexpr std::int32_t FramesPerFoot = 16;
constexpr std::size_t MostCharactersOfAName = 39;
constexpr std::size_t MostCharactersOfATitle = 70;
/// The files of a cut are named one by one up to so many.
constexpr std::size_t MostFilesNamed = 3;
/// So many events with the same doubt are named, and so many lines that were not read.
constexpr std::size_t MostOfAKind = 5;

constexpr std::array<std::string_view, 14> KindWords{
    "head-trimmed", "tail-trimmed", "lifted",          "inserted",         "replaced",           "moved",
    "doubled",      "retimed",      "version-changed", "transition-added", "transition-removed", "transition-changed",
    "unchanged",    "reel-moved"};
constexpr std::array<std::string_view, 4> ActionWords{"replace", "move", "relabel", "move-reel"};
constexpr std::array<std::string_view, 5> DoubtWords{"no-picture", "flawed", "reversed", "nameless", "covered"};
static_assert(static_cast<std::size_t>(ChangeKind::ReelMoved) + 1 == KindWords.size());
static_assert(static_cast<std::size_t>(StepAction::MoveReel) + 1 == ActionWords.size());
static_assert(static_cast<std::size_t>(PictureDoubt::Covered) + 1 == DoubtWords.size());

/// "-20 frames", "+1 frame".
std::string signedFrames(std::int32_t frames)
{
    return concatenated({frames < 0 ? "-" : "+", counted(static_cast<std::size_t>(std::abs(frames)), "frame")});
}

std::string percent(double speed)
{
    return std::to_string(std::lround(speed * 100));
}

/// The texts that aren't empty, with commas between.
std::string listed(std::initializer_list<std::string> texts)
{
    std::string all;
    for (const std::string& text : texts)
        all.append(all.empty() || text.empty() ? "" : ", ").append(text);
    return all;
}

/// "dissolve of 16".
std::string transitionOf(const EventBase& shot)
{
    return (shot.transitionType() == TransitionType::Wipe ? "wipe of " : "dissolve of ") +
           std::to_string(shot.transitionDuration());
}

/// "with a dissolve of 16 frames", where a shot brings or takes one with it.
std::string withTransition(bool hasTransition, const EventBase* shot, const char* with = "with a ")
{
    if (!hasTransition || shot == nullptr)
        return {};
    return concatenated({with, transitionOf(*shot), shot->transitionDuration() == 1 ? " frame" : " frames"});
}

/// A name and how many more there are: "42A-3 MAREN MCU and 2 more".
std::string withMore(const std::string& name, std::size_t more)
{
    if (more == 0)
        return name;
    const std::string text = concatenated({" and ", std::to_string(more), " more"});
    return toPrintable(name, MostCharactersOfAName - text.size()).text + text;
}

std::string_view titleOf(SettingsReport::Origin origin)
{
    switch (origin) {
    case SettingsReport::Origin::CommandLine:
        return "Settings given:";
    case SettingsReport::Origin::Project:
        return "Settings of the project:";
    case SettingsReport::Origin::Default:
        break;
    }
    return "Settings by default:";
}

std::string_view explanationOf(PictureDoubt doubt)
{
    switch (doubt) {
    case PictureDoubt::NoPicture:
        return "no picture, or no place that can be read: passed over";
    case PictureDoubt::Flawed:
        return "flawed: the same picture only where the same line stands in both cuts";
    case PictureDoubt::Reversed:
        return "ends before it begins: the same picture only where the same line stands in both cuts";
    case PictureDoubt::Nameless:
        return "its name tells nothing of its material: matched by its source timecode alone";
    case PictureDoubt::Covered:
        break;
    }
    return "another event stands on top of it: only what is left is seen";
}

} // namespace

std::string_view wordOf(ChangeKind kind)
{
    return KindWords.at(static_cast<std::size_t>(kind));
}

std::string_view wordOf(StepAction action)
{
    return ActionWords.at(static_cast<std::size_t>(action));
}

std::string_view wordOf(PictureDoubt doubt)
{
    return DoubtWords.at(static_cast<std::size_t>(doubt));
}

std::string concatenated(std::initializer_list<std::string_view> texts)
{
    std::string all;
    for (const std::string_view text : texts)
        all += text;
    return all;
}

std::string NotesWording::plainTimecode(std::int32_t frames) const
{
    const core::Framerate& framerate = m_document.notes.framerate();
    Timecode timecode;
    timecode.setFrameCount(frames % (framerate.lastFrame + 1), framerate);
    return timecode.toString();
}

std::string NotesWording::timecode(std::int32_t frames) const
{
    return onScreen(plainTimecode(frames), m_document.notes.framerate());
}

std::string NotesWording::change(std::int32_t frames) const
{
    return concatenated({frames < 0 ? "-" : frames > 0 ? "+" : "", timecode(std::abs(frames))});
}

std::string NotesWording::changeInColumn(std::int32_t frames) const
{
    return concatenated({frames == 0 ? " " : "", change(frames)});
}

std::string NotesWording::offsetInColumn(const NoteEntry& entry, std::size_t reel) const
{
    const core::KeptStretch* const kept = entry.kept();
    if (kept == nullptr)
        return changeInColumn(entry.runningOffset);
    const auto& notes = m_document.notes;
    if (notes.reels()[reel].pair.oldReel != notes.oldCut().reelAt(kept->oldStart))
        return {};
    return changeInColumn(notes.newTimecode(kept->newStart) - notes.oldTimecode(kept->oldStart));
}

std::string NotesWording::feet(std::int32_t frames)
{
    const std::int32_t rest = frames % FramesPerFoot;
    return std::to_string(frames / FramesPerFoot) + (rest < 10 ? "+0" : "+") + std::to_string(rest);
}

std::string NotesWording::timeOf(const NoteEntry& entry, std::size_t reel) const
{
    return timecode(placeOf(entry, reel).timecode());
}

WorkPlace NotesWording::placeOf(const NoteEntry& entry, std::size_t reel) const
{
    if (const core::KeptStretch* const kept = entry.kept()) {
        const core::Reel& newReel = m_document.notes.newCut().reels()[*m_document.notes.reels()[reel].pair.newReel];
        return {reel, kept->newStart - newReel.start, newReel.timecodeStart};
    }
    if (const core::MoveEnd* const end = entry.moveEnd())
        return end->place;
    const NoteStep& step = *entry.step();
    if (step.action == StepAction::MoveReel)
        return step.from;
    const bool goesFurtherOn =
        step.action == StepAction::Move &&
        (step.place.reel != reel || (step.from.reel == reel && step.from.frame < step.place.frame));
    return goesFurtherOn ? step.from : step.place;
}

std::string NotesWording::action(const NoteEntry& entry) const
{
    if (const core::KeptStretch* const kept = entry.kept())
        return "kept " + timecode(kept->length) + ", was " + timecode(m_document.notes.oldTimecode(kept->oldStart));
    if (const core::MoveEnd* const end = entry.moveEnd())
        return concatenated({"moved ", timecode(end->move.frames), end->isTarget ? " from reel " : " to reel ",
                             std::to_string(end->otherReel + 1), ", step ", std::to_string(end->step)});
    const NoteStep& step = *entry.step();
    switch (step.action) {
    case StepAction::Move: {
        // Between reels the row stands in the one that loses or wins the picture.
        const bool goesFurtherOn =
            step.from.reel == step.place.reel ? step.from.frame < step.place.frame : entry.lengthChange < 0;
        const WorkPlace& other = goesFurtherOn ? step.place : step.from;
        return "move " + timecode(step.moved) + (goesFurtherOn ? " to " : " from ") + timecode(other.timecode());
    }
    case StepAction::MoveReel:
        return concatenated({"move ", wholeReel(step), " to ", timecode(step.place.timecode())});
    case StepAction::Relabel:
        return "new version, " + timecode(step.inserted.length);
    case StepAction::Replace:
        break;
    }
    if (step.removed == 0)
        return "insert " + timecode(step.inserted.length);
    if (step.inserted.length == 0)
        return "delete " + timecode(step.removed);
    if (step.inserted.length == step.removed)
        return "replace " + timecode(step.removed);
    return "replace " + timecode(step.removed) + " by " + timecode(step.inserted.length);
}

const PictureChange& NotesWording::largestChange(const NoteEntry& entry)
{
    const auto& changes = entry.step()->changes;
    const auto extentOf = [](const PictureChange& change) {
        return change.kind == ChangeKind::Unchanged ? 0 : std::abs(change.frames);
    };
    return *std::max_element(changes.begin(), changes.end(),
                             [&](const PictureChange& a, const PictureChange& b) { return extentOf(a) < extentOf(b); });
}

/// A step that moves a reel may stand among those of another.
std::string NotesWording::wholeReel(const NoteStep& step) const
{
    return m_document.notes.reels().size() == 1 ? std::string("the whole reel")
                                                : "all of reel " + std::to_string(step.place.reel + 1);
}

std::string NotesWording::inFeet(const NoteEntry& entry) const
{
    const NoteStep* const step = entry.step();
    if (step == nullptr)
        return {};
    const auto through = [](std::int32_t place, std::int32_t length) {
        return feet(place) + " through " + feet(place + length - 1);
    };
    const std::int32_t place = step->place.frame;
    switch (step->action) {
    case StepAction::Move: {
        const auto inReel = [step](std::size_t reel) {
            return step->from.reel == step->place.reel ? std::string() : " of reel " + std::to_string(reel + 1);
        };
        return concatenated({"take out ", through(step->from.frame, step->moved), inReel(step->from.reel),
                             ", put in from ", feet(place), inReel(step->place.reel)});
    }
    case StepAction::MoveReel:
        return {};
    case StepAction::Relabel:
        return "new version from " + through(place, step->inserted.length);
    case StepAction::Replace:
        break;
    }
    std::string text = step->removed > 0 ? "delete " + through(place, step->removed) : std::string();
    if (step->inserted.length > 0)
        text += (text.empty() ? "" : ", ") + std::string("insert ") + through(place, step->inserted.length);
    return text;
}

std::string NotesWording::transitionText(const PictureChange& change)
{
    const EventBase* const was = change.oldShot;
    const EventBase* const now = change.newShot;
    if (change.kind == ChangeKind::TransitionAdded)
        return now == nullptr ? "transition added" : transitionOf(*now) + " frames added";
    if (change.kind == ChangeKind::TransitionRemoved)
        return was == nullptr ? "transition removed" : transitionOf(*was) + " frames removed";
    if (was == nullptr || now == nullptr)
        return "other transition";
    if (was->transitionType() != now->transitionType())
        return transitionOf(*was) + " now " + transitionOf(*now);
    // Its shots are others, or go on in each other elsewhere.
    if (was->transitionDuration() == now->transitionDuration())
        return transitionOf(*was) + ", other picture";
    return concatenated({transitionOf(*was), " now ", std::to_string(now->transitionDuration()), " frames"});
}

/// "speed 100 now 50 %"; a freeze has no speed.
std::string NotesWording::speedText(const EventBase& was, const EventBase& now) const
{
    const core::Framerate& framerate = m_document.notes.framerate();
    if (core::isFreeze(now, framerate))
        return concatenated({"speed ", percent(was.signedSpeed()), " % now freeze"});
    if (core::isFreeze(was, framerate))
        return concatenated({"freeze now speed ", percent(now.signedSpeed()), " %"});
    return concatenated({"speed ", percent(was.signedSpeed()), " now ", percent(now.signedSpeed()), " %"});
}

/// Of new picture; empty at normal speed.
std::string NotesWording::ownSpeedText(const EventBase* shot) const
{
    if (shot == nullptr || shot->hasSpeed(1.0))
        return {};
    if (core::isFreeze(*shot, m_document.notes.framerate()))
        return "freeze";
    return concatenated({"speed ", percent(shot->signedSpeed()), " %"});
}

/// Which version of a VFX shot stood there, where it is another than now.
std::string NotesWording::formerVersion(const PictureChange& change) const
{
    const std::string was = versionName(change.oldShot);
    return was == versionName(change.newShot) ? std::string() : "as " + toPrintable(was, MostCharactersOfAName).text;
}

/// The name in which its version stands.
std::string NotesWording::versionName(const EventBase* shot) const
{
    return shot == nullptr ? std::string() : core::nameBy(m_document.matchBy, *shot);
}

/// The roll and the source of new picture; of a part of a shot that of the part.
std::string NotesWording::materialOf(const PictureChange& change) const
{
    const std::optional<Timecode> source = m_document.notes.sourceOf(change);
    if (!source)
        return {};
    const std::string roll = toPrintable(change.newShot->rollName(), 40).text;
    return concatenated({roll.empty() ? "" : "roll ", roll, roll.empty() ? "source " : ", source ",
                         onScreen(source->toString(), m_document.notes.framerate())});
}

/// Names both versions where the shot has a new one.
ChangeWords NotesWording::retimeWords(const PictureChange& change) const
{
    const std::string oldVersion = versionName(change.oldShot);
    const std::string newVersion = versionName(change.newShot);
    const auto printable = [](const std::string& name) { return toPrintable(name, MostCharactersOfAName).text; };
    const bool isNewVersion = oldVersion != newVersion;
    const std::string transition = withTransition(change.hasNewTransition, change.newShot);
    const std::string former = withTransition(change.hasOldTransition, change.oldShot);
    return {
        speedText(*change.oldShot, *change.newShot), isNewVersion ? printable(newVersion) : nameOf(change.newShot),
        listed({"was " + (isNewVersion ? printable(oldVersion) + ", " : "") + timecode(change.inOld->length) + " long",
                "is " + timecode(change.inNew->length), materialOf(change), transition,
                former == transition ? "" : withTransition(change.hasOldTransition, change.oldShot, "had a ")})};
}

/// Of a reel that waits at a free place, and of picture that is moved into one.
std::string NotesWording::asideText(const PictureChange& change)
{
    if (!change.isOutOfTheWay)
        return {};
    if (change.kind == ChangeKind::Moved)
        return "at a free place until its reel's steps";
    return change.inNew ? "out of the way until its own steps" : "out of the way until it is gone";
}

ChangeWords NotesWording::describe(const PictureChange& change) const
{
    const auto oldPlace = [&] { return " at " + timecode(m_document.notes.oldTimecode(change.inOld->start)); };
    const EventBase* const shot = change.newShot != nullptr ? change.newShot : change.oldShot;
    const std::string name = nameOf(shot);
    const std::string length = timecode(std::abs(change.frames));
    switch (change.kind) {
    case ChangeKind::HeadTrimmed:
        return {"head " + signedFrames(change.frames), name, {}};
    case ChangeKind::TailTrimmed:
        return {"tail " + signedFrames(change.frames), name, {}};
    case ChangeKind::Lifted: {
        const std::string transition = withTransition(change.hasOldTransition, change.oldShot);
        // With its place, a part would be wider than the column.
        if (change.isPart)
            return {"lifted part " + length, nameOf(change.oldShot),
                    listed({"in the old cut" + oldPlace(), transition})};
        return {"lifted " + length + oldPlace(), nameOf(change.oldShot), transition};
    }
    case ChangeKind::Inserted:
        return {
            "inserted " + length, name,
            listed({materialOf(change), ownSpeedText(shot), withTransition(change.hasNewTransition, change.newShot)})};
    case ChangeKind::Replaced:
        return {"replaced " + length, name,
                listed({materialOf(change), withTransition(change.hasNewTransition, change.newShot),
                        "was " + nameOf(change.oldShot) + oldPlace(),
                        withTransition(change.hasOldTransition, change.oldShot)})};
    case ChangeKind::Moved:
        return {"moved " + length, withMore(name, static_cast<std::size_t>(change.shots - 1)),
                listed({"in the old cut" + oldPlace(), asideText(change)})};
    case ChangeKind::Unchanged:
        return {"unchanged " + length, withMore(name, static_cast<std::size_t>(change.shots - 1)), {}};
    case ChangeKind::Doubled:
        return {"once more " + length, withMore(name, static_cast<std::size_t>(change.shots - 1)),
                listed({"stood once in the old cut" + oldPlace(), formerVersion(change)})};
    case ChangeKind::Retimed:
        return retimeWords(change);
    case ChangeKind::VersionChanged:
        return {"was " + toPrintable(versionName(change.oldShot), 28).text,
                toPrintable(versionName(change.newShot), MostCharactersOfAName).text,
                {}};
    case ChangeKind::ReelMoved:
        return {length + (change.frames < 0 ? " earlier" : " later"), "the whole reel", asideText(change)};
    case ChangeKind::TransitionRemoved:
        return {transitionText(change), nameOf(change.oldShot), {}};
    case ChangeKind::TransitionAdded:
    case ChangeKind::TransitionChanged:
        break;
    }
    return {transitionText(change), name, {}};
}

std::string NotesWording::reelTitle(std::size_t reel) const
{
    const core::ReelNotes& notes = m_document.notes.reels()[reel];
    const auto bySteps = [](const char* what, std::size_t step) {
        return step == 0 ? std::string() : what + std::to_string(step);
    };
    return concatenated({"Reel ", std::to_string(reel + 1), ", ", reelStart(reel), reelFate(reel),
                         bySteps(", moved by step ", notes.movedBy),
                         bySteps(", out of the way since step ", notes.asideSince)});
}

/// Whether it is new or gone, and where it began if that was elsewhere.
std::string NotesWording::reelFate(std::size_t reel) const
{
    const auto& notes = m_document.notes;
    const core::ReelChange& pair = notes.reels()[reel].pair;
    if (!pair.newReel)
        return ", is gone";
    if (!pair.oldReel)
        return ", is new";
    const std::int32_t oldStart = notes.oldCut().reels()[*pair.oldReel].timecodeStart;
    const bool isElsewhere = oldStart != notes.newCut().reels()[*pair.newReel].timecodeStart;
    return isElsewhere ? ", began at " + timecode(oldStart) : std::string();
}

std::string NotesWording::reelStart(std::size_t reel) const
{
    const auto& notes = m_document.notes;
    const core::ReelChange& pair = notes.reels()[reel].pair;
    return timecode(pair.newReel ? notes.newCut().reels()[*pair.newReel].timecodeStart
                                 : notes.oldCut().reels()[*pair.oldReel].timecodeStart);
}

std::string NotesWording::reelLengths(std::size_t reel) const
{
    const core::ReelNotes& notes = m_document.notes.reels()[reel];
    if (notes.before == notes.after)
        return timecode(notes.before) + " before and after" + (notes.isUnchanged() ? ", nothing has changed" : "");
    return timecode(notes.before) + " before, " + timecode(notes.after) + " after, " +
           change(notes.after - notes.before);
}

std::size_t NotesWording::stepsOf(std::size_t reel) const
{
    const auto& entries = m_document.notes.reels()[reel].entries;
    return static_cast<std::size_t>(
        std::count_if(entries.begin(), entries.end(), [](const NoteEntry& entry) { return entry.step() != nullptr; }));
}

std::string NotesWording::shotsOf(const NoteEntry& entry) const
{
    const PictureChange& largest = largestChange(entry);
    if (largest.kind == ChangeKind::ReelMoved)
        return describe(largest).what;
    const std::size_t others = core::otherShots(*entry.step(), largest);
    if (largest.shots == 1)
        return withMore(describe(largest).shot, others);
    return withMore(nameOf(largest.newShot), static_cast<std::size_t>(largest.shots - 1) + others);
}

std::string NotesWording::cutName(bool isNew) const
{
    const std::vector<std::string>& names = isNew ? m_document.cuts.newNames : m_document.cuts.oldNames;
    if (names.size() <= MostFilesNamed)
        return joined(names);
    return concatenated({names.front(), " ... ", names.back(), " (", std::to_string(names.size()), " files)"});
}

std::vector<std::string> NotesWording::remarks() const
{
    std::vector<std::string> lines;
    const core::HealingNotes& healing = m_document.healing;
    if (healing.events > 0) {
        const std::string gaps =
            healing.bridgedGaps > 0 ? ", " + counted(healing.bridgedGaps, "gap") + " covered" : std::string();
        lines.push_back(
            concatenated({m_document.sound == nullptr ? "For the change EDL that cadrel makes of these cuts: "
                                                      : "Of the change EDL that was applied: ",
                          counted(healing.events, "event"), " healed from ", std::to_string(healing.members), gaps,
                          hasSteps() ? "; the steps above are not healed" : ""}));
    }
    if (const std::size_t joined = m_document.notes.joinedSteps(); joined > 0)
        lines.push_back(std::to_string(joined) + " steps whose trims cancel out within " +
                        counted(static_cast<std::size_t>(m_document.layout.simplify), "frame") + " are joined");
    for (const bool isNew : {false, true}) {
        for (const std::string& file : isNew ? m_document.cuts.newOverlapping : m_document.cuts.oldOverlapping)
            lines.push_back(fileOf(file, isNew) +
                            " lies on the same timecode as another file of its cut: of what stands on top of each "
                            "other, the one that starts later is seen");
        addDoubts(isNew, lines);
        addUnread(isNew, lines);
    }
    if (m_document.sound != nullptr)
        lines.insert(lines.end(), m_document.sound->remarks.begin(), m_document.sound->remarks.end());
    return lines;
}

const core::StepSound* NotesWording::soundOf(const NoteEntry& entry) const
{
    return m_document.sound == nullptr || entry.step() == nullptr ? nullptr : &m_document.sound->notes.at(entry.number);
}

void NotesWording::addUnread(bool isNew, std::vector<std::string>& lines) const
{
    const std::vector<UnreadOfFile>& unread = isNew ? m_document.cuts.newUnread : m_document.cuts.oldUnread;
    std::size_t count = 0;
    for (const auto& [file, unreadLines] : unread) {
        for (const auto& [line, problem] : unreadLines) {
            if (++count <= MostOfAKind)
                lines.push_back(concatenated({fileOf(file, isNew), ", line ", std::to_string(line.number), " ", problem,
                                              ": \"", toPrintable(line.text, MostCharactersOfAName).text, "\""}));
        }
    }
    if (count > MostOfAKind)
        lines.push_back(concatenated(
            {isNew ? "New cut, " : "Old cut, ", counted(count - MostOfAKind, "further line"), " not read"}));
}

void NotesWording::addDoubts(bool isNew, std::vector<std::string>& lines) const
{
    const core::Programme& cut = isNew ? m_document.notes.newCut() : m_document.notes.oldCut();
    std::array<std::size_t, DoubtWords.size()> counts{};
    for (const core::DoubtfulEvent& doubtful : cut.doubts()) {
        const EventBase& event = cut.events().at(static_cast<std::size_t>(doubtful.event));
        if (++counts.at(static_cast<std::size_t>(doubtful.doubt)) <= MostOfAKind)
            lines.push_back(
                concatenated({fileOf(event.edlFileName(), isNew), ", event ", std::to_string(event.eventNumber()), " (",
                              nameOf(&event), "): ", explanationOf(doubtful.doubt)}));
    }
    for (std::size_t doubt = 0; doubt < counts.size(); ++doubt) {
        if (counts[doubt] > MostOfAKind)
            lines.push_back(
                concatenated({isNew ? "New cut, " : "Old cut, ", counted(counts[doubt] - MostOfAKind, "further event"),
                              ": ", explanationOf(static_cast<PictureDoubt>(doubt))}));
    }
}

std::string NotesWording::order() const
{
    std::string text;
    const auto say = [&text](std::string_view sentence) { text.append(text.empty() ? "" : " ").append(sentence); };
    if (hasSteps()) {
        say("The steps are carried out in order, and their places are those in the programme so far. What is moved is "
            "taken out first; the place after \"to\" is counted without it.");
        if (m_document.notes.reels().size() > 1)
            say("What is put into a reel or taken out of it leaves the starts of the others where they are.");
        if (m_document.notes.reels().size() > 1 && movesReels())
            say(m_document.notes.isOverfull()
                    ? "Reels are moved as a whole. Where all of them are on one timeline, one of them lies on another "
                      "for a moment, since the day has no free place for it."
                    : "Reels are moved as a whole in such an order that none ever lies on another, also where all of "
                      "them are on one timeline.");
        say("In the lines below a step, \"at\" is a place in the old cut. The offset of a step is what the reel has "
            "gained so far; that of kept picture is how much later it stands now than in the old cut.");
        if (m_document.layout.showsFeet)
            say("Feet are counted in the programme so far, from the first frame of the reel, and the last frame of a "
                "stretch is counted in.");
    }
    if (m_document.sound != nullptr)
        say("The time of a clip is its start in the old project; of what is new, and where automation jumps, it is "
            "that of the new cut.");
    return text;
}

std::vector<std::string> NotesWording::settings() const
{
    using Origin = SettingsReport::Origin;
    std::vector<std::string> lines;
    for (const Origin origin : {Origin::CommandLine, Origin::Project, Origin::Default}) {
        std::string options;
        for (const std::string& option : m_document.settings.optionsFrom(origin))
            options.append(" ").append(option);
        if (!options.empty())
            lines.push_back(concatenated({titleOf(origin), options}));
    }
    return lines;
}

std::string NotesWording::cutTitle(bool isNew) const
{
    const std::vector<std::string>& titles = isNew ? m_document.cuts.newTitles : m_document.cuts.oldTitles;
    if (titles.empty())
        return toPrintable(cutName(isNew)).text;
    const std::string first = toPrintable(titles.front(), MostCharactersOfATitle).text;
    return titles.size() == 1 ? first : first + " ... " + toPrintable(titles.back(), MostCharactersOfATitle).text;
}

std::string NotesWording::titles() const
{
    if (m_document.cuts.oldTitles.empty() && m_document.cuts.newTitles.empty())
        return {};
    return concatenated({cutTitle(false), " to ", cutTitle(true)});
}

std::string NotesWording::bothCuts() const
{
    const std::string was = cutTitle(false);
    const std::string is = cutTitle(true);
    if (was != is)
        return concatenated({was, " to ", is});
    return toPrintable(concatenated({cutName(false), " to ", cutName(true)})).text;
}

std::string NotesWording::nothingHasChanged() const
{
    return passedOver(false) == passedOver(true) ? "Nothing has changed."
                                                 : "Nothing has changed in the picture that could be read; see below.";
}

/// The lines of a cut that have no picture or no place that can be read, and those that were not read.
std::multiset<std::string> NotesWording::passedOver(bool isNew) const
{
    std::multiset<std::string> lines;
    const core::Programme& cut = isNew ? m_document.notes.newCut() : m_document.notes.oldCut();
    for (const core::DoubtfulEvent& doubtful : cut.doubts()) {
        if (doubtful.doubt != PictureDoubt::NoPicture)
            continue;
        const EventBase& event = cut.events().at(static_cast<std::size_t>(doubtful.event));
        lines.insert(concatenated({event.rollName(), "\n", event.clipName(), "\n", event.srcIn().toString(),
                                   event.srcOut().toString(), event.dstIn().toString(), event.dstOut().toString()}));
    }
    for (const auto& [file, unreadLines] : isNew ? m_document.cuts.newUnread : m_document.cuts.oldUnread) {
        for (const auto& [line, problem] : unreadLines)
            lines.insert(line.text);
    }
    return lines;
}

bool NotesWording::movesReels() const
{
    const auto movesReel = [](const NoteEntry& entry) {
        return entry.step() != nullptr && entry.step()->action == StepAction::MoveReel;
    };
    const auto& reels = m_document.notes.reels();
    return std::any_of(reels.begin(), reels.end(), [&](const core::ReelNotes& reel) {
        return std::any_of(reel.entries.begin(), reel.entries.end(), movesReel);
    });
}

bool NotesWording::hasSteps() const
{
    return m_document.notes.totals().steps > 0;
}

std::string NotesWording::fileOf(const std::string& file, bool isNew) const
{
    const auto has = [&file](const std::vector<std::string>& names) {
        return std::find(names.begin(), names.end(), file) != names.end();
    };
    const std::string name = toPrintable(file, MostCharactersOfAName).text;
    if (!has(m_document.cuts.oldNames) || !has(m_document.cuts.newNames))
        return name;
    return concatenated({isNew ? "New cut, " : "Old cut, ", name});
}

std::string NotesWording::cutText(bool isNew) const
{
    return describeEvents(isNew ? m_document.newEvents : m_document.oldEvents, {cutName(isNew)},
                          countOf(isNew ? m_document.cuts.newUnread : m_document.cuts.oldUnread));
}

std::string NotesWording::nameOf(const EventBase* shot)
{
    if (shot == nullptr)
        return "no picture";
    return toPrintable(shot->clipName().empty() ? shot->rollName() : shot->clipName(), MostCharactersOfAName).text;
}

} // namespace cadrel::app
