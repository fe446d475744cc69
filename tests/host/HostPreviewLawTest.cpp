// SPDX-License-Identifier: GPL-3.0-or-later

// The law of previews, for random projects and whatever the user does meanwhile: once the last one has ended, each of the
// user's tracks has the bytes that it had before, and beside them what the user himself has laid there, what he has made of
// copies, and his automation. No curve of the film has been bent.

#include "host/project/Project.h"
#include "tests/host/RandomRun.h"
#include "tests/host/project/AlteredEdits.h"
#include "velmark/Editing.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using nlohmann::json;

constexpr double Day = 86400.0;

/// Previews of a random film, and the user beside them.
class RandomPreviews {
public:
    explicit RandomPreviews(Chance& chance) : run(chance), m_chance(chance)
    {
        if (m_chance.oneIn(2))
            run.includeOverhanging();
        // The change list stays the same, whatever is undone.
        m_film = filmOf(tracks());
        for (standin::Track* const track : run.usersTracks()) {
            for (const auto& [number, curve] : track->curves())
                m_courses.try_emplace({track, number}, courseOf(*curve));
        }
        m_end = run.project.getEnd(nullptr);
    }

    void takeStep()
    {
        switch (m_chance.below(4)) {
        case 0:
            goBackOrForth();
            break;
        case 1:
            edit();
            break;
        default:
            const std::set<Place> level = unbent();
            letTheSystemWork();
            const std::set<Place> after = unbent();
            RC_ASSERT(std::ranges::includes(after, level));
        }
    }

    /// What stands in the film is never touched.
    void expectFilm() { RC_ASSERT(eventsOf(filmOf(tracks())).dump() == eventsOf(m_film).dump()); }

    void endPreviews()
    {
        const std::set<Place> level = unbent();
        run.adapter->setPreviewActive(false);
        // What an edit that failed has left.
        run.adapter->endPreview();
        const std::set<Place> after = unbent();
        RC_ASSERT(std::ranges::includes(after, level));
    }

    void expectAllAsBefore()
    {
        std::multiset<std::string> laid;
        json now = tracks();
        for (std::size_t index = 0; index < now.size(); ++index) {
            json others = json::array();
            for (const json& event : now[index]["events"]) {
                const std::string name = nameOf(event);
                if (name.starts_with(Laid))
                    laid.insert(describe(index, name, event["start"], endOf(event)));
                else
                    others.push_back(event);
            }
            now[index]["events"] = others;
        }
        for (standin::Track* const track : run.project.allTracks()) {
            if (!isOfMemos(*track))
                continue;
            for (const auto& memo : standin::tests::childrenOf(*track)) {
                const std::string name = ConstString(memo->getName()).text8();
                if (name.starts_with(Laid))
                    laid.insert(describe(OfMemos, name, memo->getStart(nullptr), memo->getEnd(nullptr)));
            }
        }
        for (std::size_t index = 0; index < now.size(); ++index)
            takePoints(index, now[index], laid);
        RC_ASSERT(laid == laidByUser());
        json before = m_film;
        for (json& track : before)
            takePoints(0, track, laid);
        expectSame(now, before);
        if (m_laid.empty())
            RC_ASSERT(run.project.getEnd(nullptr) == m_end);
        RC_ASSERT(run.project.hasAttribute(AttributeKey::ProjectEnd) != ResultOk);
        for (standin::Track* const track : run.project.allTracks())
            RC_ASSERT(track->hasAttribute(AttributeKey::Preview) != ResultOk);
    }

    RandomRun run;

private:
    /// A curve.
    using Place = std::pair<standin::Track*, std::int32_t>;
    /// Its values all over the film.
    using Course = std::vector<double>;

