// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Implements.h"

#include <functional>
#include <utility>
#include <vector>

namespace cadrel::host::tests {

/// A host's context in which some services and classes are missing, or are others.
class AlteredContext : public Velmark::Implements<AlteredContext, Velmark::FObject, Velmark::IHostContext> {
public:
    static constexpr const char* ClassName = "AlteredContext";

    /// The host is the one behind it, not owned; null for none.
    explicit AlteredContext(Velmark::IHostContext* host) : m_host(host) {}

    void hide(const Velmark::Identifier& id) { replace(id, nullptr); }
    /// The host's own again.
    void unhide(const Velmark::Identifier& id)
    {
        std::erase_if(m_altered, [&](const auto& altered) { return altered.first == id; });
    }
    /// What is given instead has to answer to the identifier.
    void replace(const Velmark::Identifier& id, Velmark::Counted<Velmark::FObject> object)
    {
        m_altered.push_back({id, [id, object = std::move(object)](void** out) {
                                 return object ? object->queryInterface(id, out) : Velmark::ResultFalse;
                             }});
    }
    /// The objects of a class are others from now on.
    void makeInstead(const Velmark::Identifier& classId, std::function<Velmark::Counted<Velmark::FObject>()> make)
    {
        m_altered.push_back({classId, [make = std::move(make)](void** out) {
                                 return make()->queryInterface(Velmark::FUnknown::iid, out);
                             }});
    }

    /// Its services are found in this way too, as with any host.
    Velmark::int32 queryInterface(const Velmark::Identifier& id, void** out) override
    {
        return Implements::queryInterface(id, out) == Velmark::ResultOk ? Velmark::ResultOk : getInterface(id, out);
    }
    Velmark::int32 getInterface(const Velmark::Identifier& id, void** out) override
    {
        for (const auto& [altered, give] : m_altered) {
            if (altered == id) {
                *out = nullptr;
                return give(out);
            }
        }
        if (m_host)
            return m_host->getInterface(id, out);
        *out = nullptr;
        return Velmark::ResultFalse;
    }

private:
    Velmark::IHostContext* m_host;
    std::vector<std::pair<Velmark::Identifier, std::function<Velmark::int32(void**)>>> m_altered;
};

} // namespace cadrel::host::tests
