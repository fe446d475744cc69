// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"
#include "velmark/Counted.h"

#include <utility>

namespace cadrel::host {

// How the host's answers become the system's failures, and the other way round:
//
//     const auto manager = required(Velmark::service<IProjectManager>(context));
//     requireOk(manager->addNotification(this));

/// What the host gave. Throws Result::HostObjectMissing for nothing.
template <class T>
[[nodiscard]] Velmark::Counted<T> required(Velmark::Counted<T> object)
{
    if (!object)
        throw util::Result::HostObjectMissing;
    return object;
}
/// The same for what is borrowed.
template <class T>
T* required(T* borrowed)
{
    if (!borrowed)
        throw util::Result::HostObjectMissing;
    return borrowed;
}

/// Throws Result::HostCallFailed for an answer of the host that is a refusal.
inline void requireOk(Velmark::int32 result)
{
    if (result != Velmark::ResultOk)
        throw util::Result::HostCallFailed;
}

/// Throws `result` unless it is Ok.
inline void requireSuccess(util::Result::Type result)
{
    if (result != util::Result::Ok)
        throw result;
}

/// The outer frame of what the host calls, which no exception may leave: carries the action out and answers what it threw,
/// Result::NotAvailable for whatever isn't one of the system's own values.
template <class Action>
util::Result::Type resultOf(Action&& action) noexcept
{
    try {
        std::forward<Action>(action)();
        return util::Result::Ok;
    } catch (util::Result::Type failure) {
        return failure;
    } catch (...) {
        return util::Result::NotAvailable;
    }
}

} // namespace cadrel::host
