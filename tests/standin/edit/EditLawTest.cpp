// SPDX-License-Identifier: GPL-3.0-or-later

// Laws of undo for random projects and random edits, made through the interfaces as a module makes them.

#include "tests/support/standin/RandomProject.h"
#include "tests/support/standin/TestHost.h"

#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Track.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"
#include "velmark/Tracks.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <limits>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

using AnyNode = Counted<IProjectNode>;

void collect(IProjectNode& node, std::vector<AnyNode>& nodes)
{
    nodes.push_back(AnyNode::share(&node));
    for (const AnyNode& child : childrenOf(node))
        collect(*child, nodes);
    const auto track = query<ITrackNode>(&node);
    const auto curves = Counted<IObjectList>::adopt(track ? track->getAutomation() : nullptr);
    for (int32 index = 0; curves && index < curves->count(); ++index)
        collect(*query<IProjectNode>(curves->at(index)), nodes);
}

/// A random project in a host, and random edits of it. Many of them can't be made: the host refuses them.
class Editing {
public:
    explicit Editing(Chance& chance, const ProjectScale& scale = {})
        : m_chance(chance),
          m_project(application.projects().add(randomProject(chance, application.edits().log(), scale))),
          m_service(service<IEditService>(application.context())), m_transaction(query<IEditTransaction>(m_service))
    {
        application.activateProject(&m_project);
    }

    /// One transaction of a few edits.
    void edit()
    {
        m_transaction->begin(true);
        for (std::uint64_t count = m_chance.below(6); count > 0; --count)
            editOnce();
        m_transaction->commit(&m_project, u"Edit");
    }

    bool invoke(const char* action)
    {
        return service<IActionManager>(application.context())->invoke(IActionManager::EditCategory, action, 0) ==
               ResultOk;
    }

    Project& project() { return m_project; }
    std::string dump() const { return ProjectFile::toText(m_project); }

    Application application;

private:
    void editOnce()
    {
        std::vector<AnyNode> nodes;
        collect(m_project, nodes);
        const AnyNode& node = m_chance.oneOf(nodes);
        switch (m_chance.below(12)) {
        case 0:
        case 1:
            insert(nodes, newNode());
            break;
        case 2:
            if (m_transaction->remove(root(), node.get()) == ResultOk)
                m_outside.push_back(node);
            break;
        case 3:
            // What was taken out comes in again, perhaps with what was done to it meanwhile.
            if (!m_outside.empty())
                insert(nodes, m_chance.oneOf(m_outside));
            break;
        case 4:
            m_transaction->move(root(), containerFor(nodes, *node).get(), node.get());
            break;
        case 5:
            if (!m_outside.empty())
                change(m_chance.oneOf(m_outside));
            break;
        case 6:
        case 7:
            describe(*node);
            break;
        case 8:
        case 9:
            change(node);
            break;
        default:
            editRange();
        }
    }

    void insert(const std::vector<AnyNode>& nodes, const AnyNode& child)
    {
        m_transaction->insert(containerFor(nodes, *child).get(), child.get());
    }

    /// Mostly one that the child can lie in.
    AnyNode containerFor(const std::vector<AnyNode>& nodes, IProjectNode& child)
    {
        std::vector<AnyNode> fit;
        for (const AnyNode& node : nodes) {
            const auto* const container = dynamic_cast<const Container*>(node.get());
            if (container && container->accepts(dynamic_cast<const Node&>(child)))
                fit.push_back(node);
        }
        return m_chance.oneOf(fit.empty() || m_chance.oneIn(10) ? nodes : fit);
    }

    IProjectNode* root() { return &m_project; }

    AnyNode newNode()
    {
        static constexpr const char* Words[] = {"audio", "video", "marker", "ruler", "folder"};
        IHostContext* const context = application.context();
        AnyNode node;
        switch (m_chance.below(5)) {
        case 0:
            node = query<IProjectNode>(create<IClipEvent>(context));
            break;
        case 1:
            node = create<IProjectNode>(context, ClassId::PointMarker);
            break;
        case 2:
            node = create<IProjectNode>(context, ClassId::RangeMarker);
            break;
        case 3:
            node = create<IProjectNode>(context, ClassId::AutomationPoint);
            break;
        default:
            node = query<IProjectNode>(Counted<FUnknown>::adopt(m_project.createTrack(m_chance.oneOf(Words))));
        }
        node->setStart(nullptr, 0, time());
        node->setLength(nullptr, nullptr, time());
        return node;
    }

