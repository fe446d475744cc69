// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Implements.h"

#include <vector>

namespace standin {

/// The way to everything that this host has. The services are objects of their own, which `queryInterface` finds too; the
/// objects that modules may have made are made here.
class HostContext : public Velmark::Implements<HostContext, Velmark::FObject, Velmark::IHostContext> {
public:
    static constexpr const char* ClassName = "HostContext";

    /// Offers a service under one of its interfaces.
    template <class Interface>
    void offer(Interface& service)
    {
        m_services.push_back({Interface::iid, Velmark::Counted<Velmark::FUnknown>::share(&service)});
    }

    Velmark::int32 queryInterface(const Velmark::Identifier& id, void** out) override;
    Velmark::int32 getInterface(const Velmark::Identifier& id, void** out) override;

private:
    struct Service {
        Velmark::Identifier id;
        Velmark::Counted<Velmark::FUnknown> object;
    };

    std::vector<Service> m_services;
};

} // namespace standin
