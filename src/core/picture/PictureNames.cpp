// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/picture/PictureNames.h"

#include "core/edl/EventBase.h"
#include "core/edl/MatchedName.h"
#include "core/fileio/EventLine.h"

#include <string_view>

namespace cadrel::core {

namespace {

/// Stands between the parts of a text, in which no name has it.
constexpr char Separator = '\n';

/// The columns of the line that the event was read from, which its comment begins with.
fileio::EventLine columnsOf(const EventBase& event)
{
    const std::string_view comment = event.comment();
    return fileio::EventLine::withTabs(comment.substr(0, comment.find('\n')));
}

std::string sourceTextOf(const EventBase& event)
{
    if (!event.hasFlaw(EventFlaw::SrcInUnreadable) && !event.hasFlaw(EventFlaw::SrcOutUnreadable))
        return event.srcIn().toString() + ' ' + event.srcOut().toString();
    const fileio::EventLine columns = columnsOf(event);
    return std::string(columns.timecodes[0]) + ' ' + std::string(columns.timecodes[1]);
}

} // namespace

PictureNames::PictureNames(std::int32_t matchBy, const std::vector<VfxPatternEntry>& vfxEntries) : m_matchBy(matchBy)
{
    m_versionPatterns.compileEnabled(vfxEntries);
}

bool PictureNames::hasReadableSource(const EventBase& event, const Framerate& framerate)
{
    return !event.hasFlaw(EventFlaw::SrcInUnreadable) && !event.hasFlaw(EventFlaw::SrcOutUnreadable) &&
           event.srcIn().isValid(framerate) && event.srcOut().isValid(framerate);
}

std::int32_t PictureNames::numberOf(const EventBase& event, const Framerate& framerate)
{
    if (!isToldByName(event, framerate))
        return m_numbers.numberOf(textOf(event, framerate));
    // Nearly all events are such, and many have one name.
    const std::string& name = nameBy(m_matchBy, event);
    const auto known = m_numbersOfNames.find(name);
    if (known != m_numbersOfNames.end())
        return known->second;
    return m_numbersOfNames.emplace(name, m_numbers.numberOf(matchedName(name))).first->second;
}

/// Whether nothing but the name makes up the text.
bool PictureNames::isToldByName(const EventBase& event, const Framerate& framerate)
{
    return !event.hasFlaw(EventFlaw::RollNameInvalid) && hasReadableSource(event, framerate);
}

std::int32_t PictureNames::numberOfTransition(const EventBase& event, const EventBase* outgoing,
                                              const Framerate& framerate)
{
    std::string text = textOf(event, framerate);
    text += Separator + std::to_string(event.transitionType()) + ' ' + std::to_string(event.transitionDuration());
    if (outgoing != nullptr)
        text += Separator + textOf(*outgoing, framerate) + Separator + outgoing->lastSource().toString();
    return m_numbers.numberOf(text);
}

std::string PictureNames::textOf(const EventBase& event, const Framerate& framerate)
{
    std::string text = matchedName(nameBy(m_matchBy, event));
    // The reader leaves out a roll name that it can't take.
    if (event.hasFlaw(EventFlaw::RollNameInvalid))
        text += Separator + std::string(columnsOf(event).rollName);
    if (!hasReadableSource(event, framerate))
        text += Separator + sourceTextOf(event);
    return text;
}

const std::string& PictureNames::matchedName(const std::string& name)
{
    const auto known = m_matchedNames.find(name);
    if (known != m_matchedNames.end())
        return known->second;
    return m_matchedNames.emplace(name, m_versionPatterns.stripVersion(name)).first->second;
}

} // namespace cadrel::core
