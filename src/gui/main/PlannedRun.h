// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/protect/ProtectedRun.h"
#include "core/serialize/ByteArchive.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"

#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// The run that the user is asked about. What the questions need is worked out once, and anew when it has changed while a box
/// was open.
class PlannedRun {
public:
    /// To be called before a box opens.
    void remember(const core::DataModel& model);
    /// To be called when it has closed: forgets what was worked out unless the model is as it was.
    void lookAgain(const core::DataModel& model);

    /// What RepeatQuestion asks of the model; empty for nothing.
    const std::wstring& repetition(const core::DataModel& model);
    /// The run of the model's list, and of the material that stands on the tracks now. Throws what ProtectedRun throws.
    const core::ProtectedRun& run(const core::DataModel& model, const std::vector<core::SecondsRange>& material);

private:
    void forget();

    core::serialize::ByteArchive m_state; ///< of the model when it was remembered; empty before
    std::optional<std::wstring> m_repetition;
    std::optional<core::ProtectedRun> m_run;
    std::vector<core::SecondsRange> m_material; ///< of the run
    core::Framerate m_framerate;                ///< of all that was worked out
};

} // namespace cadrel::gui
