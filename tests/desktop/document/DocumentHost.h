// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/OpenDocuments.h"
#include "standin/Application.h"
#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "standin/services/IdleManager.h"
#include "tests/support/TempFolder.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <functional>
#include <map>
#include <string>
#include <vector>

namespace desktop::tests {

using cadrel::tests::contentOf;
using cadrel::tests::TempFolder;
using cadrel::tests::writeFile;
using standin::Project;
using standin::Track;

/// A module that stores a text with each project, as Cadrel does its model, and is told of it only when the project is
/// stored.
class StoringModule : public Velmark::Implements<StoringModule, Velmark::FObject, Velmark::IProjectNotification,
                                                 Velmark::IProjectStorageNotification> {
public:
    static constexpr const char* ClassName = "StoringModule";
    static constexpr const char* Key = "Model";

    std::map<const Velmark::IProjectDocument*, std::string> models;
    bool canStore = true;
    int storings = 0;

    Velmark::int32 projectActivated(Velmark::IProjectDocument*) override { return Velmark::ResultOk; }
    Velmark::int32 projectDeactivated(Velmark::IProjectDocument*) override { return Velmark::ResultOk; }
    Velmark::int32 projectOpened(Velmark::IProjectDocument* project) override
    {
        Velmark::FVariant stored;
        if (nodeOf(project)->getAttribute(Key, stored) == Velmark::ResultOk && stored.asString())
            models[project] = stored.asString();
        return project->addStorageNotification(this);
    }
    Velmark::int32 projectClosing(Velmark::IProjectDocument* project, Velmark::int32) override
    {
        models.erase(project);
        return project->removeStorageNotification(this);
    }
    Velmark::int32 projectRenamed(Velmark::IProjectDocument*) override { return Velmark::ResultOk; }
    Velmark::int32 projectStoring(Velmark::IProjectDocument* project) override
    {
        ++storings;
        if (!canStore)
            return Velmark::ResultFalse;
        return nodeOf(project)->setAttribute(Key, Velmark::FVariant::string(models[project].c_str()), true);
    }

private:
    static Velmark::IProjectNode* nodeOf(Velmark::IProjectDocument* project) { return static_cast<Project*>(project); }
};

/// The desktop program without windows: an application with a module, its documents, and a folder for their files.
struct DocumentHost {
    using State = SaveAnswer::State;
    using Clock = OpenDocument::Clock;
    using Work = OpenDocuments::Work;

    DocumentHost() { application.projects().addNotification(module.get()); }
    DocumentHost(const DocumentHost&) = delete;
    DocumentHost& operator=(const DocumentHost&) = delete;
    ~DocumentHost()
    {
        while (documents.size() > 0)
            documents.close(documents.at(0));
        application.projects().removeNotification(module.get());
    }

    /// The file of a project with so many tracks.
    std::filesystem::path writeProject(const std::string& name, int tracks = 1) const
    {
        std::string list;
        for (int track = 1; track <= tracks; ++track) {
            list += std::string(track > 1 ? ", " : "").append(R"({"kind": "audio", "name": "DIA )");
            list += std::to_string(track).append(R"(", "events": []})");
        }
        return folder.write(name,
                            R"({"format": "stage", "version": 1, "framesPerSecond": 24, "tracks": [)" + list + "]}");
    }

    /// One entry of the undo list.
    void edit(Project& project, const char16_t* entry, const std::function<void()>& edits)
    {
        standin::EditService& service = application.edits();
        ASSERT_EQ(service.begin(false), Velmark::ResultOk);
        edits();
        ASSERT_EQ(service.commit(&project, entry), Velmark::ResultOk);
    }
    void renameTrack(OpenDocument& document, const char16_t* name)
    {
        edit(document.project(), name, [&] { trackOf(document).setName(std::u16string(name)); });
    }
    static Track& trackOf(OpenDocument& document) { return *document.project().allTracks().at(0); }

    /// The bytes that the project would be stored with.
    static std::string bytesOf(OpenDocument& document)
    {
        document.project().announceStoring();
        return standin::ProjectFile::toText(document.project());
    }

    /// The user does nothing for a while.
    void idle(Clock::duration span = std::chrono::minutes(1)) { documents.idle(now += span); }

    TempFolder folder;
    standin::Application application;
    Velmark::Counted<StoringModule> module = Velmark::makeCounted<StoringModule>();
    Clock::time_point now = Clock::now();
    /// A loaded machine doesn't change when something is done: by this clock nothing takes any time.
    OpenDocuments documents{application, nullptr, OpenDocuments::AutosaveInterval, [this] { return now; }};
};

class DocumentTest : public testing::Test, protected DocumentHost {};

} // namespace desktop::tests
