// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/SoundNotes.h"

#include "core/notes/StepPlaces.h"

#include <algorithm>
#include <tuple>
#include <utility>

namespace cadrel::core {

namespace {

/// Finds the scenes that have something of a stretch.
class SceneSearch {
public:
    explicit SceneSearch(std::vector<SoundScene> scenes) : m_scenes(std::move(scenes))
    {
        std::stable_sort(m_scenes.begin(), m_scenes.end(),
                         [](const SoundScene& a, const SoundScene& b) { return a.was.start < b.was.start; });
        for (const SoundScene& scene : m_scenes)
            m_latestEnds.push_back(m_latestEnds.empty() ? scene.was.end : std::max(m_latestEnds.back(), scene.was.end));
    }

    /// Adds the places of the scenes to the list.
    void find(const SecondsRange& range, std::vector<std::size_t>& found) const
    {
        const auto after = std::partition_point(m_scenes.begin(), m_scenes.end(), [&](const SoundScene& scene) {
            return scene.was.start < range.end - SameInstant;
        });
        for (auto index = static_cast<std::size_t>(after - m_scenes.begin());
             index > 0 && m_latestEnds[index - 1] > range.start + SameInstant; --index) {
            if (m_scenes[index - 1].was.end > range.start + SameInstant)
                found.push_back(index - 1);
        }
    }
    const std::string& nameOf(std::size_t scene) const { return m_scenes[scene].name; }

private:
    std::vector<SoundScene> m_scenes;
    std::vector<double> m_latestEnds; ///< of the scenes up to each
};

/// The number of the step at which a change is told; 0 for none.
std::size_t stepOf(const SoundChange& change, const StepPlaces& places)
{
    return change.now ? places.stepAtNew(*change.now) : places.stepAtOld(change.lost);
}

void makeUnique(std::vector<std::size_t>& numbers)
{
    std::sort(numbers.begin(), numbers.end());
    numbers.erase(std::unique(numbers.begin(), numbers.end()), numbers.end());
}

} // namespace

SoundCount& SoundCount::operator+=(const SoundCount& other)
{
    all += other.all;
    stay += other.stay;
    moved += other.moved;
    trimmed += other.trimmed;
    split += other.split;
    doubled += other.doubled;
    lost += other.lost;
    added += other.added;
    return *this;
}

std::size_t StepSound::count(SoundChangeKind kind) const
{
    return static_cast<std::size_t>(std::count_if(changes.begin(), changes.end(),
                                                  [kind](const SoundChange& change) { return change.kind == kind; }));
}

SoundNotes::SoundNotes(const ChangeNotes& notes, SoundFacts facts) : m_steps(notes.totals().steps + 1)
{
    const StepPlaces places(notes);
    addScenes(places, std::move(facts.scenes));
    for (SoundChange& change : facts.changes) {
        StepSound& step = m_steps[stepOf(change, places)];
        step.tracks.push_back(change.track);
        step.changes.push_back(std::move(change));
    }
    for (AutomationJump& jump : facts.jumps)
        m_steps[places.stepAtNew(jump.place)].jumps.push_back(std::move(jump));
    addCarried(places, facts.carried);
    sortChanges();
}

void SoundNotes::addScenes(const StepPlaces& places, std::vector<SoundScene> scenes)
{
    const SceneSearch search(std::move(scenes));
    for (std::size_t step = 1; step < m_steps.size(); ++step) {
        std::vector<std::size_t> found;
        for (const SecondsRange& range : places.inOld(step))
            search.find(range, found);
        makeUnique(found);
        for (const std::size_t scene : found)
            m_steps[step].scenes.push_back(search.nameOf(scene));
    }
}

void SoundNotes::addCarried(const StepPlaces& places, const std::vector<CarriedPiece>& carried)
{
    if (!places.hasMoves())
        return;
    std::vector<std::size_t> movesOfClip;
    for (std::size_t piece = 0; piece < carried.size(); ++piece) {
        if (piece == 0 || carried[piece].clip != carried[piece - 1].clip)
            movesOfClip.clear();
        const SecondsRange& was = carried[piece].was;
        const std::size_t move = places.moveOf((was.start + was.end) / 2);
        if (move == 0 || std::find(movesOfClip.begin(), movesOfClip.end(), move) != movesOfClip.end())
            continue;
        movesOfClip.push_back(move);
        ++m_steps[move].movedClips;
        m_steps[move].tracks.push_back(carried[piece].track);
    }
}

void SoundNotes::sortChanges()
{
    for (StepSound& step : m_steps) {
        std::stable_sort(step.changes.begin(), step.changes.end(), [](const SoundChange& a, const SoundChange& b) {
            return std::tie(a.track, a.was.start) < std::tie(b.track, b.was.start);
        });
        std::stable_sort(step.jumps.begin(), step.jumps.end(), [](const AutomationJump& a, const AutomationJump& b) {
            return a.place.start < b.place.start;
        });
        makeUnique(step.tracks);
    }
}

} // namespace cadrel::core
