// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/UnsavedMark.h"

#include "standin/file/ProjectFile.h"
#include "standin/project/FileFault.h"
#include "standin/project/Project.h"
#include "standin/stage/ProjectWriter.h"

namespace desktop {

using standin::ProjectFile;

namespace {

/// Nothing changes for so many times what a comparison costs before one is made.
constexpr int QuietCosts = 20;

/// While it lives, the playhead of a project stands elsewhere. Nobody is told.
class PlayheadAt {
public:
    PlayheadAt(standin::Project& project, double place)
        : m_position(project.position()), m_former(m_position.getValue())
    {
        m_position.setValue(0, place);
    }
    PlayheadAt(const PlayheadAt&) = delete;
    PlayheadAt& operator=(const PlayheadAt&) = delete;
    ~PlayheadAt() { m_position.setValue(0, m_former); }

private:
    standin::Parameter& m_position;
    double m_former;
};

} // namespace

UnsavedMark::UnsavedMark(standin::Project& project)
    : m_project(project), m_storedPlayhead(project.position().getValue())
{
    announce();
    m_at = positionNow();
    try {
        const auto start = Clock::now();
        m_stored = ContentPrint::of(ProjectFile::toText(m_project));
        m_cost = Clock::now() - start;
        m_storedAt = m_at;
    } catch (const standin::ProjectFileError&) {
        m_isSet = true;
    }
}

UnsavedMark::UnsavedMark(standin::Project& project, const ContentPrint& stored)
    : m_project(project), m_stored(stored), m_storedPlayhead(project.position().getValue()), m_isSet(true)
{
    announce();
    m_at = positionNow();
    m_isExact = false;
}

bool UnsavedMark::isSet() const
{
    const std::uint64_t undo = m_project.undoList().state();
    const std::uint64_t unrecorded = m_project.link()->unrecordedChanges();
    if (undo == m_at.undo && unrecorded == m_at.unrecorded)
        return m_isSet;
    return !m_storedAt || *m_storedAt != Position{undo, unrecorded, m_at.head};
}

void UnsavedMark::look(Clock::time_point now)
{
    if (m_project.log().isOpen())
        return;
    announce();
    const std::uint64_t before = m_version;
    advance();
    if (m_version != before || !m_since)
        m_since = now;
    if (!m_isExact && now - *m_since >= QuietCosts * m_cost)
        compare();
}

void UnsavedMark::lookWithoutModules()
{
    if (!m_project.log().isOpen())
        advance();
}

void UnsavedMark::settle()
{
    if (m_project.log().isOpen())
        return;
    m_canAnnounce = true;
    announce();
    advance();
    if (!m_isExact)
        compare();
    // What a module couldn't store would be lost without a question.
    if (!m_canAnnounce) {
        m_isSet = true;
        m_isExact = false;
    }
}

std::string UnsavedMark::takeText()
{
    announce();
    return takeTextAsItIs();
}

std::string UnsavedMark::takeTextAsItIs()
{
    advance();
    return textHere();
}

std::string UnsavedMark::textHere()
{
    const auto start = Clock::now();
    std::string text = ProjectFile::toText(m_project);
    const bool isAtStored = m_project.position().getValue() == m_storedPlayhead;
    const ContentPrint print = ContentPrint::of(isAtStored ? text : textWithStoredPlayhead());
    m_cost = Clock::now() - start;
    m_isExact = true;
    m_isSet = print != m_stored;
    if (!m_isSet)
        m_storedAt = m_at;
    return text;
}

std::string UnsavedMark::textWithStoredPlayhead()
{
    const PlayheadAt stored(m_project, m_storedPlayhead);
    return ProjectFile::toText(m_project);
}

void UnsavedMark::wasStored(const ContentPrint& print)
{
    m_canAnnounce = true;
    m_stored = print;
    m_storedPlayhead = m_project.position().getValue();
    advance();
    m_storedAt = m_at;
    m_isSet = false;
    m_isExact = true;
}

void UnsavedMark::announce()
{
    // A module that can't store says so to the user, once.
    if (m_canAnnounce)
        m_canAnnounce = m_project.announceStoring();
}

std::uint64_t UnsavedMark::headOf() const
try {
    const PlayheadAt stored(m_project, m_storedPlayhead);
    return ContentPrint::of(standin::ProjectWriter::textOf(m_project, [](const standin::Node&) { return false; })).hash;
} catch (const standin::FileFault& fault) {
    return ContentPrint::of(fault.what()).hash;
}

UnsavedMark::Position UnsavedMark::positionNow() const
{
    return {m_project.undoList().state(), m_project.link()->unrecordedChanges(), headOf()};
}

void UnsavedMark::advance()
{
    const Position position = positionNow();
    if (position == m_at)
        return;
    m_at = position;
    ++m_version;
    m_isExact = position == m_storedAt;
    m_isSet = !m_isExact;
}

void UnsavedMark::compare()
try {
    textHere();
} catch (const standin::ProjectFileError&) {
    // No file holds it as it stands.
    m_isSet = true;
    m_isExact = true;
}

} // namespace desktop
