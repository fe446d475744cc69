// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/apply/ApplyFacts.h"
#include "app/edl/ProjectClock.h"
#include "app/notes/NotesDocument.h"

namespace cadrel::app {

/// The change notes of both cuts of a run, with what the run did to the sound at each change.
class ApplyNotes {
public:
    /// After a run of two cuts; what is given outlives this. Throws nothing of its own.
    ApplyNotes(const ApplyFacts& facts, const ProjectClock& clock, const NotesLayout& layout);
    ApplyNotes(const ApplyNotes&) = delete;
    ApplyNotes& operator=(const ApplyNotes&) = delete;

    const NotesDocument& document() const { return m_document; }

private:
    const SettingsReport m_settings;
    const core::ChangeNotes m_notes;
    const core::SoundNotes m_soundNotes;
    const SoundDocument m_sound;
    const NotesDocument m_document;
};

} // namespace cadrel::app
