// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/picture/VideoProvider.h"

#include "host/project/Project.h"

namespace cadrel::host {

using Mode = gui::VideoTrackHandlerBase::Mode;

VideoProvider::VideoProvider(Velmark::IHostContext* context)
    : m_oldSource(m_trackHandler, Mode::Old),
      m_writer(context, m_newSource, m_trackHandler, Mode::New), m_images{{{*this, context, m_oldSource, OldSide},
                                                                           {*this, context, m_newSource, NewSide}}}
{
}

VideoProvider::~VideoProvider()
{
    setProject(nullptr);
}

void VideoProvider::setProject(Project* project)
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

void VideoProvider::apply(bool write, Velmark::IEditTransaction& transaction, double offset)
{
    if (!m_project)
        return;
    m_trackHandler.rebuild(m_project);
    m_writer.setOffset(offset);
    if (write)
        m_writer.writeVideoEvents(transaction);
}

void VideoProvider::poll()
{
    for (SingleImageProvider& image : m_images)
        image.poll();
}

void VideoProvider::requestImage(std::size_t side, int width, int height, bool lastFrame, double time)
{
    m_images.at(side).requestImage(width, height, lastFrame, time);
}

} // namespace cadrel::host
