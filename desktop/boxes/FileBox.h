// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/boxes/Box.h"
#include "desktop/boxes/FileChoice.h"

#include <filesystem>
#include <functional>
#include <string>
#include <vector>

namespace desktop {

/// The folders and files of the machine, from which the user takes some to be opened, or names the one to be saved. A name gets its
/// extension, and a file that is there already is only overwritten when the user says so.
class FileBox : public Box, private juce::FileBrowserListener, private juce::FileFilter {
public:
    /// Asks the user a question over this box and answers whether he says yes. The last text is the label of that button.
    using AskBack = std::function<bool(const juce::String& question, const juce::String& yes)>;
    /// Tells the user something over this box.
    using Tell = std::function<void(const juce::String& message)>;

    FileBox(const standin::UserBoxes::FileQuestion& question, const std::filesystem::path& folder, AskBack askBack,
            Tell tell);
    ~FileBox() override;

    /// None when he has cancelled.
    const std::vector<std::filesystem::path>& files() const { return m_files; }

private:
    void confirm() override { accept(); }
    void cancel() override;
    juce::Component* firstFocus() override { return m_name; }
    void layOut() override;

    bool isFileSuitable(const juce::File& file) const override;
    bool isDirectorySuitable(const juce::File& file) const override;

    void selectionChanged() override;
    void fileClicked(const juce::File&, const juce::MouseEvent&) override {}
    void fileDoubleClicked(const juce::File& file) override;
    void browserRootChanged(const juce::File&) override {}

    void findParts();
    void setColours();
    void propose(const juce::String& name);
    juce::File named() const;
    void accept();
    void open();
    void save();

    FileFilters m_filters;
    bool m_isSave;
    AskBack m_askBack;
    Tell m_tell;
    juce::FileBrowserComponent m_browser;
    juce::TextEditor* m_name = nullptr;                        ///< in the browser
    juce::DirectoryContentsDisplayComponent* m_list = nullptr; ///< in the browser
    juce::TextButton m_accept;
    juce::TextButton m_cancel{"Cancel"};
    std::vector<std::filesystem::path> m_files;
};

} // namespace desktop
