// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/HostedProject.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/project/ProjectAccess.h"
#include "app/project/ProjectContent.h"
#include "app/project/StoredModel.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "host/Host.h"
#include "standin/base/Times.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "util/Result.h"
#include "velmark/Attributes.h"

#include <iostream>
#include <optional>

namespace cadrel::app {

using standin::ProjectFile;
using standin::ProjectFileChanged;
using standin::ProjectFileError;
using util::Result;

namespace {

/// Why a run can't begin.
Failure startFailure(Result::Type result, const std::string& file)
{
    switch (result) {
    case Result::NoTracks:
        return {file, "has no tracks that a run could change", "give a project with sound"};
    case Result::NoTracksSelected:
        return {file, "no track is selected", "select the tracks in it, or give --tracks all"};
    default:
        return {file, "the run can't begin: failure " + std::to_string(result), "report it with the files"};
    }
}

/// Why a run has ended before its end; nothing tells that it never began.
Failure breakFailure(std::optional<Result::Type> result, const std::string& file)
{
    if (!result)
        return {file, "the run didn't begin", "report it with the files"};
    return {file, "the run broke off before its end: failure " + std::to_string(*result), "report it with the files"};
}

/// A run works in a stretch that begins after all content and is as long as the content. Beyond this time of the project there
/// may be no room for it.
constexpr double FurthestContent = standin::FurthestTime / 2 - 2 * 86400.0;

/// What stands too far for a run, in words: "the clip "hello" on the track "DIA 1" stands at 271752:00:00:00". Nothing where
/// all is near enough. Automation doesn't count: it can stand after the end of a project.
std::optional<std::string> farContent(const standin::Project& project, const ProjectClock& clock)
{
    double furthest = FurthestContent;
    std::optional<std::string> words;
    for (const standin::Track* const track : tracksOf(project)) {
        const auto visit = [&](const PlacedEvent& placed) {
            if (placed.end <= furthest)
                return;
            furthest = placed.end;
            words = std::string("the ") + kindOf(placed.event) + " " + quoted(printableName(placed.event.name())) +
                    " on the track " + quoted(printableName(track->name())) + " stands at " +
                    clock.exactTimecode(placed.start);
        };
        if (!track->isFolder())
            visitAllEvents(*track, 0.0, 0, visit);
    }
    return words;
}

/// Hears how the run of a host ends.
class RunEnd : public core::ChangeContextListenerInterface {
public:
    explicit RunEnd(host::Host& host) : m_host(host) { m_host.addListener(this); }
    RunEnd(const RunEnd&) = delete;
    RunEnd& operator=(const RunEnd&) = delete;
    ~RunEnd() override { m_host.removeListener(this); }

    /// Nothing until it has ended.
    std::optional<Result::Type> result() const { return m_result; }

    void onChange(const core::ChangeContext& context) override
    {
        const auto* const ended = dynamic_cast<const core::ActionChangeContext*>(&context);
        if (ended && ended->action == core::ActionChangeContext::Run)
            m_result = ended->result;
    }

private:
    host::Host& m_host;
    std::optional<Result::Type> m_result;
};

} // namespace

HostedProject::HostedProject(const std::string& file, const Terminal& terminal, Opening opening)
    : m_file(file), m_stamp(util::FileStamp::of(file)),
      m_application(
          standin::Terminal(std::cerr, terminal.showsProgress(), Interruption::request(), Terminal::lineLength()))
{
    requireReadableProject(file);
    try {
        m_project = &m_application.openProject(file);
    } catch (const ProjectFileError& error) {
        throw readingFailure(error, file);
    }
    // Before Cadrel meets the project: it would tell of the model in an alert, and go on without.
    dropUnreadableModel(opening);
    m_host = Velmark::makeCounted<host::Host>(m_application.context());
    m_application.activateProject(m_project);
}

void HostedProject::dropUnreadableModel(Opening opening)
{
    const StoredModel stored(*m_project, clockOf(*m_project, m_file));
    if (!stored.isUnreadable())
        return;
    if (opening == Opening::WithStored)
        throw Failure{m_file, stored.fault(), stored.remedy()};
    if (opening == Opening::FreshInPlace && stored.isOfNewerVersion())
        throw Failure{m_file, stored.fault() + ", and is kept", "give -o to write the project elsewhere"};
    for (const char* const key : {Velmark::AttributeKey::Storage, Velmark::AttributeKey::StorageChecksum})
        m_project->removeAttribute(key);
}

HostedProject::~HostedProject() = default;

core::DataModel& HostedProject::model()
{
    return *m_host->getProjectModel();
}

void HostedProject::endPreview()
{
    if (m_host->isPreviewActive())
        m_host->setPreviewActive(false);
}

void HostedProject::apply()
{
    apply([this] { return m_host->startCadrel(); });
}

void HostedProject::applyWithin(const core::SecondsRange& bounds)
{
    apply([&] { return m_host->startCadrelWithin(bounds); });
}

void HostedProject::apply(const std::function<Result::Type()>& request)
{
    // What a run that breaks off leaves would be further off.
    const std::optional<std::string> far = farContent(*m_project, clockOf(*m_project, m_file));
    const Result::Type result = request();
    if (result != Result::Ok)
        throw startFailure(result, m_file);
    const RunEnd end(*m_host);
    m_application.idle();
    Interruption::check();
    if (end.result() == Result::HostCallFailed && far)
        throw Failure{m_file, *far + ", too far off for a run", "move it to its place, or remove it"};
    if (end.result() != Result::Ok)
        throw breakFailure(end.result(), m_file);
}

void HostedProject::requireTarget(const std::string& file) const
{
    try {
        ProjectFile::requireWritable(*m_project, file);
    } catch (const ProjectFileError& error) {
        throw Failure{file, faultIn(error, file), "give another name"};
    }
}

void HostedProject::save(const std::string& file, const std::optional<util::FileStamp>& expected)
{
    // Nobody takes the run back any more, and what the project was takes more memory than what it is.
    m_project->undoList().clear();
    try {
        m_application.saveProject(*m_project, file, expected);
    } catch (const ProjectFileChanged&) {
        throw writtenMeanwhile(file);
    } catch (const ProjectFileError& error) {
        throw writingFailure(error, file);
    }
}

} // namespace cadrel::app
