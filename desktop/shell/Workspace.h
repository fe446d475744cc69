// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/OpenDocuments.h"
#include "desktop/document/RecentFiles.h"
#include "standin/services/UserBoxes.h"

#include <cstdint>
#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace desktop {

/// What the user does with projects: opens, saves and closes them. It asks where something could be lost, and tells what has failed.
/// Each act returns when the user has answered.
class Workspace {
public:
    /// Both outlive it.
    Workspace(OpenDocuments& documents, standin::UserBoxes& boxes) : m_documents(documents), m_boxes(boxes) {}

    /// Asks for projects and opens them.
    void chooseAndOpen();
    /// False when it wasn't opened, after the user has been told why or has said so himself.
    bool open(const std::filesystem::path& path);
    /// Opens a project of the list of recent ones. One that isn't there is taken off the list if the user wants that.
    bool openRecent(RecentFiles& recent, const std::filesystem::path& path);
    /// False when it isn't saved, after the user has been told why or has said so himself.
    bool save(OpenDocument& document);
    bool saveAs(OpenDocument& document);
    /// Asks what becomes of unsaved work. False when it stays open.
    bool close(OpenDocument& document);
    // What is to happen to a tab by the time that it is its turn. Nothing where the tab has gone.

    void activateTab(std::uint64_t id);
    void closeTab(std::uint64_t id);
    /// Closes all when the user has said for each what becomes of unsaved work; else none.
    bool closeAll();
    /// Asks for videos and takes them into the pool of the project.
    void addVideos(OpenDocument& document);
    /// Takes one in. False when it is no video, after the user has been told.
    bool addVideo(OpenDocument& document, const std::filesystem::path& video);
    /// Looks whether another program has changed the active project's file, and tells each change once.
    void lookAtFile();

    /// Tells once that unsaved work of a project has no autosave, and why; and where that of another program is.
    void lookAtAutosaves();

    void tell(const std::string& message);

private:
    /// The index of the button that was used: by Escape the last one, by Return that of index `byReturn`.
    std::size_t ask(const std::string& message, const std::vector<std::u16string>& buttons, std::size_t byReturn = 0);
    bool isReloadWanted(const OpenDocument& document);
    bool reload(OpenDocument& document);
    /// What is to be done after a save: tells what has failed, or asks.
    bool settled(OpenDocument& document, const SaveAnswer& answer);
    /// Saves what isn't saved, where the user wants that. False when he wants the document to stay open.
    bool mayClose(OpenDocument& document);
    void drop(OpenDocument& document);
    /// What the user wants when the file isn't as the document knows it.
    bool settle(OpenDocument& document, const SaveAnswer& answer);
    bool told(const SaveAnswer& answer);

    OpenDocuments& m_documents;
    standin::UserBoxes& m_boxes;
    std::map<const OpenDocument*, StoredFile::State> m_told;
    std::map<std::uint64_t, std::string> m_toldFaults; ///< of autosaves, by the ids of the documents
};

} // namespace desktop
