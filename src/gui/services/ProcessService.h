// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"

#include <memory>
#include <utility>

namespace cadrel::gui {

/// Access to an abstract service of the process. There is at most one object, which the host's side installs and
/// removes. `Service` derives from ProcessService<Service>.
template <class Service>
class ProcessService {
public:
    ProcessService(const ProcessService&) = delete;
    ProcessService& operator=(const ProcessService&) = delete;

    /// Throws Result::NotAvailable when there is none.
    static Service& instance()
    {
        if (!s_instance)
            throw util::Result::NotAvailable;
        return *s_instance;
    }
    /// Throws Result::NotAvailable when there is one already; the old one stays.
    static void install(std::unique_ptr<Service> service)
    {
        if (s_instance)
            throw util::Result::NotAvailable;
        s_instance = std::move(service);
    }
    /// Destroys it; does nothing when there is none.
    static void uninstall() { s_instance.reset(); }

protected:
    ProcessService() = default;
    ~ProcessService() = default;

private:
    inline static std::unique_ptr<Service> s_instance;
};

} // namespace cadrel::gui
