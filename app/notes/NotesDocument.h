// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/Generation.h"
#include "core/notes/ChangeNotes.h"

#include <cstdint>
#include <string>

namespace cadrel::app {

/// What all forms of the notes are made from.
struct NotesDocument {
    const core::ChangeNotes& notes;
    const core::EventList& oldEvents;
    const core::EventList& newEvents;
    core::HealingNotes healing;
    Cuts cuts;
    std::string rate; ///< its label
    std::int32_t matchBy;
    std::int32_t simplify; ///< frames within which trims were joined
    bool showsFeet;        ///< positions also in 35 mm feet and frames
    bool isLetter;         ///< the paper is Letter, else A4
};

} // namespace cadrel::app