    void describe(IProjectNode& node)
    {
        const auto list = create<IAttributeData>(application.context());
        list->setBinary("block", "bytes", static_cast<int32>(m_chance.below(6)), true);
        switch (m_chance.below(5)) {
        case 0:
            node.setName(nullptr, text(m_chance.oneIn(2) ? u"one" : u"").get(), 0);
            break;
        case 1:
            node.setAttribute("a", FVariant::integer(static_cast<int64>(m_chance.below(3))), true);
            break;
        case 2:
            node.setAttribute("a", FVariant::string("text"), m_chance.oneIn(2));
            break;
        case 3:
            node.setAttribute("CaDr", FVariant::object(list.get()), true);
            break;
        default:
            node.removeAttribute(m_chance.oneIn(2) ? "a" : "CaDr");
        }
    }

    void change(const AnyNode& node)
    {
        switch (m_chance.below(4)) {
        case 0:
            node->setStart(node->getParent(), 0, time());
            break;
        case 1:
            node->setEnd(nullptr, 0, time());
            break;
        case 2:
            node->setLength(nullptr, m_transaction.get(), time());
            break;
        default:
            changeByKind(node);
        }
    }

    void changeByKind(const AnyNode& node)
    {
        if (const auto point = query<IAutomationPoint>(node))
            point->setValue(static_cast<float>(m_chance.below(5)) / 4.0f);
        else if (const auto track = query<ITrackNode>(node))
            track->setFlag(TrackFlag::Lock, m_chance.oneIn(2));
        else if (const auto clip = query<IClipEvent>(node))
            clip->setClip(nullptr, 0);
        else
            m_project.setProjectEnd(time());
    }

    void editRange()
    {
        const double start = time();
        const double end = start + time() / 4.0;
        const double destination = time() - 10.0;
        const auto tracks = create<IObjectList>(application.context());
        for (Track* const track : m_project.allTracks()) {
            if (m_chance.oneIn(2))
                tracks->add(static_cast<ITrackNode*>(track), 0);
        }
        Counted<FUnknown> clipboard;
        switch (m_chance.below(4)) {
        case 0:
            m_service->copyRange(&m_project, tracks.get(), 0, start, end, destination);
            break;
        case 1:
            m_transaction->deleteRange(&m_project, 0, start, end);
            break;
        case 2:
            m_transaction->copyAll(&m_project, clipboard.out(), start, end, 0);
            m_transaction->paste(&m_project, clipboard.get(), 0, destination);
            break;
        default:
            m_service->closeRange(&m_project, tracks.get(), 0.0, 200.0, 0.0);
        }
    }

    /// In quarters of seconds, so that edges meet, or anywhere; and now and then what is hardly a time, or none.
    double time()
    {
        static constexpr double Infinity = std::numeric_limits<double>::infinity();
        static constexpr double OddTimes[] = {std::numeric_limits<double>::quiet_NaN(),
                                              Infinity,
                                              -Infinity,
                                              -1.0,
                                              -0.0,
                                              SameInstant / 2.0,
                                              -SameInstant / 2.0,
                                              FurthestTime / 2.0,
                                              FurthestTime,
                                              2.0 * FurthestTime};
        if (m_chance.oneIn(10))
            return m_chance.oneOf(OddTimes);
        const auto quarters = static_cast<double>(m_chance.below(400));
        return m_chance.oneIn(3) ? quarters / 7.0 : quarters / 4.0;
    }

    Chance& m_chance;
    Project& m_project;
    Counted<IEditService> m_service;
    Counted<IEditTransaction> m_transaction;
    std::vector<AnyNode> m_outside;
};

