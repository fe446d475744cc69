// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/video/ProjectVideo.h"

#include "host/project/Project.h"

namespace cadrel::host {

using Mode = gui::VideoTrackHandlerBase::Mode;

ProjectVideo::ProjectVideo(Velmark::IHostContext* context)
    : m_oldSource(m_trackHandler, Mode::Old), m_writer(context, m_newSource, m_trackHandler, Mode::New)
{
}

ProjectVideo::~ProjectVideo()
{
    setProject(nullptr);
}

void ProjectVideo::setProject(Project* project)
{
    if (m_project) {
        m_project->removeListener(&m_trackHandler);
        m_project->removeListener(&m_oldSource);
    }
    m_project = project;
    m_trackHandler.rebuild(project);
    m_newSource.setMediaPool(project ? &project->mediaPool() : nullptr);
    m_newSource.setVideoList(project ? &project->model().videoList() : nullptr);
    if (m_project) {
        m_project->addListener(&m_trackHandler);
        m_project->addListener(&m_oldSource);
    }
}

VideoWriting ProjectVideo::apply(bool write, Velmark::IEditTransaction& transaction, double offset)
{
    if (!m_project)
        return VideoWriting::Done;
    m_trackHandler.rebuild(m_project);
    m_writer.setOffset(offset);
    return write ? m_writer.writeVideoEvents(transaction) : VideoWriting::Done;
}

} // namespace cadrel::host
