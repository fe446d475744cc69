// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/OpenDocument.h"

#include "desktop/document/Autosave.h"
#include "desktop/document/DocumentError.h"
#include "desktop/document/FileWords.h"
#include "standin/Application.h"
#include "standin/edit/EditService.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "util/WriteObstacle.h"

#include <algorithm>
#include <exception>
#include <new>
#include <system_error>
#include <utility>

namespace desktop {

namespace fs = std::filesystem;

using cadrel::util::FileStamp;
using standin::ProjectFileChanged;
using standin::ProjectFileError;
using State = SaveAnswer::State;

namespace {

/// A look at the settings of the modules may take one part in so many of the time.
constexpr int LookShare = 20;
constexpr auto ShortestLookInterval = std::chrono::milliseconds(500);
/// And so may an autosave.
constexpr int AutosaveShare = 20;

bool hasFolder(const fs::path& file)
{
    std::error_code error;
    return fs::is_directory(file.parent_path(), error);
}

SaveAnswer answerTo(StoredFile::State state, const fs::path& file)
{
    switch (state) {
    case StoredFile::State::Changed:
        return {State::Changed, file.string() + ": another program has changed it since it was opened or saved here"};
    case StoredFile::State::Missing:
        return {State::Missing, hasFolder(file) ? file.string() + ": is no longer there"
                                                : file.string() + ": its folder is no longer there"};
    default:
        return {};
    }
}

} // namespace

OpenDocument::OpenDocument(std::uint64_t id, standin::Application& application, standin::Project& project,
                           StoredFile file, DocumentLock lock, const std::optional<Recovery>& recovery, Timer timer)
    : m_id(id), m_application(application), m_project(Velmark::Counted<standin::Project>::share(&project)),
      m_file(std::move(file)), m_lock(std::move(lock)),
      m_mark(recovery ? UnsavedMark(project, m_file.print()) : UnsavedMark(project)), m_timer(std::move(timer))
{
    // The one from which it was opened.
    if (recovery && m_lock.isOurs())
        m_autosavedVersion = m_mark.version();
    if (recovery && recovery->basis != m_file.print())
        m_formerBasis = recovery->basis;
}

OpenDocument::~OpenDocument() = default;

std::string OpenDocument::autosaveFault() const
{
    if (!m_lock.isOurs() && !m_lock.holder())
        return path().parent_path().string() + ": no autosave can be written into this folder";
    return m_autosaveFault;
}

bool OpenDocument::settleUnsaved()
{
    m_mark.settle();
    return m_mark.isSet();
}

std::vector<std::u16string> OpenDocument::undoNames() const
{
    const standin::UndoList& list = std::as_const(*m_project).undoList();
    std::vector<std::u16string> names;
    for (std::size_t index = 0; index < list.size(); ++index)
        names.push_back(list.nameAt(index));
    return names;
}

std::size_t OpenDocument::undoPosition() const
{
    return std::as_const(*m_project).undoList().doneCount();
}

bool OpenDocument::goToUndoPosition(std::size_t position)
{
    standin::EditService& edits = m_application.edits();
    while (undoPosition() > position) {
        if (!edits.undo(*m_project))
            return false;
    }
    while (undoPosition() < position) {
        if (!edits.redo(*m_project))
            return false;
    }
    return true;
}

SaveAnswer OpenDocument::save()
{
    const StoredFile::State state = m_file.lookInside();
    if (state != StoredFile::State::AsStored)
        return answerTo(state, path());
    if (m_formerBasis)
        return {State::Changed, path().string() + ": has been changed since the time of the recovered work"};
    return write(path(), m_file.stamp());
}

SaveAnswer OpenDocument::overwrite()
{
    return write(path(), std::nullopt);
}

SaveAnswer OpenDocument::saveAs(const fs::path& path)
{
    if (path == this->path()) {
        SaveAnswer answer = save();
        return answer.state == State::Missing ? overwrite() : answer;
    }
    DocumentLock lock(path);
    if (lock.holder())
        return {State::Failed, path.string() + ": is open in another window"};
    const fs::path former = this->path();
    SaveAnswer answer = write(path, std::nullopt);
    if (!answer.isSaved())
        return answer;
    // The lock tells whose the autosave beside the former file is.
    if (m_lock.isOurs())
        Autosave::remove(former);
    m_lock = std::move(lock);
    if (m_lock.isOurs())
        Autosave::keepAside(path);
    return answer;
}

SaveAnswer OpenDocument::write(const fs::path& path, const std::optional<FileStamp>& expected)
{
    if (isWithinTransaction())
        return {State::Failed, path.string() + ": can't be saved while the project is being changed"};
    try {
        const std::string text = m_application.saveProject(*m_project, path, expected);
        const ContentPrint print = ContentPrint::of(text);
        const bool isSameFile = path == this->path();
        m_file = StoredFile(path, print);
        m_mark.wasStored(print);
        m_formerBasis.reset();
        if (isSameFile)
            dropAutosave();
        m_autosavedVersion.reset();
        m_autosaveFault.clear();
        return {};
    } catch (const ProjectFileChanged&) {
        return answerTo(StoredFile::State::Changed, path);
    } catch (const ProjectFileError& error) {
        return {State::Failed, failureOf(path, error)};
    }
}

void OpenDocument::idle(Clock::time_point now, Clock::duration interval, Modules modules)
{
    if (isWithinTransaction())
        return;
    const Clock::duration pause = std::max<Clock::duration>(ShortestLookInterval, LookShare * m_lookCost);
    if (!m_lookedAt || now - *m_lookedAt >= pause) {
        const auto start = m_timer();
        look(now, modules);
        m_lookCost = m_timer() - start;
        m_lookedAt = now;
        if (m_lock.holder())
            retakeLock();
    }
    if (!m_lock.isOurs())
        return;
    if (!m_mark.isSet())
        return dropAutosave();
    const auto isPast = [now](const std::optional<Clock::time_point>& time, Clock::duration wait) {
        return !time || now - *time >= wait;
    };
    if (!hasPresentAutosave() && isPast(m_autosavedAt, interval) &&
        isPast(m_autosaveTriedAt, AutosaveShare * m_autosaveCost))
        autosave(now, modules);
}

void OpenDocument::look(Clock::time_point now, Modules modules)
{
    if (modules == Modules::Ask)
        m_mark.look(now);
    else
        m_mark.lookWithoutModules();
}

void OpenDocument::leave(Modules modules)
try {
    look(m_timer(), modules);
    if (m_lock.isOurs() && !isWithinTransaction() && m_mark.isSet() && !hasPresentAutosave())
        autosave(m_timer(), modules);
    m_lock = DocumentLock();
} catch (const std::exception&) {
    // Such as no memory. An earlier autosave stays, and the program ends.
}

void OpenDocument::keepUnsavedAside()
try {
    if (settleUnsaved())
        Autosave::writeAside(path(), m_formerBasis.value_or(m_file.print()), m_mark.takeText(),
                             std::chrono::system_clock::now());
} catch (const ProjectFileError& error) {
    throw DocumentError(path().string() + ": " + wordsOf(error));
}

/// The other process may have closed the project, or ended and left unsaved work.
void OpenDocument::retakeLock()
{
    m_lock = DocumentLock(path());
    if (m_lock.isOurs())
        m_workOfOther = Autosave::keepAside(path());
}

void OpenDocument::autosave(Clock::time_point now, Modules modules)
{
    m_autosaveTriedAt = now;
    const auto start = m_timer();
    try {
        const std::string text = modules == Modules::Ask ? m_mark.takeText() : m_mark.takeTextAsItIs();
        if (!m_mark.isSet()) {
            m_autosaveCost = m_timer() - start;
            return dropAutosave();
        }
        m_autosavedAt = now;
        const std::uint64_t version = m_mark.version();
        Autosave::write(path(), m_formerBasis.value_or(m_file.print()), text, std::chrono::system_clock::now());
        // What couldn't be written is tried again after the interval.
        m_autosavedVersion = version;
        m_autosaveFault.clear();
    } catch (const DocumentError& error) {
        m_autosaveFault = error.what();
    } catch (const std::bad_alloc&) {
        m_autosaveFault = path().string() + ": there isn't enough memory for an autosave";
    } catch (const ProjectFileError& error) {
        m_autosaveFault = path().string().append(": ").append(wordsOf(error));
    }
    m_autosaveCost = m_timer() - start;
}

void OpenDocument::dropAutosave()
{
    if (m_autosavedVersion)
        Autosave::remove(path());
    m_autosavedVersion.reset();
}

std::string OpenDocument::failureOf(const fs::path& file, const ProjectFileError& error)
{
    const std::string fault = error.what();
    if (!fault.ends_with(": can't be written"))
        return wordsOf(error);
    // What the file system says tells more than that it couldn't.
    if (const auto obstacle = cadrel::util::WriteObstacle::of(file))
        return file.string() + ": " + obstacle->problem + "; " + obstacle->remedy;
    std::string words = fault + "; see whether the disk is full, or save it on another disk with Save As";
    m_mark.lookWithoutModules();
    if (hasPresentAutosave())
        words += ". Until then the work is kept in " + Autosave::pathFor(path()).string();
    return words;
}

bool OpenDocument::isWithinTransaction() const
{
    return m_application.edits().isOpen();
}

} // namespace desktop
