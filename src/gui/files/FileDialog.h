// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "gui/files/EdlOffset.h"
#include "gui/input/TcInput.h"
#include "gui/look/PictureButton.h"
#include "gui/sheet/Sheet.h"
#include "gui/sheet/SheetLabel.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

class TakenFiles;

/// The sheet that takes EDL files into the old, the new or the change EDL. The files are chosen in the file box or dropped
/// on the sheet, and can be moved in time; nothing reaches the model before OK.
class FileDialog : public Sheet,
                   public TcInput::Listener,
                   public juce::Button::Listener,
                   public juce::FileDragAndDropTarget {
public:
    /// The list type while the sheet is closed.
    static constexpr std::int32_t NoList = -1;

    FileDialog();
    ~FileDialog() override;

    /// Called before files are taken into the change EDL, outside of the undo entry. When it returns false or throws, nothing is
    /// changed.
    void setBeforeChange(std::function<bool()> call) { m_beforeChange = std::move(call); }
    void showForOldList() { showFor(core::ListKind::Old); }
    void showForNewList() { showFor(core::ListKind::New); }
    void showForChangeList() { showFor(core::ListKind::Change); }
    /// Which list the files are for, a core::ListKind; NoList while the sheet is closed.
    std::int32_t listType() const { return m_listType; }
    /// Takes files as if they had been chosen in the file box, once the sheet shows. An alert may let everything happen, so
    /// the sheet may be gone when this returns.
    void takeFiles(const std::vector<std::string>& paths);

    /// Another model, or the same with another content, cancels what was begun. Neither is owned; the model may be null.
    /// `projectPath` is the file of the project.
    void setModel(core::DataModel* model, const std::wstring& projectPath);

    void setVisible(bool shouldBeVisible) override;
    void resized() override;
    void enablementChanged() override;
    void focusOfChildComponentChanged(FocusChangeType cause) override;
    void paintOverChildren(juce::Graphics& graphics) override;
    void buttonClicked(juce::Button* button) override;
    void timecodeChanged(TcInput& input) override;

    bool isInterestedInFileDrag(const juce::StringArray& files) override;
    void fileDragEnter(const juce::StringArray& files, int x, int y) override;
    void fileDragExit(const juce::StringArray& files) override;
    void filesDropped(const juce::StringArray& files, int x, int y) override;

protected:
    void confirm() override;
    void cancel() override;
    juce::Rectangle<int> panel() const override;
    juce::Component* firstFocus() override;

private:
    /// What belongs to one side of the events.
    struct Side {
        Side(core::ListSide listSide, const char* prefix, const std::wstring& offsetText);

        core::ListSide side;
        SheetLabel inLabel;
        SheetLabel outLabel;
        SheetLabel offsetLabel;
        TcInput offset{true};
        SheetLabel in; ///< where the files begin and end, with the offset
        SheetLabel out;
    };

    void addSide(Side& side);
    void placeSide(Side& side, int top);
    void setVisible(Side& side, bool isVisible);
    void showFor(std::int32_t listType);
    void browse();
    void refresh();
    void keepInBounds(Side& side);
    bool prepareChange();
    void showRange(Side& side, const juce::String& in, const juce::String& out);
    void reset();
    void setDropTarget(bool flag);

    std::function<bool()> m_beforeChange;
    std::int32_t m_listType = NoList;
    core::DataModel* m_model = nullptr;
    std::shared_ptr<TakenFiles> m_taken; ///< null while the sheet is closed
    std::wstring m_lastFolder;
    bool m_isDropTarget = false;
    bool m_isOkWaiting = false; ///< for the keyboard of the window
    Side m_destination;
    Side m_source; ///< only for the change EDL
    SheetLabel m_title;
    SheetRule m_line;
    SheetLabel m_edlLabel;
    juce::TextButton m_cancelButton;
    juce::TextButton m_okButton;
    PictureButton m_openFilesButton;
    juce::TextEditor m_fileList;
};

} // namespace cadrel::gui
