// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Project.h"

#include "standin/base/FilePath.h"
#include "standin/project/ProjectForm.h"
#include "standin/project/Track.h"
#include "velmark/Module.h"

#include <algorithm>
#include <cmath>
#include <string_view>

using namespace Velmark;

namespace standin {

namespace {

class Locators : public Implements<Locators, FObject, ILocators> {
public:
    static constexpr const char* ClassName = "Locators";

    Locators(Counted<Parameter> left, Counted<Parameter> right) : m_left(std::move(left)), m_right(std::move(right)) {}

    IParameter* getParameter(const char* name) override
    {
        const std::string_view asked = name ? name : "";
        if (asked == ParameterName::LeftTime)
            return m_left.get();
        return asked == ParameterName::RightTime ? m_right.get() : nullptr;
    }

private:
    Counted<Parameter> m_left;
    Counted<Parameter> m_right;
};

void collectTracks(const Container& container, std::vector<Track*>& tracks)
{
    for (Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        auto& track = static_cast<Track&>(*child);
        tracks.push_back(&track);
        if (track.isFolder())
            collectTracks(track, tracks);
    }
}

} // namespace

Project::Project(ChangeLog& log)
    : m_link(makeCounted<ProjectLink>(*this, *this, log)), m_frameRate{24.0, 0}, m_pool(makeCounted<MediaPool>(m_link)),
      m_locatorLeft(makeCounted<Parameter>()), m_locatorRight(makeCounted<Parameter>()),
      m_cycleLeft(makeCounted<Parameter>()), m_cycleRight(makeCounted<Parameter>()),
      m_position(makeCounted<Parameter>()), m_locators(makeCounted<Locators>(m_locatorLeft, m_locatorRight))
{
    m_pool->setFrameRate(m_frameRate.framesPerSecond);
}

Project::~Project()
{
    clearChanges();
    m_link->cut();
}

int32 Project::setProjectEnd(double seconds)
{
    if (!(seconds >= 0.0 && seconds <= FurthestTime))
        return ResultFalse;
    if (seconds != m_endTime)
        change(*this, &Project::exchangeEndTime, seconds);
    return ResultOk;
}

IFilePath* Project::getProjectFile(IProjectDocument* project)
{
    if (project != this || m_path.empty())
        return nullptr;
    return makeCounted<FilePath>(m_path).detach();
}

IMarkerTrack* Project::getDefaultMarkerTrack()
{
    return defaultMarkerTrack();
}

ILocators* Project::getLocators()
{
    return m_locators.get();
}

FUnknown* Project::getContainer(FUnknown* object)
{
    Node* node = this;
    if (object) {
        node = dynamic_cast<Node*>(object);
        if (!node || node->project() != this)
            return nullptr;
        if (!node->holdsChildren())
            node = node->parent();
    }
    return static_cast<FObject*>(Counted<Node>::share(node).detach());
}

FUnknown* Project::createTrack(const char* typeWord)
{
    const std::optional<Track::Kind> kind = typeWord ? Track::kindOf(typeWord) : std::nullopt;
    return kind ? static_cast<FObject*>(Track::create(*kind).detach()) : nullptr;
}

int32 Project::addStorageNotification(IProjectStorageNotification* listener)
{
    return m_storageListeners.add(listener);
}

int32 Project::removeStorageNotification(IProjectStorageNotification* listener)
{
    return m_storageListeners.remove(listener);
}

IMediaPool* Project::getMediaPool()
{
    return m_pool.get();
}

int32 Project::getFrameRate(FrameRateInfo& info)
{
    info = m_frameRate;
    return ResultOk;
}

double Project::getTimeOrigin()
{
    return m_timeOrigin;
}

double Project::lastEnd() const
{
    double latest = m_endTime;
    for (const Node* child = firstChild(); child; child = childBehind(*child))
        latest = std::max(latest, child->lastEnd());
    return latest;
}

bool Project::accepts(const Node& child) const
{
    return dynamic_cast<const Track*>(&child) != nullptr;
}

void Project::setPath(std::u16string path)
{
    m_path = std::move(path);
    m_pool->setProjectFile(m_path);
}

void Project::setForm(std::unique_ptr<ProjectForm> form)
{
    m_form = std::move(form);
}

void Project::setFrameRate(const FrameRateInfo& info)
{
    m_frameRate = info;
    m_pool->setFrameRate(info.framesPerSecond);
    m_link->changes().markProject(ChangeFlag::Content);
}

void Project::setTimeOrigin(double seconds)
{
    m_timeOrigin = seconds;
    m_link->changes().markProject(ChangeFlag::Content);
}

MarkerTrack* Project::defaultMarkerTrack() const
{
    for (Node* child = firstChild(); child; child = childBehind(*child)) {
        if (auto* const track = dynamic_cast<MarkerTrack*>(child))
            return track;
    }
    return nullptr;
}

std::vector<Track*> Project::allTracks() const
{
    std::vector<Track*> tracks;
    collectTracks(*this, tracks);
    return tracks;
}

bool Project::announceStoring()
{
    const auto keptAlive = Counted<Project>::share(this);
    bool haveStored = true;
    m_storageListeners.anyOf([&](IProjectStorageNotification& listener) {
        haveStored = listener.projectStoring(this) == ResultOk && haveStored;
        return false;
    });
    return haveStored;
}

double Project::exchangeEndTime(double seconds)
{
    std::swap(m_endTime, seconds);
    markContentChanged();
    return seconds;
}

} // namespace standin