    void letTheSystemWork()
    {
        switch (m_chance.below(9)) {
        case 0:
            run.adapter->setPreviewActive(true);
            break;
        case 1:
        case 2:
        case 3:
            preview();
            break;
        case 4:
            endPreviews();
            break;
        case 5:
            run.adapter->endPreview();
            break;
        case 6:
            if (m_chance.oneIn(2))
                reopen();
            else
                moveOrigin();
            break;
        case 7:
            runAndUndo();
            break;
        default:
            failToPreview();
        }
    }
    void goBackOrForth()
    {
        const bool isBack = m_chance.oneIn(2);
        for (std::uint64_t count = 1 + m_chance.below(3); count > 0; --count) {
            if (isBack)
                run.application.edits().undo(run.project);
            else if (!isRunNext())
                run.application.edits().redo(run.project);
        }
    }
    void edit()
    {
        switch (m_chance.below(6)) {
        case 0:
            lay();
            break;
        case 1:
        case 2:
            editCopy();
            break;
        case 3:
        case 4:
            addPoint();
            break;
        default:
            editPoint();
        }
    }

    static Course courseOf(const standin::Envelope& curve)
    {
        Course values;
        for (double time = 0.0; time < EndOfFilm; time += 12.5)
            values.push_back(curve.valueBehind(time).value_or(-1.0));
        return values;
    }
    /// The curves that run in the film as they did at first.
    std::set<Place> unbent()
    {
        std::set<Place> same;
        for (standin::Track* const track : run.usersTracks()) {
            for (const auto& [number, curve] : track->curves()) {
                const auto isSame = [](double a, double b) { return std::abs(a - b) < 1e-6; };
                const auto before = m_courses.find({track, number});
                if (before != m_courses.end() && std::ranges::equal(courseOf(*curve), before->second, isSame))
                    same.insert({track, number});
            }
        }
        return same;
    }
    static void expectSame(const json& now, const json& before)
    {
        RC_ASSERT(now.size() == before.size());
        for (std::size_t index = 0; index < now.size(); ++index)
            RC_ASSERT(now[index].dump() == before[index].dump());
    }

    static constexpr const char* Laid = "laid ";
    /// Random projects have no points on it, nor on those with higher numbers.
    static constexpr std::int32_t UsersCurve = 8;
    /// In the place of the index of a track.
    static constexpr std::size_t OfMemos = 1000;

    struct ByUser {
        std::u16string entry;
        std::string event;
    };

