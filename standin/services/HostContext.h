// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Implements.h"

#include <vector>

namespace standin {

class Application;

/// The way to everything that this host has. The services are objects of their own, which `queryInterface` finds too.
class HostContext : public Velmark::Implements<HostContext, Velmark::FObject, Velmark::IHostContext> {
public:
    static constexpr const char* ClassName = "HostContext";

    /// Takes the services of the application, which have to be there already.
    explicit HostContext(Application& application);

    Velmark::int32 queryInterface(const Velmark::Identifier& id, void** out) override;
    Velmark::int32 getInterface(const Velmark::Identifier& id, void** out) override;

private:
    struct Service {
        Velmark::Identifier id;
        Velmark::Counted<Velmark::FUnknown> object;
    };

    template <class Interface>
    void offer(Interface& service);

    std::vector<Service> m_services;
};

} // namespace standin
