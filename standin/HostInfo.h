// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Implements.h"

namespace standin {

/// Says that this is the host that modules are made for.
class HostInfo : public Velmark::Implements<HostInfo, Velmark::FObject, Velmark::IHostInfo> {
public:
    static constexpr const char* ClassName = "HostInfo";

    const char* getName() override { return Velmark::HostName; }
};

} // namespace standin
