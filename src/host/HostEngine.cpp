// SPDX-License-Identifier: GPL-3.0-or-later

// What the engine asks for, carried out on the active project.

#include "core/cut/Cut.h"
#include "core/cut/CutList.h"
#include "core/cut/ProgressHandlerBase.h"
#include "core/model/DataModel.h"
#include "core/notify/ChangeContext.h"
#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "host/project/Project.h"
#include "util/HostString.h"
#include "util/StringUtil.h"
#include "velmark/Media.h"

#include <algorithm>
#include <array>

using namespace Velmark;
using cadrel::util::Result;

namespace cadrel::host {

Result::Type Host::getProjectCycle(double& left, double& right)
{
    if (m_currentProject)
        m_currentProject->getLocators(left, right);
    return Result::Ok;
}

Result::Type Host::setProjectCycle(double left, double right)
{
    if (m_currentProject)
        m_currentProject->setLocators(false, left, right);
    return Result::Ok;
}

Result::Type Host::getTransportCycle(double& left, double& right)
{
    if (m_currentProject)
        m_transport.getCycle(left, right);
    return Result::Ok;
}

Result::Type Host::setTransportCycle(double left, double right)
{
    if (m_currentProject)
        m_transport.setCycle(left, right);
    return Result::Ok;
}

Result::Type Host::getTransportPosition(double& seconds)
{
    if (m_currentProject)
        seconds = m_transport.position();
    return Result::Ok;
}

Result::Type Host::setTransportPosition(double seconds)
{
    if (m_currentProject)
        m_transport.setPosition(seconds);
    return Result::Ok;
}

std::wstring Host::getProjectName()
{
    if (!m_currentProject)
        return {};
    IProjectDocument* const document = m_currentProject->document();
    const auto file = Counted<IFilePath>::adopt(document->getProjectFile(document));
    if (!file)
        return {};
    std::array<char16_t, IFilePath::Capacity> path{};
    requireOk(file->getPath(path.data()));
    return util::HostString(path.data()).wide();
}

std::vector<core::SecondsRange> Host::getMaterial()
{
    return m_currentProject ? m_currentProject->material() : std::vector<core::SecondsRange>();
}

core::MediaPoolInterface* Host::getMediaPool()
{
    return m_currentProject ? &m_currentProject->mediaPool() : nullptr;
}

double Host::getTimeOrigin()
{
    return m_currentProject ? m_currentProject->timeOrigin() : 0.0;
}

bool Host::isPreviewActive()
{
    return m_currentProject && m_currentProject->model().isPreviewActive();
}

Result::Type Host::removeVirginTerritoryMarkers()
{
    Project* const project = engineProject();
    if (!project)
        return Result::NoProject;
    project->clearPreview(openTransaction());
    project->startWriting();
    return Result::Ok;
}

Result::Type Host::processEvent(core::Cut& cut)
{
    Project* const project = engineProject();
    if (!project)
        return Result::NoProject;
    if (m_progress && m_progress->isCancelled())
        return Result::Cancelled;
    project->processCut(openTransaction(), cut);
    return Result::Ok;
}

std::shared_ptr<core::Cut> Host::makeCutEvents(const std::shared_ptr<core::EventBase>& changeEvent)
{
    Project* const project = engineProject();
    if (!project)
        return std::make_shared<core::Cut>(changeEvent, core::Cut::CutEvents());
    return project->makeCut(changeEvent);
}

Result::Type Host::completeCadrel()
{
    Project* const project = engineProject();
    if (!project)
        return Result::Ok;
    announce(L"Completing");
    project->completeApply(openTransaction());
    return Result::Ok;
}

Result::Type Host::generateMarkers(const std::vector<core::MarkerEntry>& entries)
{
    Project* const project = engineProject();
    if (!project)
        return Result::Ok;
    announce(L"Generate Markers");
    if (m_progress)
        m_progress->beginStage(entries.size());
    project->generateMarkers(openTransaction(), entries);
    return Result::Ok;
}

core::CadrelRunState Host::getRunState()
{
    Project* const project = engineProject();
    return project ? project->runState() : core::CadrelRunState();
}

core::CadrelPreviewState Host::getPreviewState()
{
    Project* const project = engineProject();
    return project ? project->previewState() : core::CadrelPreviewState();
}

Result::Type Host::applyVirginTerritories(core::CutList& cuts)
{
    Project* const project = engineProject();
    const Result::Type result = CadrelerBase::applyVirginTerritories(cuts);
    if (result != Result::Ok || !project)
        return result;
    project->holdAutomation(openTransaction(), cuts, m_served == core::ActionChangeContext::Run);
    if (!project->model().settings().createVirginTerritories())
        return result;
    announce(L"Virgin Territories");
    project->markVirginTerritories(openTransaction(), cuts);
    return Result::Ok;
}

Result::Type Host::setProjectEvents(const core::EventList& events)
{
    Project* const project = engineProject();
    if (project)
        project->previewEvents().copyFrom(events);
    return Result::Ok;
}

std::uint64_t Host::estimateSteps(std::uint64_t eventCount, const core::Settings& settings,
                                  std::uint64_t /*trackCount*/)
{
    Project* const project = engineProject();
    if (!project)
        return 0;
    const std::vector<Track> candidates = project->availableTracks();
    const bool onlySelected = settings.applyTo() == core::ApplyTo::SelectedTracks;
    const auto tracks = static_cast<std::uint64_t>(
        std::ranges::count_if(candidates, [&](const Track& track) { return !onlySelected || track.isSelected(); }));
    const std::uint64_t ofCuts = ((m_runRequested ? 1 : 0) + eventCount) * tracks;
    const std::uint64_t ofTerritories = settings.createVirginTerritories() ? ofCuts : 0;
    return CadrelerBase::estimateSteps(eventCount, settings, tracks) + ofCuts + ofTerritories;
}

Project* Host::engineProject() const
{
    if (m_editedProject)
        requireActive(*m_editedProject);
    return m_currentProject.get();
}

IEditTransaction& Host::openTransaction() const
{
    if (!m_transaction)
        throw Result::NotAvailable;
    requireActive(*m_editedProject);
    return *m_transaction;
}

void Host::announce(const wchar_t* text)
{
    if (m_progress)
        m_progress->setText(util::StringUtil::translate(text));
}

} // namespace cadrel::host
