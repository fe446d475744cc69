// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextListenerInterface.h"
#include "gui/look/LookAndFeel.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::core {
class CadrelerBase;
class ChangeContextNotificationBase;
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

class VideoProviderBase;

/// The window of Cadrel. It shows the model that its notifier names, and asks the engine for what is to be done.
class MainGui : public juce::Component, public core::ChangeContextListenerInterface {
public:
    MainGui();
    ~MainGui() override;

    /// None of these is owned; each outlives the window or is taken away with null.
    void setEngine(core::CadrelerBase* engine) { m_engine = engine; }
    /// Without a notifier there is no model either.
    void setNotifier(core::ChangeContextNotificationBase* notifier);
    void setVideoSource(VideoProviderBase* provider) { m_video = provider; }

    /// Null when no project is active.
    core::DataModel* model() const { return m_model; }

    void onChange(const core::ChangeContext& context) override;
    void paint(juce::Graphics& graphics) override;

private:
    juce::SharedResourcePointer<LookAndFeel> m_look; ///< all windows share it
    core::CadrelerBase* m_engine = nullptr;
    core::ChangeContextNotificationBase* m_notifier = nullptr;
    VideoProviderBase* m_video = nullptr;
    core::DataModel* m_model = nullptr;
};

} // namespace cadrel::gui
