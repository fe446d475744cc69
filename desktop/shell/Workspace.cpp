// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/Workspace.h"

#include "desktop/document/DocumentError.h"
#include "standin/base/FilePath.h"
#include "standin/base/Utf16.h"
#include "standin/file/MediaMove.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <ctime>
#include <system_error>
#include <utility>
#include <vector>

namespace desktop {

namespace fs = std::filesystem;

using standin::toUtf16;
using standin::toUtf8;

namespace {

const standin::UserBoxes::FileFilter StageFilter{"stage", "Project"};
const standin::UserBoxes::FileFilter ArdourFilter{"ardour", "Session of Ardour"};
const std::vector<standin::UserBoxes::FileFilter> VideoFilters{
    {"mov", "QuickTime"}, {"mp4", "MPEG-4"}, {"m4v", "MPEG-4"}, {"mxf", "MXF"}, {"mkv", "Matroska"}, {"avi", "AVI"}};

std::string quotedName(const fs::path& file)
{
    return std::string("\"").append(file.filename().string()).append("\"");
}

std::string clockTime(Autosave::Time time)
{
    const std::time_t seconds = Autosave::Time::clock::to_time_t(time);
    std::tm parts{};
    localtime_r(&seconds, &parts);
    char text[32] = {};
    std::strftime(text, sizeof text, "%Y-%m-%d %H:%M", &parts);
    return text;
}

} // namespace

void Workspace::tell(const std::string& message)
{
    ask(message, {u"OK"});
}

std::size_t Workspace::ask(const std::string& message, const std::vector<std::u16string>& buttons, std::size_t byReturn)
{
    return m_boxes.ask(toUtf16(message), buttons, byReturn);
}

void Workspace::chooseAndOpen()
{
    const OpenDocument* const active = m_documents.active();
    const std::u16string folder = active ? toUtf16(active->path().parent_path().string()) : u"";
    for (const std::u16string& file :
         m_boxes.chooseFiles({u"Open Project", {StageFilter, ArdourFilter}, folder, false}))
        open(toUtf8(file));
}

bool Workspace::openRecent(RecentFiles& recent, const fs::path& path)
{
    enum { Remove, Cancel };
    std::error_code ignored;
    if (fs::exists(path, ignored))
        return open(path);
    if (ask(quotedName(path) + " isn't there.\n\n" + path.string(), {u"Take It off the List", u"Cancel"}, Cancel) ==
        Remove)
        recent.remove(path);
    return false;
}

bool Workspace::open(const fs::path& path)
{
    enum { Recover, OpenWithout, Cancel };
    try {
        const Opening opening = m_documents.look(path);
        auto work = OpenDocuments::Work::Keep;
        if (!opening.open && opening.openElsewhere &&
            ask(quotedName(opening.file) + " is open in another program. If you save in both, one of them loses its "
                                           "changes. As long as it is open there, this one has no autosave.",
                {u"Open All the Same", u"Cancel"}, 1) != 0)
            return false;
        if (!opening.open && opening.unsavedWork && !opening.openElsewhere) {
            std::string question = "Cadrel ended without saving " + quotedName(opening.file) +
                                   ". It has kept the work of " + clockTime(opening.unsavedWork->time) + ".";
            if (opening.unsavedWork->isOfFormerFile)
                question += " The file has been changed since then.";
            const std::size_t answer = ask(question, {u"Recover It", u"Open without It", u"Cancel"});
            if (answer == Cancel)
                return false;
            work = answer == Recover ? OpenDocuments::Work::Recover : OpenDocuments::Work::Keep;
        }
        m_documents.open(opening.file, work);
        return true;
    } catch (const DocumentError& error) {
        tell(error.what());
        return false;
    }
}

bool Workspace::told(const SaveAnswer& answer)
{
    if (!answer.isSaved())
        tell(answer.message);
    return answer.isSaved();
}

bool Workspace::save(OpenDocument& document)
{
    return settled(document, m_documents.save(document));
}

bool Workspace::settled(OpenDocument& document, const SaveAnswer& answer)
{
    const bool isSaved = answer.state == SaveAnswer::State::Changed || answer.state == SaveAnswer::State::Missing
                             ? settle(document, answer)
                             : told(answer);
    if (isSaved)
        m_told.erase(&document);
    return isSaved;
}

bool Workspace::settle(OpenDocument& document, const SaveAnswer& answer)
{
    enum { Write, SaveAs, Cancel };
    const bool isMissing = answer.state == SaveAnswer::State::Missing;
    switch (ask(answer.message, {isMissing ? u"Save It There Again" : u"Overwrite", u"Save As...", u"Cancel"},
                isMissing ? Write : Cancel)) {
    case Write:
        return told(m_documents.overwrite(document));
    case SaveAs:
        return saveAs(document);
    default:
        return false;
    }
}

bool Workspace::saveAs(OpenDocument& document)
{
    const auto& filter = document.project().form() ? ArdourFilter : StageFilter;
    const fs::path& path = document.path();
    const auto files = m_boxes.chooseFiles(
        {u"Save Project As", {filter}, toUtf16(path.parent_path().string()), true, toUtf16(path.filename().string())});
    return !files.empty() && settled(document, m_documents.saveAs(document, toUtf8(files.front())));
}

bool Workspace::close(OpenDocument& document)
{
    if (!mayClose(document))
        return false;
    drop(document);
    return true;
}

bool Workspace::mayClose(OpenDocument& document)
{
    enum { Save, Drop };
    if (!document.settleUnsaved())
        return true;
    const std::size_t answer = ask(quotedName(document.path()) + " has changes that aren't saved.",
                                   {u"Save", u"Close without Saving", u"Cancel"});
    return answer == Drop || (answer == Save && save(document));
}

void Workspace::drop(OpenDocument& document)
{
    m_told.erase(&document);
    m_documents.close(document);
}

void Workspace::activateTab(std::uint64_t id)
{
    if (OpenDocument* const document = m_documents.withId(id))
        m_documents.activate(*document);
}

void Workspace::closeTab(std::uint64_t id)
{
    if (OpenDocument* const document = m_documents.withId(id))
        close(*document);
}

bool Workspace::closeAll()
{
    std::vector<OpenDocument*> open;
    for (std::size_t index = 0; index < m_documents.size(); ++index)
        open.push_back(&m_documents.at(index));
    // About the one in front first.
    std::stable_partition(open.begin(), open.end(),
                          [this](const OpenDocument* it) { return it == m_documents.active(); });
    if (!std::ranges::all_of(open, [this](OpenDocument* document) { return mayClose(*document); }))
        return false;
    for (OpenDocument* const document : open)
        drop(*document);
    return true;
}

bool Workspace::reload(OpenDocument& document)
{
    try {
        const OpenDocument* const reloaded = &document;
        m_documents.reload(document);
        m_told.erase(reloaded);
        return true;
    } catch (const DocumentError& error) {
        tell(error.what());
        return false;
    }
}

void Workspace::addVideos(OpenDocument& document)
{
    const std::u16string folder = toUtf16(document.path().parent_path().string());
    for (const std::u16string& file : m_boxes.chooseFiles({u"Add Video", VideoFilters, folder, false}))
        addVideo(document, toUtf8(file));
}

bool Workspace::addVideo(OpenDocument& document, const fs::path& video)
{
    // What lies in the project's folder can move along with it.
    const fs::path stored = standin::mediaPathFrom(document.path().parent_path(), video);
    const auto path = Velmark::makeCounted<standin::FilePath>(toUtf16(stored.string()));
    if (document.project().pool().import(path.get()))
        return true;
    tell(quotedName(video) + " can't be read as a video.");
    return false;
}

bool Workspace::isReloadWanted(const OpenDocument& document)
{
    enum { Reload, Keep };
    std::string question = quotedName(document.path()) + " was changed by another program.";
    if (document.isUnsaved())
        question += " If you reload it, what isn't saved here is kept in the file " +
                    quotedName(Autosave::asidePathFor(document.path())) + ".";
    return ask(question, {u"Reload", u"Keep What Is Here"}, Keep) == Reload;
}

void Workspace::lookAtAutosaves()
{
    for (std::size_t index = 0; index < m_documents.size(); ++index) {
        OpenDocument& document = m_documents.at(index);
        if (const auto work = document.takeWorkOfOther())
            return tell("Another program has ended without saving " + quotedName(document.path()) +
                        ". Its work is kept in the file " + quotedName(*work) + ".");
        const std::string fault = document.autosaveFault();
        std::string& told = m_toldFaults[document.id()];
        if (fault.empty())
            told.clear();
        if (fault == told || !document.isUnsaved())
            continue;
        told = fault;
        return tell("Unsaved work on " + quotedName(document.path()) + " isn't kept for you: " + fault +
                    ".\n\nSave it now and then.");
    }
}

void Workspace::lookAtFile()
{
    OpenDocument* const document = m_documents.active();
    if (!document)
        return;
    const StoredFile::State state = document->fileState();
    StoredFile::State& told = m_told.try_emplace(document, StoredFile::State::AsStored).first->second;
    if (std::exchange(told, state) == state)
        return;
    const std::string name = quotedName(document->path());
    if (state == StoredFile::State::Missing)
        tell(name + " is no longer on the disk. What is open here can be saved there again.");
    else if (state == StoredFile::State::Changed && isReloadWanted(*document))
        reload(*document);
}

} // namespace desktop