    core::EventList someEvents()
    {
        core::EventList& changes = run.model().changeEdl();
        core::EventList events;
        const std::size_t first = m_chance.below(changes.size());
        events.append(changes, first, 1 + m_chance.below(changes.size() - first));
        return events;
    }
    void preview()
    {
        run.adapter->setPreviewActive(true);
        RC_ASSERT(run.adapter->startPreview(someEvents(), 0, 0, m_chance.oneIn(4) ? 0 : 1) == Result::Ok);
        run.application.idle();
    }
    /// Whether a redo would carry the film over.
    bool isRunNext() const
    {
        const standin::UndoList& entries = run.project.undoList();
        return entries.canRedo() && entries.nameAt(entries.doneCount()).starts_with(u"Apply Cadrel");
    }
    void runAndUndo()
    {
        RC_ASSERT(run.adapter->startCadrel() == Result::Ok);
        run.application.idle();
        const standin::UndoList& entries = run.project.undoList();
        RC_ASSERT(entries.doneCount() > 0);
        const std::u16string& name = entries.nameAt(entries.doneCount() - 1);
        RC_ASSERT(name == std::u16string(u"Apply Cadrel"));
        RC_ASSERT(run.application.edits().undo(run.project));
    }
    void failToPreview()
    {
        const auto edits = makeCounted<AlteredEdits>(run.application.context());
        edits->closes = m_chance.oneIn(2);
        edits->deletes = !edits->closes && m_chance.oneIn(2);
        run.context.replace(Velmark::IEditService::iid, edits);
        if (m_chance.oneIn(2))
            preview();
        else
            run.adapter->endPreview();
        run.context.unhide(Velmark::IEditService::iid);
    }
    void lay()
    {
        const Tracks user = run.usersTracks();
        std::vector<std::pair<std::size_t, standin::Track*>> fitting;
        for (std::size_t index = 0; index < user.size(); ++index) {
            if (user[index]->kind() == standin::Track::Kind::Audio ||
                user[index]->kind() == standin::Track::Kind::Marker)
                fitting.emplace_back(index, user[index]);
        }
        for (standin::Track* const track : run.project.allTracks()) {
            if (isOfMemos(*track))
                fitting.emplace_back(OfMemos, track);
        }
        if (fitting.empty())
            return;
        const auto [index, track] = m_chance.oneOf(fitting);
        const std::string name = Laid + std::to_string(m_laid.size());
        const double start =
            Day * static_cast<double>(m_chance.below(3)) + static_cast<double>(m_chance.below(4000)) + 2.0 * EndOfFilm;
        const double end = start + 1.0 + static_cast<double>(m_chance.below(30));
        const std::u16string entry(name.begin(), name.end());
        Counted<standin::Event> event;
        if (track->kind() == standin::Track::Kind::Marker)
            event = makeCounted<standin::Marker>(true);
        else
            event = makeCounted<standin::ClipEvent>();
        event->setName(entry);
        event->setSpan(start, end);
        standin::EditService& edits = run.application.edits();
        RC_ASSERT(edits.begin(true) == ResultOk);
        event->insertInto(*track);
        RC_ASSERT(edits.commit(&run.project, entry.c_str()) == ResultOk);
        m_laid.push_back({entry, describe(index, name, start, end)});
    }
    /// Makes a copy in the preview the user's own: he names it and leaves it, takes it elsewhere or cuts it.
    void editCopy()
    {
        const Tracks user = run.usersTracks();
        std::vector<std::pair<std::size_t, Counted<standin::Event>>> copies;
        for (std::size_t index = 0; index < user.size(); ++index) {
            for (const auto& child : standin::tests::childrenOf(*user[index])) {
                if (child->getStart(nullptr) > 2.0 * EndOfFilm &&
                    !std::string(ConstString(child->getName()).text8()).starts_with(Laid))
                    copies.emplace_back(index,
                                        Counted<standin::Event>::share(dynamic_cast<standin::Event*>(child.get())));
            }
        }
        if (copies.empty())
            return;
        const auto [index, copy] = m_chance.oneOf(copies);
        const std::string name = Laid + std::to_string(m_laid.size());
        const std::u16string entry(name.begin(), name.end());
        standin::EditService& edits = run.application.edits();
        RC_ASSERT(edits.begin(true) == ResultOk);
        copy->setName(entry);
        if (m_chance.oneIn(3)) {
            const double by = static_cast<double>(m_chance.below(200)) / 8.0;
            copy->setSpan(copy->start() + by, copy->end() + by);
        } else if (m_chance.oneIn(2)) {
            copy->setSpan(copy->start(), copy->start() + copy->length() / 2.0);
        }
        m_laid.push_back({entry, describe(index, name, copy->start(), copy->end())});
        RC_ASSERT(edits.commit(&run.project, entry.c_str()) == ResultOk);
    }
    /// Automation of the user's, before a preview or in its stretch: on a curve of the film, on which the system writes, or
    /// on one of his own.
    void addPoint()
    {
        const Tracks user = run.usersTracks();
        std::vector<std::pair<std::size_t, standin::Track*>> fitting;
        for (std::size_t index = 0; index < user.size(); ++index) {
            if (user[index]->hasAutomation())
                fitting.emplace_back(index, user[index]);
        }
        if (fitting.empty())
            return;
        const auto [index, track] = m_chance.oneOf(fitting);
        const std::string name = Laid + std::to_string(m_laid.size());
        const std::u16string entry(name.begin(), name.end());
        const double time = someTime() + static_cast<double>(m_laid.size()) / 64.0;
        const auto own = UsersCurve + static_cast<std::int32_t>(m_laid.size());
        const std::int32_t number =
            m_chance.oneIn(3) ? own : 1 + static_cast<std::int32_t>(m_chance.below(UsersCurve - 1));
        const auto point = makeCounted<standin::AutomationPoint>();
        point->setName(entry);
        point->setSpan(time, time);
        point->setValue(0.75);
        standin::EditService& edits = run.application.edits();
        RC_ASSERT(edits.begin(true) == ResultOk);
        point->insertInto(track->curve(number));
        RC_ASSERT(edits.commit(&run.project, entry.c_str()) == ResultOk);
        m_laid.push_back({entry, describe(index, name, time, 0.75)});
    }
    /// After the film: among what a preview shows, or anywhere.
    double someTime()
    {
        const double offset = run.adapter->getRunState().previewOffset - run.project.timeOrigin();
        const double shown = offset + static_cast<double>(m_chance.below(150));
        const double anywhere =
            Day * static_cast<double>(m_chance.below(3)) + 2.0 * EndOfFilm + static_cast<double>(m_chance.below(2000));
        return m_chance.oneIn(2) && shown > 2.0 * EndOfFilm && shown < 20.0 * Day ? shown : anywhere;
    }
    /// Makes a point that the system has written the user's own: he moves it, or gives it another value.
    void editPoint()
    {
        const Tracks user = run.usersTracks();
        std::vector<std::pair<std::size_t, standin::AutomationPoint*>> points;
        for (std::size_t index = 0; index < user.size(); ++index) {
            for (const auto& [number, curve] : user[index]->curves()) {
                for (auto* point = curve->firstPoint(); point; point = curve->pointBehind(*point)) {
                    const std::string name = ConstString(point->getName()).text8();
                    if (point->start() > 2.0 * EndOfFilm && !name.starts_with(Laid))
                        points.emplace_back(index, point);
                }
            }
        }
        if (points.empty())
            return;
        const auto [index, point] = m_chance.oneOf(points);
        const std::string name = Laid + std::to_string(m_laid.size());
        const std::u16string entry(name.begin(), name.end());
        standin::EditService& edits = run.application.edits();
        RC_ASSERT(edits.begin(true) == ResultOk);
        point->setName(entry);
        if (m_chance.oneIn(2)) {
            const double time = point->start() + 1.0 + static_cast<double>(m_chance.below(40)) / 8.0;
            point->setSpan(time, time);
        } else {
            point->setValue(point->value() > 0.5 ? 0.203125 : 0.796875);
        }
        m_laid.push_back({entry, describe(index, name, point->start(), point->value())});
        RC_ASSERT(edits.commit(&run.project, entry.c_str()) == ResultOk);
    }
    /// Moves the points of the user's from a stored track to what is laid, and takes those out that only keep the film level.
    static void takePoints(std::size_t track, json& stored, std::multiset<std::string>& laid)
    {
        const auto curves = stored.find("curves");
        if (curves == stored.end())
            return;
        json others = json::array();
        for (json curve : *curves) {
            json film = json::array();
            std::vector<double> before;
            bool keepsLevel = false;
            for (const json& point : curve["points"]) {
                const double value = point["value"];
                if (nameOf(point).starts_with(Laid)) {
                    laid.insert(describe(track, nameOf(point), point["time"], value));
                    keepsLevel = false;
                } else if (point["time"] < EndOfFilm) {
                    film.push_back(point);
                } else {
                    // What is drawn before it afterwards may have another value.
                    RC_ASSERT(
                        std::ranges::any_of(before, [&](double level) { return std::abs(level - value) < 1e-6; }));
                    RC_ASSERT(!keepsLevel);
                    keepsLevel = true;
                }
                before.push_back(value);
            }
            // One that keeps the film level has something of the user's after it.
            RC_ASSERT(!keepsLevel);
            curve["points"] = film;
            if (!film.empty())
                others.push_back(curve);
        }
        if (others.empty())
            stored.erase("curves");
        else
            stored["curves"] = others;
    }
    void reopen()
    {
        run.project.announceStoring();
        run.adapter.reset();
        run.connect();
    }
    void moveOrigin()
    {
        run.project.setTimeOrigin(static_cast<double>(m_chance.below(60)) * 3600.0);
        run.application.idle();
    }

