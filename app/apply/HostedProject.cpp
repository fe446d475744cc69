// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/HostedProject.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Terminal.h"
#include "app/project/ProjectAccess.h"
#include "host/Host.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "util/Result.h"

#include <iostream>
#include <string_view>

namespace cadrel::app {

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

/// The name under which the user can undo what was done last; empty for nothing.
std::u16string_view lastEntryOf(const standin::UndoList& undoList)
{
    return undoList.canUndo() ? undoList.nameAt(undoList.doneCount() - 1) : std::u16string_view();
}

} // namespace

HostedProject::HostedProject(const std::string& file, const Terminal& terminal)
    : m_file(file), m_application(standin::Terminal(std::cerr, terminal.showsProgress(), Interruption::request())),
      m_host(Velmark::makeCounted<host::Host>(m_application.context()))
{
    requireReadableProject(file);
    try {
        m_project = &m_application.openProject(file);
    } catch (const ProjectFileError& error) {
        throw readingFailure(error, file);
    }
    m_application.activateProject(m_project);
}

HostedProject::~HostedProject() = default;

core::DataModel& HostedProject::model()
{
    return *m_host->getProjectModel();
}

void HostedProject::apply()
{
    // A project can have been saved in the middle of a preview.
    if (m_host->isPreviewActive())
        m_host->setPreviewActive(false);
    const Result::Type result = m_host->startCadrel();
    if (result != Result::Ok)
        throw startFailure(result, m_file);
    m_application.idle();
    Interruption::check();
    if (lastEntryOf(m_project->undoList()) != u"Apply Cadrel")
        throw Failure{m_file, "the run broke off before its end", "report it with the files"};
}

void HostedProject::save(const std::string& file)
{
    try {
        m_application.saveProject(*m_project, file);
    } catch (const ProjectFileError& error) {
        throw writingFailure(error, file);
    }
}

} // namespace cadrel::app
