// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/EditService.h"

#include "standin/edit/ProjectManager.h"
#include "standin/edit/RangeEdits.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "velmark/Module.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <optional>
#include <utility>

using namespace Velmark;

namespace standin {

namespace {

/// A step of a module among the edits.
class StepEdit : public Edit {
public:
    explicit StepEdit(IEditStep* step) : m_step(Counted<IEditStep>::share(step)) {}

    void undo() override { m_step->undo(); }
    void redo() override { m_step->redo(); }

private:
    Counted<IEditStep> m_step;
};

bool liesIn(Node& node, FUnknown* object)
{
    const IProjectNode* const container = dynamic_cast<Node*>(object);
    IProjectNode* around = node.getParent();
    while (around && around != container)
        around = around->getParent();
    return around != nullptr;
}

int depthOf(const Container& container)
{
    int depth = 1;
    for (const Container* around = container.parent(); around; around = around->parent())
        ++depth;
    return depth;
}

/// Whether all that is in the node can be in the project: its clips are of the project's pool, and there are no more than so
/// many levels of containers.
bool isFit(const Node& node, const Project& project, int levels)
{
    if (const auto* const event = dynamic_cast<const ClipEvent*>(&node); event && event->clip())
        return event->clip()->project() == &project;
    if (!node.holdsChildren())
        return true;
    if (levels == 0)
        return false;
    const auto& container = static_cast<const Container&>(node);
    for (const Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        if (!isFit(*child, project, levels - 1))
            return false;
    }
    return true;
}

/// Puts a node into a container of a project, if it can lie there, and keeps its times of the project.
int32 place(Node& node, Container& container)
{
    const Project& project = *container.project();
    if (!container.accepts(node) || !node.canBelongTo(project) ||
        !isFit(node, project, Project::DeepestNesting - depthOf(container)))
        return EditService::Refused;
    const double containerStart = container.absoluteStart();
    const double start = node.absoluteStart() - containerStart;
    const double end = node.absoluteEnd() - containerStart;
    if (start <= -SameInstant || node.absoluteEnd() > FurthestTime)
        return EditService::Refused;
    node.insertInto(container);
    node.setSpan(std::max(start, 0.0), std::max(end, 0.0));
    return ResultOk;
}

bool isTime(double seconds)
{
    return std::abs(seconds) <= FurthestTime;
}

bool isRange(double start, double end)
{
    return isTime(start) && isTime(end) && start <= end;
}

/// The tracks of the list that hold events; nothing when there is anything in it that is no track of the project.
std::optional<std::vector<Track*>> tracksOf(IObjectList* list, const Project& project)
{
    if (!list)
        return std::nullopt;
    std::vector<Track*> tracks;
    const int32 count = list->count();
    for (int32 index = 0; index < count; ++index) {
        auto* const track = dynamic_cast<Track*>(list->at(index));
        if (!track || track->project() != &project)
            return std::nullopt;
        if (!track->isFolder())
            tracks.push_back(track);
    }
    return tracks;
}

std::vector<Track*> allButRulers(const Project& project)
{
    std::vector<Track*> tracks = project.allTracks();
    std::erase_if(tracks, [](const Track* track) { return track->isFolder() || track->kind() == Track::Kind::Ruler; });
    return tracks;
}

} // namespace

bool EditService::undo(Project& project)
{
    return revert<&UndoList::undo>(project);
}

bool EditService::redo(Project& project)
{
    return revert<&UndoList::redo>(project);
}

void EditService::endAfterClosing(Project& closed)
{
    if (isOpen())
        addEntries(closed, u"");
}

template <bool (UndoList::*step)()>
bool EditService::revert(Project& project)
{
    if (isOpen() || m_isReverting || !m_projects.find(&project))
        return false;
    m_isReverting = true;
    const bool done = (project.undoList().*step)();
    m_isReverting = false;
    if (done)
        m_projects.tellChanges(project);
    return done;
}

int32 EditService::copyRange(IProjectDocument* document, IObjectList* list, int32 /*reserved*/, double start,
                             double end, double destination)
{
    const Project* const project = m_projects.find(document);
    if (!isOpen() || !project || !isRange(start, end) || !isRange(destination, destination + (end - start)))
        return Refused;
    const std::optional<std::vector<Track*>> tracks = tracksOf(list, *project);
    if (!tracks)
        return Refused;
    RangeContent(*project, *tracks, start, end).writeAt(destination);
    return ResultOk;
}

int32 EditService::closeRange(IProjectDocument* document, IObjectList* list, double start, double end,
                              double /*reserved*/)
{
    const Project* const project = m_projects.find(document);
    if (!isOpen() || !project || !isRange(start, end))
        return Refused;
    const std::optional<std::vector<Track*>> tracks = tracksOf(list, *project);
    if (!tracks)
        return Refused;
    return joinPieces(*tracks, start, end) ? ResultOk : ResultFalse;
}

int32 EditService::begin(bool /*flag*/)
{
    if (isOpen() || m_isReverting)
        return Refused;
    m_log.open();
    return ResultOk;
}

int32 EditService::commit(IProjectDocument* document, const char16_t* name)
{
    Project* const committed = m_projects.find(document);
    if (!committed || !isOpen() || m_isCommitting)
        return Refused;
    if (m_log.records().empty()) {
        m_log.close();
        return ResultOk;
    }
    m_isCommitting = true;
    for (const Counted<Project>& project : editedProjects(*committed))
        m_projects.edited(*project, *this);
    m_isCommitting = false;
    const std::vector<Counted<Project>> edited = editedProjects(*committed);
    addEntries(*committed, name ? name : u"");
    for (const Counted<Project>& project : edited)
        m_projects.tellChanges(*project);
    return ResultOk;
}

std::vector<Counted<Project>> EditService::editedProjects(Project& committed) const
{
    std::vector<Counted<Project>> projects;
    for (const ChangeLog::Record& record : m_log.records()) {
        // A project that was closed meanwhile may have been deleted, so it isn't accessed.
        Project* const project = m_projects.find(record.project ? record.project : &committed);
        if (project && std::find(projects.begin(), projects.end(), project) == projects.end())
            projects.push_back(Counted<Project>::share(project));
    }
    return projects;
}

void EditService::addEntries(Project& committed, const std::u16string& name)
{
    std::map<Project*, ChangeLog::Edits> edits;
    for (ChangeLog::Record& record : m_log.close())
        edits[record.project ? record.project : &committed].push_back(std::move(record.edit));
    for (auto& [project, ofProject] : edits) {
        if (m_projects.find(project))
            project->undoList().add(name, std::move(ofProject));
    }
}

int32 EditService::insert(FUnknown* parent, FUnknown* child)
{
    Container* const container = openContainer(parent);
    auto* const node = dynamic_cast<Node*>(child);
    if (!isOpen() || !container || !node || node->parent())
        return Refused;
    return place(*node, *container);
}

int32 EditService::remove(FUnknown* parent, FUnknown* child)
{
    Node* const node = openChild(parent, child);
    if (!isOpen() || !node)
        return Refused;
    // What isn't inserted counts its times from the start of the project.
    node->setSpan(node->absoluteStart(), node->absoluteEnd());
    node->remove();
    return ResultOk;
}

int32 EditService::move(FUnknown* parent, FUnknown* newParent, FUnknown* child)
{
    Container* const container = openContainer(newParent);
    Node* const node = openChild(parent, child);
    if (!isOpen() || !container || !node)
        return Refused;
    return place(*node, *container);
}

int32 EditService::copyAll(IProjectDocument* document, FUnknown** clipboard, double start, double end,
                           int32 /*reserved*/)
{
    if (!clipboard)
        return Refused;
    *clipboard = nullptr;
    const Project* const project = m_projects.find(document);
    if (!isOpen() || !project || !isRange(start, end))
        return Refused;
    auto content = makeCounted<RangeContent>(*project, allButRulers(*project), start, end);
    *clipboard = static_cast<FObject*>(content.detach());
    return ResultOk;
}

int32 EditService::paste(IProjectDocument* document, FUnknown* clipboard, int32 /*reserved*/, double destination)
{
    const Project* const project = m_projects.find(document);
    const auto* const content = dynamic_cast<RangeContent*>(clipboard);
    if (!isOpen() || !project || !content || !content->isOf(*project) ||
        !isRange(destination, destination + content->length()))
        return Refused;
    content->writeAt(destination);
    return ResultOk;
}

int32 EditService::deleteRange(IProjectDocument* document, int32 /*reserved*/, double start, double end)
{
    const Project* const project = m_projects.find(document);
    if (!isOpen() || !project || !isRange(start, end))
        return Refused;
    clearRange(allButRulers(*project), start, end);
    return ResultOk;
}

int32 EditService::addStep(IEditStep* step)
{
    if (!isOpen() || !step)
        return Refused;
    m_log.add(std::make_unique<StepEdit>(step));
    return ResultOk;
}

Container* EditService::openContainer(FUnknown* object) const
{
    auto* const container = dynamic_cast<Container*>(object);
    return container && container->holdsChildren() && m_projects.find(container->project()) ? container : nullptr;
}

Node* EditService::openChild(FUnknown* parent, FUnknown* child) const
{
    auto* const node = dynamic_cast<Node*>(child);
    return node && node->parent() && m_projects.find(node->project()) && liesIn(*node, parent) ? node : nullptr;
}

} // namespace standin
