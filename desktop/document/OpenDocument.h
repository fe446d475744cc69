// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/DocumentLock.h"
#include "desktop/document/StoredFile.h"
#include "desktop/document/UnsavedMark.h"
#include "velmark/Counted.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace standin {
class Application;
class Project;
class ProjectFileError;
} // namespace standin

namespace desktop {

struct Autosave;

/// What became of a save.
struct SaveAnswer {
    enum class State {
        Saved,
        Changed, ///< another program has changed the file; it is as that left it. Ask: overwrite, save as, or reload
        Missing, ///< the file is gone. Ask: save it there again, or save as
        Failed,  ///< nothing was written
    };

    State state = State::Saved;
    std::string message; ///< for the user, one line; empty once it is saved

    bool isSaved() const { return state == State::Saved; }
};

/// A project that is open, and its file. Made and closed by OpenDocuments.
///
/// What another program has done to the file is never overwritten unless the user says so. Work that isn't saved is written
/// beside the file now and then, as Autosave tells; that is gone after a save and after closing.
class OpenDocument {
public:
    using Clock = std::chrono::steady_clock;

    OpenDocument(const OpenDocument&) = delete;
    OpenDocument& operator=(const OpenDocument&) = delete;
    ~OpenDocument();

    /// Of this tab, and of no other one for as long as the program runs.
    std::uint64_t id() const { return m_id; }
    standin::Project& project() const { return *m_project; }
    /// The file itself, with no link in its path.
    const std::filesystem::path& path() const { return m_file.path(); }
    /// Of the file.
    std::string name() const { return path().filename().string(); }
    /// The other process that has the project open. As long as there is one, no autosave is written.
    const std::optional<DocumentLock::Holder>& openElsewhere() const { return m_lock.holder(); }

    /// Whether the project would be stored with other bytes than it is. Costs nothing; what a module has changed of its own
    /// shows after the next idle call.
    bool isUnsaved() const { return m_mark.isSet(); }
    /// The same, exact: asks the modules, and compares the bytes. For a question before closing. Not within a transaction.
    bool settleUnsaved();
    /// What has become of the file meanwhile, by its size, time and place, and its content where one of these differs.
    StoredFile::State fileState() { return m_file.look(); }
    /// Why the last autosave couldn't be written, in one line; empty as long as they can.
    std::string autosaveFault() const;
    /// Where the unsaved work of another program is, which had the project open as well and has ended; answered once.
    std::optional<std::filesystem::path> takeWorkOfOther() { return std::exchange(m_workOfOther, std::nullopt); }

    // The undo list, the oldest entry first.

    std::vector<std::u16string> undoNames() const;
    /// How many of them are done: 0 for none.
    std::size_t undoPosition() const;
    /// Undoes or redoes until so many are done. False when something forbids it, such as an open transaction; then it stands
    /// as near as it came.
    bool goToUndoPosition(std::size_t position);

private:
    friend class OpenDocuments;
    using Timer = std::function<Clock::time_point()>;
    enum class Modules { Ask, LeaveAlone };

    /// Of work that was opened from an autosave.
    struct Recovery {
        ContentPrint basis; ///< the file that the work was done on
    };

    /// A project that has just been opened from `file`. The application outlives it.
    OpenDocument(std::uint64_t id, standin::Application& application, standin::Project& project, StoredFile file,
                 DocumentLock lock, const std::optional<Recovery>& recovery, Timer timer);

    /// Over the file, but only as this document knows it.
    SaveAnswer save();
    /// Over whatever the file is by now.
    SaveAnswer overwrite();
    /// As a file of that path, which becomes the document's own. Whatever is there is overwritten.
    SaveAnswer saveAs(const std::filesystem::path& path);
    SaveAnswer write(const std::filesystem::path& path, const std::optional<cadrel::util::FileStamp>& expected);
    /// What there is to do while the user does nothing. Autosaves at most once in `interval`.
    void idle(Clock::time_point now, Clock::duration interval, Modules modules);
    void look(Clock::time_point now, Modules modules);
    /// Writes unsaved work that has no autosave yet, and lets others open the project. Nothing is thrown.
    void leave(Modules modules);
    /// Writes unsaved work under a name of its own, where there is any. Throws DocumentError.
    void keepUnsavedAside();
    void retakeLock();
    void autosave(Clock::time_point now, Modules modules);
    void dropAutosave();
    bool hasPresentAutosave() const { return m_autosavedVersion == m_mark.version(); }
    /// Why the project couldn't be written, and what the user can do.
    std::string failureOf(const std::filesystem::path& file, const standin::ProjectFileError& error);
    bool isWithinTransaction() const;

    std::uint64_t m_id;
    standin::Application& m_application;
    Velmark::Counted<standin::Project> m_project;
    StoredFile m_file;
    DocumentLock m_lock;
    UnsavedMark m_mark;
    std::optional<ContentPrint> m_formerBasis; ///< of recovered work whose file has been changed since then
    Timer m_timer;
    std::optional<Clock::time_point> m_lookedAt;
    Clock::duration m_lookCost{};
    std::optional<Clock::time_point> m_autosaveTriedAt;
    std::optional<Clock::time_point> m_autosavedAt; ///< when there was something to write last
    Clock::duration m_autosaveCost{};
    std::optional<std::uint64_t> m_autosavedVersion; ///< nothing where there is no autosave of ours
    std::string m_autosaveFault;
    std::optional<std::filesystem::path> m_workOfOther;
};

} // namespace desktop