/// Edits, takes all back, makes all again, twice.
void checkUndoAndRedo(Editing& editing, std::uint64_t transactions)
{
    const UndoList& undoList = editing.project().undoList();
    // What the project was after so many entries.
    std::vector<std::string> dumps{editing.dump()};
    for (; transactions > 0; --transactions) {
        editing.edit();
        if (undoList.size() == dumps.size())
            dumps.push_back(editing.dump());
        RC_ASSERT(editing.dump() == dumps.back());
    }

    for (int round = 0; round < 2; ++round) {
        while (editing.invoke("Undo"))
            RC_ASSERT(editing.dump() == dumps[undoList.doneCount()]);
        RC_ASSERT(undoList.doneCount() == 0U);
        while (editing.invoke("Redo"))
            RC_ASSERT(editing.dump() == dumps[undoList.doneCount()]);
        RC_ASSERT(undoList.doneCount() + 1 == dumps.size());
    }
}

/// Edits, undoes and redoes by chance, and takes all back at the end.
void checkEditsBetweenUndos(Editing& editing, Chance& chance, std::uint64_t steps)
{
    const UndoList& undoList = editing.project().undoList();
    std::vector<std::string> dumps{editing.dump()};
    for (; steps > 0; --steps) {
        if (chance.oneIn(3)) {
            editing.invoke(chance.oneIn(3) ? "Redo" : "Undo");
        } else {
            const std::size_t done = undoList.doneCount();
            editing.edit();
            if (undoList.doneCount() > done) {
                dumps.resize(undoList.doneCount());
                dumps.push_back(editing.dump());
            }
        }
        RC_ASSERT(editing.dump() == dumps[undoList.doneCount()]);
    }

    while (editing.invoke("Undo"))
        RC_ASSERT(editing.dump() == dumps[undoList.doneCount()]);
}

} // namespace

RC_GTEST_PROP(EditLaw, UndoOfEverythingGivesTheFirstBytesAndRedoOfEverythingTheLast, ())
{
    CheckedChance chance;
    Editing editing(chance);

    checkUndoAndRedo(editing, 1 + chance.below(5));
}

RC_GTEST_PROP(EditLaw, UndoAndRedoGiveTheSameBytesInLargerProjects, (std::uint64_t seed))
{
    SeededChance chance(seed);
    Editing editing(chance, {8, 12, 12, 8, 100.0});

    checkUndoAndRedo(editing, 10);
}

RC_GTEST_PROP(EditLaw, EditsAfterAnUndoTakeThePlaceOfWhatWasUndone, ())
{
    CheckedChance chance;
    Editing editing(chance);

    checkEditsBetweenUndos(editing, chance, 1 + chance.below(10));
}

RC_GTEST_PROP(EditLaw, EditsBetweenUndosAreUndoneInLargerProjects, (std::uint64_t seed))
{
    SeededChance chance(seed);
    Editing editing(chance, {8, 12, 12, 8, 100.0});

    checkEditsBetweenUndos(editing, chance, 15);
}

RC_GTEST_PROP(EditLaw, WhateverWasEditedIsReadBackAsItWasStored, (std::uint64_t seed))
{
    SeededChance chance(seed);
    Editing editing(chance);
    for (int count = 0; count < 10; ++count)
        editing.edit();
    const std::string stored = editing.dump();

    ChangeLog log;
    RC_ASSERT(ProjectFile::toText(*ProjectFile::parse(stored, "test.stage", log)) == stored);
}

RC_GTEST_PROP(EditLaw, ChildrenStandByTheirStartAndInTheirParent, (std::uint64_t seed))
{
    SeededChance chance(seed);
    Editing editing(chance);
    for (int count = 0; count < 10; ++count)
        editing.edit();

    std::vector<AnyNode> nodes;
    collect(editing.project(), nodes);
    for (const AnyNode& node : nodes) {
        double last = 0.0;
        for (const AnyNode& child : childrenOf(*node)) {
            RC_ASSERT(child->getParent() == node.get());
            RC_ASSERT(child->changeFlags() == 0U);
            RC_ASSERT(child->getStart(nullptr) >= last);
            RC_ASSERT(child->getEnd(nullptr) >= child->getStart(nullptr));
            last = child->getStart(nullptr);
        }
    }
}

} // namespace standin::tests
