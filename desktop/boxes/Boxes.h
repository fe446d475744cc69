// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/boxes/Box.h"
#include "desktop/boxes/EventLoop.h"
#include "desktop/boxes/FileChoice.h"
#include "desktop/boxes/ProgressBox.h"
#include "standin/services/UserBoxes.h"

#include <chrono>
#include <functional>
#include <memory>
#include <vector>

namespace desktop {

/// The boxes of the host as sheets over its window. While one is open, nothing beneath it takes input, and it goes on painting.
class Boxes : public standin::UserBoxes {
public:
    /// Called with true before the first box comes up and with false after the last one has gone.
    using OpenChanged = std::function<void(bool isOpen)>;

    /// The boxes are children of `window`, over its child `beneath`. Both outlive this, and so does the loop.
    Boxes(EventLoop& loop, juce::Component& window, juce::Component& beneath, std::filesystem::path home);
    ~Boxes() override;

    void setOpenChanged(OpenChanged changed) { m_openChanged = std::move(changed); }
    bool isOpen() const { return !m_open.empty(); }

    using UserBoxes::ask;
    std::size_t ask(const std::u16string& message, const std::vector<std::u16string>& buttons,
                    std::size_t byReturn) override;
    std::vector<std::u16string> chooseFiles(const FileQuestion& question) override;
    /// A box comes up only when the operation takes a moment.
    bool showProgress(const Progress& progress) override;
    void endProgress() override;

private:
    using Clock = std::chrono::steady_clock;

    std::size_t ask(const juce::String& title, const juce::String& message, const juce::StringArray& buttons,
                    std::size_t byReturn);
    void show(Box& box);
    void hide(Box& box);
    void run(Box& box);
    /// Leaves the keyboard of the window to the box in front.
    void keepKeyboard();

    EventLoop& m_loop;
    juce::Component& m_window;
    juce::Component& m_beneath;
    FolderMemory m_folders;
    OpenChanged m_openChanged;
    std::vector<Box*> m_open;                ///< the one in front is the last
    std::unique_ptr<ProgressBox> m_progress; ///< null while none is shown
    Clock::time_point m_progressStart;
    Clock::time_point m_progressServed;
    bool m_hasProgress = false;
};

} // namespace desktop
