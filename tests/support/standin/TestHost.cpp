// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/MediaClip.h"
#include "standin/project/Part.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"
#include "velmark/Tracks.h"
#include "velmark/UserInterface.h"

#include <stdexcept>

using namespace Velmark;

namespace standin::tests {

namespace {

void require(bool condition)
{
    if (!condition)
        throw std::runtime_error("the host has refused");
}

} // namespace

Counted<StringObject> text(const char16_t* characters)
{
    return makeCounted<StringObject>(characters);
}

std::vector<Counted<IProjectNode>> childrenOf(IProjectNode& node)
{
    std::vector<Counted<IProjectNode>> children;
    const auto iterator = Counted<INodeIterator>::adopt(node.newChildIterator());
    while (!iterator->isDone())
        children.push_back(Counted<IProjectNode>::share(iterator->next()));
    return children;
}

std::vector<std::u16string> namesOf(IProjectNode& node)
{
    std::vector<std::u16string> names;
    for (const auto& child : childrenOf(node))
        names.emplace_back(child->getName());
    return names;
}

TestHost::TestHost()
    : project(application.createProject()), m_editService(service<IEditService>(application.context())),
      m_transaction(query<IEditTransaction>(m_editService))
{
    application.activateProject(&project);
}

double TestHost::setClock(double origin)
{
    project.setFrameRate({25.0, 0});
    project.setTimeOrigin(origin);
    project.clearChanges();
    return origin;
}

TestHost::Node TestHost::addTrack(const char* word, const char16_t* name, IProjectNode* folder)
{
    const auto track = query<IProjectNode>(Counted<FUnknown>::adopt(document()->createTrack(word)));
    return insert(folder ? folder : root(), track, name);
}

TestHost::Node TestHost::addClip(const Node& parent, const char16_t* name, double start, double end)
{
    const auto clip = query<IProjectNode>(create<IClipEvent>(context()));
    require(clip->setStart(nullptr, 0, start) == ResultOk && clip->setEnd(nullptr, 0, end) == ResultOk);
    return insert(parent.get(), clip, name);
}

TestHost::Node TestHost::addPart(const Node& parent, const char16_t* name, double start, double end)
{
    const Node part = makeCounted<Part>();
    require(part->setStart(nullptr, 0, start) == ResultOk && part->setEnd(nullptr, 0, end) == ResultOk);
    return insert(parent.get(), part, name);
}

TestHost::Node TestHost::addPointMarker(const Node& track, const char16_t* name, double time)
{
    const auto marker = create<IProjectNode>(context(), ClassId::PointMarker);
    require(marker->setStart(nullptr, 0, time) == ResultOk);
    return insert(track.get(), marker, name);
}

TestHost::Node TestHost::addRangeMarker(const Node& track, const char16_t* name, double start, double end)
{
    const auto marker = create<IProjectNode>(context(), ClassId::RangeMarker);
    require(marker->setStart(nullptr, 0, start) == ResultOk && marker->setEnd(nullptr, 0, end) == ResultOk);
    return insert(track.get(), marker, name);
}

TestHost::Node TestHost::addPoint(const Node& track, int32 curve, double time, float value)
{
    const auto point = create<IProjectNode>(context(), ClassId::AutomationPoint);
    require(point->setStart(nullptr, 0, time) == ResultOk);
    require(query<IAutomationPoint>(point)->setValue(value) == ResultOk);
    return insert(curveOf(track, curve).get(), point, u"");
}

TestHost::Node TestHost::curveOf(const Node& track, int32 number)
{
    const auto curves = Counted<IObjectList>::adopt(query<ITrackNode>(track)->getAutomation());
    for (int32 index = 0; index < curves->count(); ++index) {
        const auto curve = query<IEnvelopeTrack>(curves->at(index));
        if (curve->curveNumber() == number)
            return query<IProjectNode>(curve);
    }
    throw std::runtime_error("the track has no such curve");
}

MediaClip& TestHost::addMedia(const char16_t* path, double length)
{
    return addToPool(makeCounted<MediaClip>(MediaClip::Kind::Audio, path, length));
}

MediaClip& TestHost::addVideo(const char16_t* path, double length)
{
    return addToPool(makeCounted<MediaClip>(MediaClip::Kind::Video, path, length));
}

void TestHost::edit(const char16_t* name, const std::function<void()>& edits)
{
    require(transaction()->begin(true) == ResultOk);
    edits();
    require(transaction()->commit(document(), name) == ResultOk);
}

std::string TestHost::dump() const
{
    return ProjectFile::toText(project);
}

bool TestHost::invoke(const char* action)
{
    return service<IActionManager>(context())->invoke(IActionManager::EditCategory, action, 0) == ResultOk;
}

MediaClip& TestHost::addToPool(const Counted<MediaClip>& clip)
{
    project.pool().add(clip);
    return *clip;
}

TestHost::Node TestHost::insert(IProjectNode* parent, const Node& child, const char16_t* name)
{
    require(child->setName(nullptr, text(name).get(), 0) == ResultOk);
    const auto insertion = [&] { require(transaction()->insert(parent, child.get()) == ResultOk); };
    if (application.edits().isOpen())
        insertion();
    else
        edit(u"Insert", insertion);
    return child;
}

int32 Recorder::update(FUnknown* /*changed*/, int32 /*message*/)
{
    return note("update");
}

int32 Recorder::note(const char* call)
{
    m_calls.push_back(m_prefix + call);
    if (whenCalled)
        whenCalled(m_calls.back());
    return answer;
}

} // namespace standin::tests
