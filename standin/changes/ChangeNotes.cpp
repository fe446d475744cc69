// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/ChangeNotes.h"

#include <utility>

using namespace Velmark;

namespace standin {

void ChangeNotes::mark(MarkedObject& object, uint32 flags)
{
    if (!object.isMarked() && &object != &m_project)
        m_marked.push_back(Counted<MarkedObject>::share(&object));
    object.addMarks(flags);
}

void ChangeNotes::show()
{
    m_project.showMarks();
    for (const Counted<MarkedObject>& object : m_marked)
        object->showMarks();
}

void ChangeNotes::startTelling()
{
    show();
    m_project.clearMarks();
    for (Counted<MarkedObject>& object : m_marked) {
        object->clearMarks();
        m_told.push_back(std::move(object));
    }
    m_marked.clear();
    m_tellsOfPool = std::exchange(m_hasPoolChanged, false);
}

void ChangeNotes::endTelling()
{
    m_project.hideMarks();
    const std::vector<Counted<MarkedObject>> told = std::exchange(m_told, {});
    for (const Counted<MarkedObject>& object : told)
        object->hideMarks();
    // An edit hook may have been shown more while others were told.
    for (const Counted<MarkedObject>& object : m_marked)
        object->hideMarks();
    m_tellsOfPool = false;
}

void ChangeNotes::clear()
{
    startTelling();
    endTelling();
}

} // namespace standin
