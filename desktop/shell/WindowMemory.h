// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <optional>

namespace desktop {

/// How the window is laid out. Sizes are JUCE's pixels, without the frame of a window manager.
struct WindowForm {
    static constexpr int LeastWidth = 800;
    static constexpr int LeastHeight = 560;
    static constexpr int Largest = 1 << 15;

    int width = 1560;
    int height = 1140;
    bool isMaximised = false;
    int tracksHeight = -1; ///< to which the user has dragged the tracks; below 0 for none

    bool operator==(const WindowForm&) const = default;
};

/// The room for a window on the screen.
struct WindowRoom {
    int width = 0;
    int height = 0;
    bool hasManager = false; ///< which puts a frame around the window and can maximise it
};

/// The form in which the window comes up: the remembered one, or the usual one where nothing is remembered. Both stay within the
/// room with the frame. The usual one is maximised where it doesn't fit.
WindowForm startForm(const std::optional<WindowForm>& remembered, const WindowRoom& room);

/// Keeps the form of the window for the next start in a file.
class WindowMemory {
public:
    /// Beside the list of recent files.
    static std::filesystem::path defaultFile();

    /// Nothing is kept for an empty path.
    explicit WindowMemory(std::filesystem::path file) : m_file(std::move(file)) {}

    /// Nothing where there is none, or where it isn't as this class has written it.
    std::optional<WindowForm> read() const;
    /// Writes what is another form than before. False when it can't be written.
    bool keep(const WindowForm& form);

private:
    std::filesystem::path m_file;
    std::optional<WindowForm> m_kept;
};

} // namespace desktop
