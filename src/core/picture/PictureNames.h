// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/TextNumbers.h"
#include "core/settings/VfxNameMatcher.h"

#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

namespace cadrel::core {

class EventBase;
struct Framerate;

/// Gives one number to all events that show the same material in the same way, whatever stretch of it. Two cuts that
/// are to be compared share one object.
class PictureNames {
public:
    /// `matchBy` 1 compares clip names, all else roll names, both without the version numbers that the enabled rows
    /// describe. Throws Result::InvalidArgument for a row that doesn't compile.
    PictureNames(std::int32_t matchBy, const std::vector<VfxPatternEntry>& vfxEntries);

    /// The number of the event's material. A SRC that can't be read or doesn't exist at the rate is part of it as a
    /// text, since no frames can be counted there.
    std::int32_t numberOf(const EventBase& event, const Framerate& framerate);
    /// The number of the picture while the event's transition lasts; `outgoing` is the event that it leads away from,
    /// null when the list doesn't tell.
    std::int32_t numberOfTransition(const EventBase& event, const EventBase* outgoing, const Framerate& framerate);

    /// Whether frames of the source can be counted.
    static bool hasReadableSource(const EventBase& event, const Framerate& framerate);

private:
    static bool isToldByName(const EventBase& event, const Framerate& framerate);
    std::string textOf(const EventBase& event, const Framerate& framerate);
    const std::string& matchedName(const std::string& name);

    std::int32_t m_matchBy;
    VfxNameMatcher m_versionPatterns;
    std::unordered_map<std::string, std::string> m_matchedNames;
    TextNumbers m_numbers;
    std::unordered_map<std::string, std::int32_t> m_numbersOfNames; ///< of events that are told by their names alone
};

} // namespace cadrel::core
