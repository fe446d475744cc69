// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Attributes.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/Implements.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"
#include "velmark/Tracks.h"

#include <cstddef>
#include <map>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {

/// A node of a host that does what no good one does: events in no order or reversed, refusals, missing interfaces, children
/// and names that are null. It is track and event at once.
class FakeNode : public Velmark::Implements<FakeNode, Velmark::FObject, Velmark::IProjectNode, Velmark::ITrackNode,
                                            Velmark::IEventNode> {
public:
    static constexpr const char* ClassName = "FakeNode";

    class Iterator : public Velmark::Implements<Iterator, Velmark::FObject, Velmark::INodeIterator> {
    public:
        static constexpr const char* ClassName = "Iterator";

        explicit Iterator(std::vector<Velmark::Counted<FakeNode>> nodes) : m_nodes(std::move(nodes)) {}

        bool isDone() override { return m_next == m_nodes.size(); }
        Velmark::IProjectNode* next() override { return m_nodes[m_next++].get(); }

    private:
        std::vector<Velmark::Counted<FakeNode>> m_nodes;
        std::size_t m_next = 0;
    };

    FakeNode() = default;
    FakeNode(double from, double to) : start(from), end(to) {}

    /// The words that it answers to.
    std::set<std::string> words;
    const char16_t* nodeName = u"";
    double start = 0.0;
    double end = 0.0;
    std::vector<Velmark::Counted<FakeNode>> children;
    FakeNode* parent = nullptr;
    FakeNode* owner = nullptr;
    Velmark::uint32 flags = 0;
    /// What all setters answer.
    Velmark::int32 setterResult = Velmark::ResultOk;
    Velmark::Counted<Velmark::IObjectList> automation;
    /// Whether it answers for IProjectNode.
    bool isNode = true;
    /// Whether it answers for ITrackNode.
    bool isTrack = true;

    Velmark::int32 queryInterface(const Velmark::Identifier& id, void** out) override
    {
        if ((!isNode && id == Velmark::IProjectNode::iid) || (!isTrack && id == Velmark::ITrackNode::iid)) {
            *out = nullptr;
            return Velmark::ResultNoInterface;
        }
        return Implements::queryInterface(id, out);
    }

    bool isType(const char* word) override { return words.contains(word); }
    Velmark::uint32 changeFlags() override { return flags; }
    Velmark::int32 setAttribute(const char*, const Velmark::FVariant&, bool) override { return setterResult; }
    Velmark::int32 getAttribute(const char*, Velmark::FVariant&) override { return Velmark::ResultFalse; }
    Velmark::int32 hasAttribute(const char*) override { return Velmark::ResultFalse; }
    Velmark::int32 removeAttribute(const char*) override { return setterResult; }
    const char16_t* getName() override { return nodeName; }
    Velmark::int32 setName(Velmark::FUnknown*, Velmark::IString*, Velmark::int32) override { return setterResult; }
    bool isSelected() override { return false; }
    double getStart(Velmark::FUnknown*) override { return start; }
    Velmark::int32 setStart(Velmark::FUnknown*, Velmark::int32, double) override { return setterResult; }
    Velmark::int32 setLength(Velmark::FUnknown*, Velmark::FUnknown*, double) override { return setterResult; }
    double getEnd(Velmark::FUnknown*) override { return end; }
    Velmark::int32 setEnd(Velmark::FUnknown*, Velmark::int32, double) override { return setterResult; }
    double getSourceOffset(Velmark::FUnknown*) override { return 0.0; }
    Velmark::INodeIterator* newChildIterator() override { return Velmark::makeCounted<Iterator>(children).detach(); }
    Velmark::IProjectNode* getParent() override { return parent; }

    Velmark::int32 setFlag(const char*, bool) override { return setterResult; }
    Velmark::int32 getFlag(const char*) override { return Velmark::ResultFalse; }
    Velmark::IObjectList* getAutomation() override
    {
        return Velmark::Counted<Velmark::IObjectList>(automation).detach();
    }

    Velmark::IEventNode* getOwner() override { return owner; }
};

/// The project of such a host. Its own children are its tracks.
class FakeProject : public Velmark::Implements<FakeProject, FakeNode, Velmark::IProjectDocument, Velmark::ITimeBase> {
public:
    static constexpr const char* ClassName = "FakeProject";

    explicit FakeProject(double origin) : m_origin(origin) {}

    /// One with a track that isn't to be had as one.
    static Velmark::Counted<FakeProject> withoutUsableTrack()
    {
        auto project = Velmark::makeCounted<FakeProject>(0.0);
        auto track = Velmark::makeCounted<FakeNode>();
        track->words = {Velmark::TypeWord::Track};
        track->isTrack = false;
        project->children.push_back(std::move(track));
        project->isTrack = false;
        return project;
    }

    /// Whether objects have a container: themselves.
    bool hasContainers = true;

    Velmark::int32 setProjectEnd(double) override { return setterResult; }
    Velmark::IFilePath* getProjectFile(Velmark::IProjectDocument*) override { return nullptr; }
    Velmark::IMarkerTrack* getDefaultMarkerTrack() override { return nullptr; }
    Velmark::ILocators* getLocators() override { return nullptr; }
    Velmark::FUnknown* getContainer(Velmark::FUnknown* object) override
    {
        if (!hasContainers)
            return nullptr;
        object->addRef();
        return object;
    }
    Velmark::FUnknown* createTrack(const char*) override { return nullptr; }
    Velmark::int32 addStorageNotification(Velmark::IProjectStorageNotification*) override { return setterResult; }
    Velmark::int32 removeStorageNotification(Velmark::IProjectStorageNotification*) override { return setterResult; }
    Velmark::IMediaPool* getMediaPool() override { return nullptr; }

    Velmark::int32 getFrameRate(Velmark::FrameRateInfo& info) override
    {
        info = {25.0, 0};
        return Velmark::ResultOk;
    }
    double getTimeOrigin() override { return m_origin; }

private:
    double m_origin;
};

} // namespace cadrel::host::tests
