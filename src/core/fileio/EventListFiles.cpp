// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxWriter.h"
#include "core/fileio/ParserChoice.h"
#include "core/fileio/ParserInterface.h"
#include "core/time/Timecode.h"
#include "util/Result.h"

#include <algorithm>
#include <string>
#include <unordered_set>

namespace cadrel::core {

using util::Result;

namespace {

bool isNamedAsBRoll(const std::string& rollName)
{
    return rollName.ends_with('B');
}

/// Gives each B-roll the name of its roll, if the list has that roll.
void renameBRollsOf(const EventList& list)
{
    const auto& events = list.events();
    const bool hasBRolls =
        std::any_of(events.begin(), events.end(), [](const auto& event) { return isNamedAsBRoll(event->rollName()); });
    if (!hasBRolls)
        return;

    std::unordered_set<std::string> rollNames;
    for (const auto& event : events)
        rollNames.insert(event->rollName());
    for (const auto& event : events) {
        if (!isNamedAsBRoll(event->rollName()))
            continue;
        const std::string shorter = event->rollName().substr(0, event->rollName().size() - 1);
        if (rollNames.contains(shorter))
            event->setRollName(shorter);
    }
}

/// Without one no timecode of a file could be taken, and the list would stay empty without a word.
void requireFramerate()
{
    if (!Timecode::framerateProvider())
        throw Result::NotAvailable;
}

} // namespace

void EventList::load(const std::wstring& fileName, bool append, Framerate& framerate, bool renameBRolls,
                     bool acceptAudioChannels)
{
    requireFramerate();
    if (!append)
        clear();
    load(fileName, framerate, renameBRolls, acceptAudioChannels, *fileio::parserFor(fileName));
}

void EventList::load(const std::wstring& fileName, Framerate& framerate, bool renameBRolls, bool acceptAudioChannels,
                     fileio::ParserInterface& parser)
{
    requireFramerate();
    EventList loaded;
    const Result::Type result = parser.parse(fileName, loaded, framerate, acceptAudioChannels);
    if (result != Result::Ok)
        throw result;
    if (renameBRolls)
        renameBRollsOf(loaded);
    append(loaded.release());
}

void EventList::load(const std::wstring& fileName, bool append)
{
    Framerate unknown;
    load(fileName, append, unknown, false, false);
}

void EventList::save(const std::wstring& fileName) const
{
    fileio::CmxWriter writer;
    const Result::Type result = writer.write(fileName, *this);
    if (result != Result::Ok)
        throw result;
}

} // namespace cadrel::core
