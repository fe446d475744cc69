// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/Application.h"
#include "standin/project/Envelope.h"
#include "standin/project/Project.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Module.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"
#include "velmark/StringObject.h"

#include <functional>
#include <string>
#include <vector>

namespace standin::tests {

/// A text as the argument of an operation.
Velmark::Counted<Velmark::StringObject> text(const char16_t* characters);

/// The children of a node, as its iterator gives them.
std::vector<Velmark::Counted<Velmark::IProjectNode>> childrenOf(Velmark::IProjectNode& node);
std::vector<std::u16string> namesOf(Velmark::IProjectNode& node);

/// A host with one project, which is open, active and empty, and what a module does with them through the interfaces. All
/// that adds to the project throws std::runtime_error when the host refuses, and is an entry of the undo list unless a
/// transaction is open.
class TestHost {
public:
    using Node = Velmark::Counted<Velmark::IProjectNode>;

    TestHost();

    Velmark::IHostContext* context() { return application.context(); }
    Velmark::IProjectDocument* document() { return &project; }
    /// The project as a node.
    Velmark::IProjectNode* root() { return &project; }
    Velmark::IEditService* editService() { return m_editService.get(); }
    Velmark::IEditTransaction* transaction() { return m_transaction.get(); }

    /// Gives the project 25 frames a second and a clock that begins at `origin` seconds, which aren't changes of it. Answers
    /// `origin`.
    double setClock(double origin);

    /// A track of the kind, in a folder or, with null, at the top.
    Node addTrack(const char* word, const char16_t* name, Velmark::IProjectNode* folder = nullptr);
    /// Events on a track or in a part, with times in seconds of the project.
    Node addClip(const Node& parent, const char16_t* name, double start, double end);
    Node addPart(const Node& parent, const char16_t* name, double start, double end);
    Node addPointMarker(const Node& track, const char16_t* name, double time);
    Node addRangeMarker(const Node& track, const char16_t* name, double start, double end);
    Node addPoint(const Node& track, Velmark::int32 curve, double time, float value);
    /// A curve of the track.
    Node curveOf(const Node& track, Velmark::int32 number);
    /// Clips of the media pool, of sound and of picture.
    MediaClip& addMedia(const char16_t* path, double length);
    MediaClip& addVideo(const char16_t* path, double length);

    /// A transaction from its begin to its commit.
    void edit(const char16_t* name, const std::function<void()>& edits);
    bool undo() { return invoke("Undo"); }
    bool redo() { return invoke("Redo"); }

    /// The project file of the project as it stands: all that belongs to it.
    std::string dump() const;

    Application application;
    Project& project;

private:
    bool invoke(const char* action);
    MediaClip& addToPool(const Velmark::Counted<MediaClip>& clip);
    Node insert(Velmark::IProjectNode* parent, const Node& child, const char16_t* name);

    Velmark::Counted<Velmark::IEditService> m_editService;
    Velmark::Counted<Velmark::IEditTransaction> m_transaction;
};

/// Whatever a host can call a module for. It writes down the calls, and does what the test wants done in them.
class Recorder
    : public Velmark::Implements<Recorder, Velmark::FObject, Velmark::IProjectNotification, Velmark::IProjectEditHook,
                                 Velmark::IProjectStorageNotification, Velmark::IIdleHandler, Velmark::IEditStep> {
public:
    static constexpr const char* ClassName = "Recorder";

    /// The calls go to the list, each with the prefix.
    explicit Recorder(std::vector<std::string>& calls, std::string prefix = "")
        : m_calls(calls), m_prefix(std::move(prefix))
    {
    }

    /// What is done in each call, which is named as it is written down.
    std::function<void(const std::string& call)> whenCalled;
    /// What each call gives back.
    Velmark::int32 answer = Velmark::ResultOk;

    Velmark::int32 update(Velmark::FUnknown* changed, Velmark::int32 message) override;
    Velmark::int32 projectActivated(Velmark::IProjectDocument*) override { return note("activated"); }
    Velmark::int32 projectDeactivated(Velmark::IProjectDocument*) override { return note("deactivated"); }
    Velmark::int32 projectOpened(Velmark::IProjectDocument*) override { return note("opened"); }
    Velmark::int32 projectClosing(Velmark::IProjectDocument*, Velmark::int32) override { return note("closing"); }
    Velmark::int32 projectRenamed(Velmark::IProjectDocument*) override { return note("renamed"); }
    Velmark::int32 projectStoring(Velmark::IProjectDocument*) override { return note("storing"); }
    Velmark::int32 projectEdited(Velmark::IProjectDocument*, Velmark::IEditTransaction*) override
    {
        return note("edited");
    }
    Velmark::int32 onIdle() override { return note("idle"); }
    Velmark::int32 execute() override { return note("execute"); }
    Velmark::int32 undo() override { return note("undo"); }
    Velmark::int32 redo() override { return note("redo"); }
    const char16_t* getDescription() override { return nullptr; }

private:
    Velmark::int32 note(const char* call);

    std::vector<std::string>& m_calls;
    std::string m_prefix;
};

} // namespace standin::tests
