// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Marker.h"

#include <string_view>

using namespace Velmark;

namespace standin {

bool Marker::isType(const char* word)
{
    if (!word)
        return false;
    const std::string_view asked = word;
    return asked == TypeWord::Marker || (m_isRange && asked == TypeWord::Range) || Event::isType(word);
}

Counted<Event> Marker::makePiece(double /*offset*/, double /*length*/) const
{
    return makeCounted<Marker>(m_isRange);
}

bool Marker::sourceRunsOn(const Event& /*next*/) const
{
    return m_isRange;
}

} // namespace standin
