// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <csignal>
#include <cstddef>
#include <iosfwd>
#include <string>

namespace standin {

/// Where a host without windows speaks to its user: messages, a line each. If lines can be redrawn, there is a progress
/// line below them, which the next message replaces. What could control the terminal is shown as "?".
class Terminal {
public:
    /// What the progress line is cut to, in characters, so that it doesn't wrap on an ordinary terminal.
    static constexpr std::size_t LineLength = 79;

    /// Shows nothing and is never interrupted.
    Terminal() = default;
    /// `canRedraw` says that the stream is a terminal. `interrupted`, which may be null, is nonzero from when the user
    /// wants to stop what goes on; the program's signal handler sets it. Both have to outlive the terminal.
    Terminal(std::ostream& out, bool canRedraw, const volatile std::sig_atomic_t* interrupted = nullptr,
             std::size_t lineLength = LineLength)
        : m_out(&out), m_canRedraw(canRedraw), m_interrupted(interrupted), m_lineLength(lineLength)
    {
    }

    bool isInterrupted() const { return m_interrupted && *m_interrupted != 0; }

    /// Line breaks in the text stay.
    void writeMessage(const std::u16string& text);
    /// Draws the progress line anew. Nothing is written where lines can't be redrawn.
    void drawProgress(const std::u16string& text);
    void eraseProgress();

private:
    std::ostream* m_out = nullptr;
    bool m_canRedraw = false;
    const volatile std::sig_atomic_t* m_interrupted = nullptr;
    std::size_t m_lineLength = LineLength;
    bool m_hasProgress = false;
};

} // namespace standin
