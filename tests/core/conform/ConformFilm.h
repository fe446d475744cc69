// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "tests/core/TestProject.h"
#include "tests/core/conform/MemoryEngine.h"
#include "tests/core/edl/EventMaking.h"

#include <cstdint>

namespace cadrel::tests {

/// A film whose tracks an engine conforms.
struct ConformFilm {
    explicit ConformFilm(const core::Framerate& rate = core::Framerate(25, 0)) : project(rate) {}

    /// Adds a change event, numbered from 1.
    core::EventBase& carryOver(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        const auto number = static_cast<std::uint32_t>(model.changeEdl().size() + 1);
        model.changeEdl().add(makeEvent("CHANGE", srcIn, srcOut, dstIn, dstOut, number));
        return model.changeEdl().at(number - 1);
    }

    /// Adds a change event without usable timecodes.
    void carryOverNothing() { carryOver("25:00:00:00", "26:00:00:00", "25:00:00:00", "26:00:00:00"); }

    void switchMarkersOff()
    {
        core::Settings& settings = model.settings();
        settings.setCreateInsertMarkers(false);
        settings.setCreateDissolveWipeMarkers(false);
        settings.setCreateAudioSnippetMarkers(false);
        settings.setCreateAutomationWarningMarkers(false);
        settings.setCreateOverlapMarkers(false);
    }

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
