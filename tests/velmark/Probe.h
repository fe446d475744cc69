// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Module.h"

namespace cadrel::tests {

/// What is left of a Probe after its end.
struct ProbeEnding {
    int times = 0;
    Velmark::int32 refCount = 0;
};

/// An object over FObject with three interfaces, the last of them without an identifier.
class Probe : public Velmark::Implements<Probe, Velmark::FObject, Velmark::IIdleHandler, Velmark::IActionHandler,
                                         Velmark::ICloseWindowNotification> {
public:
    static constexpr const char* ClassName = "Probe";

    explicit Probe(ProbeEnding* ending = nullptr) : m_ending(ending) {}
    Probe(const Probe&) = default;
    ~Probe() override
    {
        if (!m_ending)
            return;
        ++m_ending->times;
        m_ending->refCount = refCount();
    }

    Velmark::int32 onIdle() override { return 101; }
    Velmark::int32 handleAction(const char*, const char*, bool) override { return 102; }
    Velmark::int32 windowClosed(Velmark::IHostWindow*) override { return 103; }

private:
    ProbeEnding* m_ending;
};

/// A class over another in the same way.
class DeeperProbe : public Velmark::Implements<DeeperProbe, Probe, Velmark::IProjectEditHook> {
public:
    static constexpr const char* ClassName = "DeeperProbe";

    using Implements::Implements;

    Velmark::int32 projectEdited(Velmark::IProjectDocument*, Velmark::IEditTransaction*) override { return 104; }
};

} // namespace cadrel::tests
