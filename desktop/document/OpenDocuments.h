// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/Autosave.h"
#include "desktop/document/DocumentLock.h"
#include "desktop/document/OpenDocument.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace standin {
class Application;
class Project;
} // namespace standin

namespace desktop {

class RecentFiles;

/// What there is to know, and to ask the user, before a project is opened.
struct Opening {
    /// Work of a program that ended without saving it.
    struct UnsavedWork {
        Autosave::Time time;         ///< when it was kept
        bool isOfFormerFile = false; ///< the project's file has been changed since then
    };

    std::filesystem::path file;   ///< the project itself: no link, and not the folder that it was looked for in
    OpenDocument* open = nullptr; ///< in one of our tabs; opening it shows that
    std::optional<DocumentLock::Holder> openElsewhere; ///< "is open in another window"; unsaved work is its own then
    std::optional<UnsavedWork> unsavedWork;            ///< to offer
};

/// The projects that are open, in the order of their tabs, and the active one. As long as there is any, one is active: that
/// on which the modules of the application work.
class OpenDocuments {
public:
    using Clock = OpenDocument::Clock;

    /// What becomes of unsaved work when a project is opened.
    enum class Work {
        Keep, ///< its file gets another name, under which it isn't offered again
        Remove,
        Recover, ///< the project opens with it, unsaved
    };

    static constexpr Clock::duration AutosaveInterval = std::chrono::seconds(30);

    /// By which the cost of an idle call is measured.
    using Timer = std::function<Clock::time_point()>;

    /// Those that are opened and saved go into the list of recent files; null for none. Both outlive this.
    explicit OpenDocuments(standin::Application& application, RecentFiles* recent = nullptr,
                           Clock::duration autosaveInterval = AutosaveInterval, Timer timer = &Clock::now);
    OpenDocuments(const OpenDocuments&) = delete;
    OpenDocuments& operator=(const OpenDocuments&) = delete;
    /// Closes those that are still open, and drops nothing of their unsaved work: nobody has been asked about it.
    ~OpenDocuments();

    /// Looks at what a path means: a project, a folder with one session, or a link. Throws DocumentError.
    Opening look(const std::filesystem::path& path) const;
    /// Opens the project and activates it; one that is open is only activated. Throws DocumentError, and nothing is opened
    /// then.
    OpenDocument& open(const std::filesystem::path& path, Work work = Work::Keep);
    /// Opens the file anew in place of the document, whose unsaved work is kept as the file that Autosave::asidePathFor names.
    /// Answers the new document, which has the same tab. Throws DocumentError, and the document stays as it is then.
    OpenDocument& reload(OpenDocument& document);
    /// Closes it and drops its unsaved work. If it was active, the one after it becomes so, or the one before.
    void close(OpenDocument& document);

    std::size_t size() const { return m_documents.size(); }
    OpenDocument& at(std::size_t index) const { return *m_documents.at(index); }
    /// Null where it is no longer open.
    OpenDocument* withId(std::uint64_t id) const;
    /// Null where none is open.
    OpenDocument* active() const { return m_active; }
    void activate(OpenDocument& document);
    /// The one with this file; null where none has it.
    OpenDocument* find(const std::filesystem::path& path) const;

    /// Over its file, but only as the document knows it.
    SaveAnswer save(OpenDocument& document);
    /// Over whatever the file is by now. Ask the user before.
    SaveAnswer overwrite(OpenDocument& document);
    /// As another file, which becomes the document's own. Whatever is there is overwritten; ask the user before. Refuses one
    /// that is open in another tab or window.
    SaveAnswer saveAs(OpenDocument& document, const std::filesystem::path& path);

    /// Call it now and then while the user does nothing: looks what the modules have changed, and autosaves. It does nothing
    /// within a transaction and while idle calls are blocked.
    void idle(Clock::time_point now = Clock::now());
    /// The same while a box is open: no module is called, and what they have stored the last time is autosaved.
    void idleBeneathBox(Clock::time_point now = Clock::now());
    /// For a program that has to end at once: writes the unsaved work of all documents that isn't kept yet, and lets other
    /// programs open them. Nothing is thrown. While a box is open no module may be asked for what it has.
    void leave(bool mayAskModules);

private:
    using Documents = std::vector<std::unique_ptr<OpenDocument>>;

    std::unique_ptr<OpenDocument> openedFrom(const std::filesystem::path& path, Work work);
    /// With the content of the file where none is given.
    standin::Project& openProject(const std::filesystem::path& file, const std::string* content);
    std::unique_ptr<OpenDocument> newDocument(std::uint64_t id, standin::Project& project, StoredFile file,
                                              DocumentLock lock, const std::optional<OpenDocument::Recovery>& recovery);
    void idle(Clock::time_point now, OpenDocument::Modules modules);
    bool isHostIdle() const;
    Documents::iterator placeOf(const OpenDocument& document);

    standin::Application& m_application;
    RecentFiles* m_recent;
    Clock::duration m_autosaveInterval;
    Timer m_timer;
    Documents m_documents;
    OpenDocument* m_active = nullptr;
    std::uint64_t m_lastId = 0;
};

} // namespace desktop
