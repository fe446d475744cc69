// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "gui/main/CutCommands.h"
#include "gui/main/MainGui.h"
#include "tests/gui/main/RecordingEngine.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/RecordingAlerts.h"
#include "tests/support/window/RecordingFileBox.h"
#include "tests/support/window/TestVideo.h"

#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Counts its listeners.
class CountingNotifier : public core::ChangeContextNotificationBase {
public:
    void addListener(core::ChangeContextListenerInterface* listener) override
    {
        ++listeners;
        ChangeContextNotificationBase::addListener(listener);
    }
    void removeListener(core::ChangeContextListenerInterface* listener) override
    {
        --listeners;
        ChangeContextNotificationBase::removeListener(listener);
    }

    int listeners = 0;
};

/// The window with the keyboard focus and no screen, and all that it works on.
class ShownWindow : public testing::Test {
protected:
    ShownWindow()
    {
        m_model.setNotifier(&m_notifier);
        m_gui->setEngine(&m_engine);
        m_gui->setNotifier(&m_notifier);
        m_gui->setVideoSource(m_video);
        m_window.addAndMakeVisible(*m_gui);
    }
    ~ShownWindow() override
    {
        m_gui.reset();
        m_model.setNotifier(nullptr);
    }

    core::EventList& list(int kind) { return core::listOf(m_model, kind); }
    /// Numbered events of a list, five seconds each, that touch. The sources of the change list are in the old list, and its
    /// destinations in the new one.
    void fill(int kind, std::uint32_t count)
    {
        std::vector<std::shared_ptr<core::EventBase>> events;
        const auto at = [](std::int32_t hour, std::uint32_t seconds) {
            return core::Timecode(hour, static_cast<std::int32_t>(seconds) / 60,
                                  static_cast<std::int32_t>(seconds) % 60, 0);
        };
        for (std::uint32_t number = 1; number <= count; ++number) {
            const std::uint32_t start = (number - 1) * 5;
            auto event = std::make_shared<core::EventBase>();
            event->setRollName(std::string("A00").append(std::to_string(number)));
            const std::int32_t source = kind == core::ListKind::Change ? 1 : 10;
            const std::int32_t destination = kind == core::ListKind::Old ? 1 : 2;
            event->setTimecodes(at(source, start), at(source, start + 5), at(destination, start),
                                at(destination, start + 5));
            event->setEventNumber(number);
            events.push_back(std::move(event));
        }
        list(kind).append(std::move(events));
    }
    /// All three lists with three events each, and the project active.
    void showThree()
    {
        for (const int kind : {0, 1, 2})
            fill(kind, 3);
        activate();
    }
    void activate() { m_notifier.notify(core::DataModelChangeContext(&m_model)); }
    void deactivate() { m_notifier.notify(core::DataModelChangeContext(nullptr)); }
    void notify(const core::ChangeContext& context) { m_notifier.notify(context); }

    juce::Component& controls() const { return *m_gui->getChildComponent(0); }
    template <class Control>
    Control& find(const juce::Component& parent, const std::string& name) const
    {
        for (juce::Component* const child : parent.getChildren()) {
            if (child->getName() != juce::String(name))
                continue;
            if (auto* const control = dynamic_cast<Control*>(child))
                return *control;
        }
        throw std::runtime_error("there is no " + name);
    }
    juce::Button& button(const std::string& name) const { return find<juce::Button>(controls(), name); }
    juce::Button& preview() const { return button("new component"); }
    juce::Button& source() const { return button("Source Toggle"); }
    juce::Button& destination() const { return button("Destination Toggle"); }
    gui::EventTable& table(const std::string& name) const
    {
        return find<gui::EventTable>(controls(), name + " Table List Box");
    }
    gui::EventTableModel& tableModel(const std::string& name) const
    {
        return dynamic_cast<gui::EventTableModel&>(*table(name).getModel());
    }
    juce::Label& label(const std::string& name) const { return find<juce::Label>(controls(), name); }
    /// Total, Selected, Invalid: "3 1 0".
    std::string counters(const std::string& list) const
    {
        return (label(list + "EdlNoEventsValue").getText() + " " + label(list + "EdlSelectedEventsValue").getText() +
                " " + label(list + "EdlInvalidEventsValue").getText())
            .toStdString();
    }
    gui::FileDialog& fileDialog() const { return find<gui::FileDialog>(*m_gui, "m_fileDialog"); }
    gui::TcEditDialog& editDialog() const { return sheet<gui::TcEditDialog>(); }
    gui::NewVideosDialog& videosDialog() const { return sheet<gui::NewVideosDialog>(); }
    gui::SettingsDialog& settingsDialog() const { return sheet<gui::SettingsDialog>(); }
    template <class Dialog>
    Dialog& sheet() const
    {
        for (juce::Component* const child : m_gui->getChildren()) {
            if (auto* const dialog = dynamic_cast<Dialog*>(child))
                return *dialog;
        }
        throw std::runtime_error("there is no such sheet");
    }
    gui::VideoDisplay& video() const { return find<gui::VideoDisplay>(controls(), "videodisplay"); }
    /// What the video preview says: "old time - new time".
    std::string times() const
    {
        return (find<juce::Label>(video(), "old time").getText() + " - " +
                find<juce::Label>(video(), "new time").getText())
            .toStdString();
    }
    void click(const std::string& name) { m_window.click(button(name)); }
    void select(const std::string& name, const std::vector<int>& rows)
    {
        bool isFirst = true;
        for (const int row : rows)
            table(name).selectRow(row, true, std::exchange(isFirst, false));
    }
    std::string selected(const std::string& name) const { return tableModel(name).getSelectedRows().toText(); }
    std::string property(core::PropertyKey::Type key) const
    {
        core::Variant value;
        m_model.getProperty(key, value);
        return value.toText();
    }

    using Calls = std::vector<std::string>;
    using Texts = std::vector<std::wstring>;

    TestProject m_project;
    juce::ScopedJuceInitialiser_GUI m_juce;
    juce::SharedResourcePointer<gui::LookAndFeel> m_look;
    RecordingUndo m_undo;
    RecordingAlerts m_alerts;
    RecordingFileBox m_box;
    CountingNotifier m_notifier;
    core::DataModel m_model;
    RecordingEngine m_engine{m_model};
    std::shared_ptr<TestVideo> m_video = std::make_shared<TestVideo>();
    FocusedWindow m_window{gui::MainGui::Width, gui::MainGui::Height};
    std::unique_ptr<gui::MainGui> m_gui = std::make_unique<gui::MainGui>();
};

} // namespace cadrel::tests
