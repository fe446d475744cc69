// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/Transport.h"

#include <utility>

namespace cadrel::host {

/// The host's transport. Times are seconds from the time origin. All operations throw Result::HostObjectMissing where the
/// host has no transport or no cycle, and the setters Result::HostCallFailed when it refuses.
class Transport {
public:
    /// May be given nothing.
    explicit Transport(Velmark::Counted<Velmark::ITransportControl> control) : m_control(std::move(control)) {}

    void getCycle(double& left, double& right) const;
    /// Throws Result::InvalidArgument for a left bound after the right one; nothing is set then.
    void setCycle(double left, double right) const;
    double position() const;
    void setPosition(double seconds) const;
    void stop() const;

private:
    Velmark::ITransportControl& control() const;
    Velmark::IParameter& parameter(const char* name) const;

    Velmark::Counted<Velmark::ITransportControl> m_control;
};

} // namespace cadrel::host
