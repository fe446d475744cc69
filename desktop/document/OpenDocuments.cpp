// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/OpenDocuments.h"

#include "desktop/document/DocumentError.h"
#include "desktop/document/FileWords.h"
#include "desktop/document/RecentFiles.h"
#include "standin/Application.h"
#include "standin/edit/EditService.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "standin/services/IdleManager.h"

#include <algorithm>
#include <system_error>
#include <utility>

namespace desktop {

namespace fs = std::filesystem;

using standin::ProjectFile;
using standin::ProjectFileError;

namespace {

/// The one name of a file that has many.
fs::path realPath(const fs::path& path)
{
    std::error_code error;
    const fs::path real = fs::weakly_canonical(fs::absolute(path, error), error);
    if (error)
        throw DocumentError(path.string() + ": " + error.message());
    return real;
}

fs::path projectAt(const fs::path& path)
try {
    return realPath(ProjectFile::fileIn(path));
} catch (const ProjectFileError& error) {
    throw DocumentError(wordsOf(error));
}

/// Nothing where there is no unsaved work, or none that the file doesn't have.
std::optional<Autosave> workFor(const StoredFile& file)
{
    std::optional<Autosave> autosave = Autosave::read(file.path());
    if (autosave && ContentPrint::of(autosave->content) == file.print())
        autosave.reset();
    return autosave;
}

} // namespace

OpenDocuments::OpenDocuments(standin::Application& application, RecentFiles* recent, Clock::duration autosaveInterval,
                             Timer timer)
    : m_application(application), m_recent(recent), m_autosaveInterval(autosaveInterval), m_timer(std::move(timer))
{
}

OpenDocuments::~OpenDocuments()
{
    for (const auto& document : m_documents)
        m_application.closeProject(document->project());
}

Opening OpenDocuments::look(const fs::path& path) const
{
    Opening opening;
    opening.file = projectAt(path);
    opening.open = find(opening.file);
    if (opening.open)
        return opening;
    const StoredFile file(opening.file);
    opening.openElsewhere = DocumentLock::holderOf(opening.file);
    if (opening.openElsewhere)
        return opening;
    if (const std::optional<Autosave> work = workFor(file))
        opening.unsavedWork = Opening::UnsavedWork{work->time, work->filePrint != file.print()};
    return opening;
}

OpenDocument& OpenDocuments::open(const fs::path& path, Work work)
{
    const fs::path file = projectAt(path);
    if (OpenDocument* const present = find(file)) {
        activate(*present);
    } else {
        m_documents.push_back(openedFrom(file, work));
        m_active = m_documents.back().get();
    }
    if (m_recent)
        m_recent->add(file);
    return *m_active;
}

std::unique_ptr<OpenDocument> OpenDocuments::openedFrom(const fs::path& path, Work work)
{
    // Before it is read, so that what is written meanwhile counts as changed.
    StoredFile file(path);
    DocumentLock lock(path);
    // The unsaved work of a program that still has the project open is its own.
    const std::optional<Autosave> kept = lock.isOurs() ? Autosave::read(path) : std::nullopt;
    const bool isWork = kept && ContentPrint::of(kept->content) != file.print();
    if (isWork && work == Work::Recover)
        return newDocument(++m_lastId, openProject(path, &kept->content), std::move(file), std::move(lock),
                           OpenDocument::Recovery{kept->filePrint});
    // First, as the work is all that there is where the file can't be opened.
    standin::Project& project = openProject(path, nullptr);
    if (isWork && work == Work::Keep)
        Autosave::keepAside(path);
    else if (kept)
        Autosave::remove(path);
    return newDocument(++m_lastId, project, std::move(file), std::move(lock), std::nullopt);
}

standin::Project& OpenDocuments::openProject(const fs::path& file, const std::string* content)
try {
    return content ? m_application.openProject(file, *content) : m_application.openProject(file);
} catch (const ProjectFileError& error) {
    throw DocumentError(wordsOf(error));
}

std::unique_ptr<OpenDocument> OpenDocuments::newDocument(std::uint64_t id, standin::Project& project, StoredFile file,
                                                         DocumentLock lock,
                                                         const std::optional<OpenDocument::Recovery>& recovery)
{
    // First, as what the modules do with it then is no work of the user's.
    m_application.activateProject(&project);
    return std::unique_ptr<OpenDocument>(
        new OpenDocument(id, m_application, project, std::move(file), std::move(lock), recovery, m_timer));
}

OpenDocument& OpenDocuments::reload(OpenDocument& document)
{
    const fs::path path = document.path();
    StoredFile file(path);
    standin::Project& project = openProject(path, nullptr);
    try {
        document.keepUnsavedAside();
    } catch (...) {
        m_application.closeProject(project);
        throw;
    }
    document.dropAutosave();
    const auto place = placeOf(document);
    std::unique_ptr<OpenDocument> former = std::exchange(
        *place, newDocument(document.id(), project, std::move(file), std::move(document.m_lock), std::nullopt));
    m_active = place->get();
    m_application.closeProject(former->project());
    return *m_active;
}

void OpenDocuments::close(OpenDocument& document)
{
    document.dropAutosave();
    const auto place = placeOf(document);
    const std::size_t index = static_cast<std::size_t>(place - m_documents.begin());
    const std::unique_ptr<OpenDocument> closed = std::move(*place);
    m_documents.erase(place);
    if (m_active == closed.get())
        m_active = nullptr;
    m_application.closeProject(closed->project());
    if (!m_active && !m_documents.empty())
        activate(*m_documents[std::min(index, m_documents.size() - 1)]);
}

void OpenDocuments::activate(OpenDocument& document)
{
    m_active = &document;
    m_application.activateProject(&document.project());
}

OpenDocument* OpenDocuments::withId(std::uint64_t id) const
{
    const auto found = std::ranges::find_if(m_documents, [&](const auto& document) { return document->id() == id; });
    return found == m_documents.end() ? nullptr : found->get();
}

OpenDocument* OpenDocuments::find(const fs::path& path) const
{
    const fs::path real = realPath(path);
    const auto found =
        std::ranges::find_if(m_documents, [&](const auto& document) { return document->path() == real; });
    return found == m_documents.end() ? nullptr : found->get();
}

SaveAnswer OpenDocuments::save(OpenDocument& document)
{
    return document.save();
}

SaveAnswer OpenDocuments::overwrite(OpenDocument& document)
{
    return document.overwrite();
}

SaveAnswer OpenDocuments::saveAs(OpenDocument& document, const fs::path& path)
try {
    const fs::path real = realPath(path);
    if (const OpenDocument* const other = find(real); other && other != &document)
        return {SaveAnswer::State::Failed, real.string() + ": is open in another tab"};
    SaveAnswer answer = document.saveAs(real);
    if (answer.isSaved() && m_recent)
        m_recent->add(real);
    return answer;
} catch (const DocumentError& error) {
    return {SaveAnswer::State::Failed, error.what()};
}

void OpenDocuments::idle(Clock::time_point now)
{
    idle(now, OpenDocument::Modules::Ask);
}

void OpenDocuments::idleBeneathBox(Clock::time_point now)
{
    idle(now, OpenDocument::Modules::LeaveAlone);
}

void OpenDocuments::idle(Clock::time_point now, OpenDocument::Modules modules)
{
    if (!isHostIdle())
        return;
    for (const auto& document : m_documents)
        document->idle(now, m_autosaveInterval, modules);
}

void OpenDocuments::leave(bool mayAskModules)
{
    using Modules = OpenDocument::Modules;
    for (const auto& document : m_documents)
        document->leave(mayAskModules && isHostIdle() ? Modules::Ask : Modules::LeaveAlone);
}

bool OpenDocuments::isHostIdle() const
{
    return !m_application.edits().isOpen() && !m_application.idleManager().isBlocked();
}

OpenDocuments::Documents::iterator OpenDocuments::placeOf(const OpenDocument& document)
{
    return std::ranges::find_if(m_documents, [&](const auto& open) { return open.get() == &document; });
}

} // namespace desktop
