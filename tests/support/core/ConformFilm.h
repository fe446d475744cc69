// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/MemoryEngine.h"
#include "tests/support/core/NoMarkers.h"
#include "tests/support/core/TestProject.h"

#include <cstdint>
#include <deque>
#include <string>

namespace cadrel::tests {

/// A film whose tracks an engine conforms.
struct ConformFilm {
    explicit ConformFilm(const core::Framerate& rate = core::Framerate(25, 0)) : project(rate) {}

    core::EventList& oldEvents() { return model.oldEdl(); }
    core::EventList& newEvents() { return model.newEdl(); }
    core::Settings& settings() { return model.settings(); }
    std::deque<MemoryTrack>& tracks() { return engine.tracks(); }
    MemoryTrack& addTrack(const std::wstring& name, bool isAudio = true) { return engine.addTrack(name, isAudio); }

    /// Adds a change event, numbered from 1.
    core::EventBase& carryOver(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        const auto number = static_cast<std::uint32_t>(model.changeEdl().size() + 1);
        model.changeEdl().add(makeEvent("CHANGE", srcIn, srcOut, dstIn, dstOut, number));
        return model.changeEdl().at(number - 1);
    }

    /// Adds a change event without usable timecodes.
    void carryOverNothing() { carryOver("25:00:00:00", "26:00:00:00", "25:00:00:00", "26:00:00:00"); }

    void switchMarkersOff() { tests::switchMarkersOff(settings()); }

    /// Requests a run and lets it happen.
    util::Result::Type conform()
    {
        const util::Result::Type result = engine.startCadrel();
        return result != util::Result::Ok ? result : engine.onIdle();
    }

    TestProject project;
    core::DataModel model;
    MemoryEngine engine{model};
};

} // namespace cadrel::tests
