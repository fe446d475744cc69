// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextListenerInterface.h"
#include "gui/edit/TcEditDialog.h"
#include "gui/files/FileDialog.h"
#include "gui/look/LookAndFeel.h"
#include "gui/main/MainControls.h"
#include "gui/main/PlannedRun.h"
#include "gui/settings/SettingsDialog.h"
#include "gui/table/EventTableModel.h"
#include "gui/video/NewVideosDialog.h"
#include "util/Result.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::core {
class ActionChangeContext;
class CadrelerBase;
class ChangeContextNotificationBase;
class DataModel;
class Timecode;
} // namespace cadrel::core

namespace cadrel::gui {

class AlertWindowBase;
class VideoProviderBase;

/// The window of Cadrel. It shows the model that its notifier names, asks the engine for what is to be done, and draws itself
/// anew when it is told of a change:
///
///     a button, a key  >  model or engine  >  notifier  >  onChange  >  tables, counters, timeline, pictures
///
/// What it decides is in the plain classes beside it. All controls are in one child, over which the dialogs lie.
class MainGui : public juce::Component,
                public core::ChangeContextListenerInterface,
                private juce::ComponentListener,
                private EventTableModel::Listener,
                private juce::Button::Listener {
public:
    static constexpr int Width = 1300;
    static constexpr int Height = 750;

    MainGui();
    /// Ends a preview that is on.
    ~MainGui() override;

    /// Engine and notifier aren't owned; each outlives the window or is taken away with null.
    void setEngine(core::CadrelerBase* engine) { m_engine = engine; }
    /// Without a notifier there is no model either.
    void setNotifier(core::ChangeContextNotificationBase* notifier);
    /// Where the pictures of the video preview come from; null for nowhere.
    void setVideoSource(const std::shared_ptr<VideoProviderBase>& provider);

    /// Null when no project is active.
    core::DataModel* model() const { return m_model; }

    /// Selects the event of the change EDL with these SRC IN and DST IN, and no other, as the user does. False where there is
    /// none, and where he couldn't do so now.
    bool selectChange(const core::Timecode& srcIn, const core::Timecode& dstIn);

    void onChange(const core::ChangeContext& context) override;
    void paint(juce::Graphics& graphics) override;
    void resized() override;
    bool keyPressed(const juce::KeyPress& key) override;
    void focusGained(FocusChangeType cause) override;
    void focusOfChildComponentChanged(FocusChangeType cause) override;

private:
    // What happens; in MainGui.cpp.

    void buttonClicked(juce::Button* button) override;
    void componentVisibilityChanged(juce::Component& component) override;
    void componentEnablementChanged(juce::Component& component) override;
    void selectionChanged(EventTableModel& model) override;
    void sortChanged(EventTableModel& model) override;
    void editRequested(const std::shared_ptr<core::EventBase>& event, EventTableModel& model,
                       juce::Point<int> position) override;
    void carryOut(MainButton button);

    // What is shown; in MainGuiChanges.cpp.

    void handle(const core::ChangeContext& context);
    void setModel(core::DataModel* model);
    void closeSheets();
    /// Empty where the host can't tell it.
    std::wstring projectPath();
    void letGoOfModel();
    void showModel();
    void showList(std::int32_t listKind);
    void listReplaced(std::int32_t listKind);
    /// Which events of the cuts the selected ones come from, in the tables, on the timeline and in the pictures.
    void showSelection();
    void showVideo();
    /// What the dialog of the videos works on.
    void showVideoList();
    /// Puts the preview button and those beside it into the state of the model.
    void showPreviewState();
    /// Which buttons can be used, and what to do first.
    void showCommands();
    void actionEnded(const core::ActionChangeContext& end);
    void focusChangeTable();
    std::array<Sheet*, 4> sheets() { return {&m_settingsDialog, &m_videosDialog, &m_fileDialog, &m_editDialog}; }

    // What the user asks for; in MainGuiCommands.cpp.

    void addFiles(std::int32_t listKind);
    void takeDroppedFiles(std::int32_t listKind, const std::vector<std::string>& paths);
    void generate();
    void clear(std::int32_t listKind);
    void save();
    void start();
    /// How a run is to treat what the change list doesn't carry.
    enum class Protection {
        Plain, ///< as the list says
        Kept,
        None, ///< there is no run
    };
    /// What the user was asked before a run, and what he wants; empty for what wasn't asked.
    struct Answers {
        PlannedRun planned;
        std::wstring repetition;
        std::wstring loss;
        Protection protection = Protection::Plain;
    };
    /// False when the model is another one now.
    bool endPreviewForRun();
    /// Asks the user one question, or requests the run that he was asked about where nothing is left to ask. True when that was
    /// all: there is a run, or none can begin any more.
    bool askOrRequestRun(Answers& answers);
    Protection answerTo(PlannedRun& planned, const std::wstring& question, bool canKeep);
    /// Whether the user wants the run though it doesn't go on from where the sound stands.
    bool mayRepeat(PlannedRun& planned, const std::wstring& question);
    /// False when no run can begin any more. This may be gone then.
    bool askBeforeRun(PlannedRun& planned, const std::function<void(AlertWindowBase& alerts)>& ask);
    void requestRun(Protection protection, const core::ProtectedRun& run);
    util::Result::Type requestKeptRun(const core::ProtectedRun& run);
    void noteRun();
    void switchPreview(bool isOn);
    /// False when the model is another one now.
    bool stopPreview();
    void showPreview();
    void cycleToSelection();
    /// What the engine answers of a preview; the user is told of it once until the preview is switched on again.
    void tellOfPreview(const std::function<std::wstring()>& request);
    std::uint32_t previewOptions() const { return m_controls.isOn(MainButton::Destination) ? 1 : 0; }

    EventTableModel* changeTable() { return m_controls.panel(core::ListKind::Change).model(); }
    EventTableModel::Events selectedChanges();
    void updateEnablement();

    juce::SharedResourcePointer<LookAndFeel> m_look; ///< all windows share it
    core::CadrelerBase* m_engine = nullptr;
    core::ChangeContextNotificationBase* m_notifier = nullptr;
    core::DataModel* m_model = nullptr;
    bool m_isRunRequested = false; ///< until it has ended or was dropped
    bool m_hadFocus = false;       ///< when the user asked for the run
    bool m_isPreviewTold = false;  ///< the user knows why the preview that is on shows nothing
    bool m_isModelChanging = false;
    std::wstring m_saveFolder;
    MainControls m_controls;
    SettingsDialog m_settingsDialog;
    NewVideosDialog m_videosDialog;
    FileDialog m_fileDialog;
    TcEditDialog m_editDialog;
    juce::TooltipWindow m_tooltips;
};

} // namespace cadrel::gui