    /// The user's tracks as they are stored, without what says who holds them and what a memo is known by.
    json tracks()
    {
        std::vector<json> stored;
        flatten(json::parse(run.bytes())["tracks"], stored);
        const Tracks live = run.project.allTracks();
        RC_ASSERT(stored.size() == live.size());
        json found = json::array();
        for (std::size_t index = 0; index < live.size(); ++index) {
            if (!RandomRun::isUsers(*live[index]))
                continue;
            json& attributes = stored[index]["attributes"];
            if (attributes.is_null())
                attributes = json::object();
            attributes.erase(AttributeKey::LockState);
            found.push_back(stored[index]);
        }
        return found;
    }
    /// In the order of the live ones, which have a role also where it isn't one that the project stores.
    static void flatten(const json& stored, std::vector<json>& found)
    {
        for (const json& track : stored) {
            found.push_back(track);
            if (track["kind"] == "folder")
                flatten(track["tracks"], found);
        }
    }
    static bool isOfMemos(standin::Track& track)
    {
        return track.kind() == standin::Track::Kind::Marker && RandomRun::roleOf(track) == TrackRole::Memos;
    }
    static json filmOf(json tracks)
    {
        for (json& track : tracks) {
            json events = json::array();
            for (const json& event : track["events"]) {
                if (event["start"] < EndOfFilm)
                    events.push_back(event);
            }
            track["events"] = events;
        }
        return tracks;
    }
    static json eventsOf(const json& tracks)
    {
        json events = json::array();
        for (const json& track : tracks)
            events.push_back(track["events"]);
        return events;
    }
    /// A name that is no text is stored as something else, and isn't one of what is laid here.
    static std::string nameOf(const json& event)
    {
        const auto name = event.find("name");
        return name != event.end() && name->is_string() ? name->get<std::string>() : std::string();
    }
    static double endOf(const json& event)
    {
        // A point marker has none.
        const auto end = event.find("end");
        return end != event.end() ? end->get<double>() : event["start"].get<double>();
    }
    static std::string describe(std::size_t track, const std::string& name, double start, double end)
    {
        return std::to_string(track) + ": " + name + " " + std::to_string(start) + "-" + std::to_string(end);
    }
    /// Of what the user has laid, what his undo list still has.
    std::multiset<std::string> laidByUser() const
    {
        std::multiset<std::string> events;
        const standin::UndoList& entries = run.project.undoList();
        for (std::size_t index = 0; index < entries.doneCount(); ++index) {
            for (const ByUser& laid : m_laid) {
                if (laid.entry == entries.nameAt(index))
                    events.insert(laid.event);
            }
        }
        return events;
    }

    Chance& m_chance;
    std::vector<ByUser> m_laid;
    json m_film;
    std::map<Place, Course> m_courses; ///< in the film, at first
    double m_end = 0.0;
};

} // namespace

RC_GTEST_PROP(HostPreviewLaw, LeavesEachByteOfTheUsersWhateverHeDoesMeanwhile, ())
{
    standin::tests::SeededChance chance(someSeed());
    RandomPreviews previews(chance);
    RC_PRE(canRun(previews.run));

    for (std::uint64_t count = 2 + chance.below(14); count > 0; --count) {
        previews.takeStep();
        previews.expectFilm();
    }
    previews.endPreviews();

    previews.expectAllAsBefore();
}

} // namespace cadrel::host::tests
