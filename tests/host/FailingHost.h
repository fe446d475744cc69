// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Counted.h"
#include "velmark/FObject.h"

#include <cstddef>
#include <map>
#include <utility>

namespace cadrel::host::tests {

/// A host of which one call fails: the n-th from when it's armed on answers a refusal or null, and does nothing. All others
/// go on to the host behind. What comes out of it are objects of its own, the same one for the same object each time; what
/// goes in is put back into the host's. Calls that have no way to fail, by their types or by the contract, don't.
///
/// Listeners of projects aren't called; the dependents are.
class FailingHost {
public:
    /// What a call that fails answers; "nothing to do" is another.
    static constexpr Velmark::int32 Refusal = 2;

    explicit FailingHost(Velmark::IHostContext* host);
    FailingHost(const FailingHost&) = delete;
    FailingHost& operator=(const FailingHost&) = delete;
    ~FailingHost();

    Velmark::IHostContext* context();

    /// Counts from 0 again. 0 lets no call fail.
    void arm(std::size_t call);
    std::size_t callCount() const { return m_callCount; }
    /// Whether this call, which is one more, is the one.
    bool fails() { return ++m_callCount == m_failsAt; }
    /// The same for a call by which the host says as well that there is nothing.
    bool failsToTell()
    {
        const bool isTheOne = fails();
        m_failedToTell = m_failedToTell || isTheOne;
        return isTheOne;
    }
    /// Whether nobody could know the failure for one.
    bool failedToTell() const { return m_failedToTell; }
    /// The objects that have come out and that somebody holds a reference to.
    std::size_t heldCount() const;

    /// The object of this host's for one of the host behind, which is kept; null for null.
    Velmark::FUnknown* wrap(Velmark::FUnknown* real);
    /// The object of the host behind; any other object itself.
    static Velmark::FUnknown* unwrap(Velmark::FUnknown* object);

    Velmark::int32 addDependent(Velmark::FUnknown* object, Velmark::FObject* dependent);
    Velmark::int32 removeDependent(Velmark::FUnknown* object, Velmark::FObject* dependent);

private:
    Velmark::IHostContext* m_host;
    std::map<Velmark::FUnknown*, Velmark::Counted<Velmark::FObject>> m_objects; ///< by the one that they stand for
    std::map<std::pair<Velmark::FUnknown*, Velmark::FObject*>, Velmark::Counted<Velmark::FObject>> m_dependents;
    std::size_t m_callCount = 0;
    std::size_t m_failsAt = 0;
    bool m_failedToTell = false;
};

} // namespace cadrel::host::tests
