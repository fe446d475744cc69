// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/main/MainButton.h"

#include <string>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the buttons of the window may do with a model at the moment, and why not.
class MainCommands {
public:
    /// The model may be null, as without a project. It outlives this.
    explicit MainCommands(const core::DataModel* model) : m_model(model) {}

    bool allows(MainButton button) const;
    /// Whether the settings would give another list than the one that was generated.
    bool isListOutdated() const;
    /// What the button does, in the user's language.
    static std::wstring purpose(MainButton button);
    /// What the button does, or why it can't do that now, in the user's language.
    std::wstring tooltip(MainButton button) const;

private:
    /// Not translated; null when nothing is in the way.
    const wchar_t* obstacle(MainButton button) const;
    const wchar_t* obstacleOfGenerating() const;

    const core::DataModel* m_model;
};

} // namespace cadrel::gui
