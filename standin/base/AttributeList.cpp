// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/AttributeList.h"

#include "standin/base/Text.h"

#include <algorithm>
#include <cstddef>
#include <limits>

using namespace Velmark;

namespace standin {

int32 AttributeList::setBinary(const char* key, const void* bytes, int32 size, bool /*copy*/)
{
    if (!key || size < 0 || (!bytes && size > 0) || !isWellFormed(key))
        return ResultFalse;
    // The list always has a copy of its own, so that it can be stored at any time.
    const auto* const first = static_cast<const uint8*>(bytes);
    set(key, Bytes(first, first + size));
    return ResultOk;
}

int32 AttributeList::getBinary(const char* key, void* buffer, int32 size)
{
    if (!key || size < 0 || (!buffer && size > 0))
        return ResultFalse;
    const auto found = m_values.find(key);
    if (found == m_values.end() || found->second.size() < static_cast<std::size_t>(size))
        return ResultFalse;
    std::copy_n(found->second.begin(), size, static_cast<uint8*>(buffer));
    return ResultOk;
}

int32 AttributeList::getBinarySize(const char* key)
{
    const auto found = key ? m_values.find(key) : m_values.end();
    if (found == m_values.end())
        return -1;
    constexpr std::size_t Largest = std::numeric_limits<int32>::max();
    return static_cast<int32>(std::min(found->second.size(), Largest));
}

} // namespace standin
