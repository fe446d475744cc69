// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <utility>

namespace cadrel::gui {

/// The outer frame of every call that comes from JUCE or from a notification: buttons, keys, the mouse, painting, timers,
/// changes. Neither of them may see an exception, and the host must not. A failure of what the user has done is told by one
/// alert after the outermost frame has ended, whatever else fails in it. All on the message thread.
///
/// An alert lets events through. So an object may be gone when `run` returns, and nothing of it may be touched then.
class Guard {
public:
    enum class Cause {
        User,  ///< the user has done something
        System ///< all else: a failure is dropped
    };

    /// Runs the function. False when it failed.
    template <class Function>
    static bool run(Cause cause, Function&& function) noexcept
    {
        const Frame frame(cause);
        try {
            std::forward<Function>(function)();
            return true;
        } catch (...) {
            frame.failed();
            return false;
        }
    }

    /// Tells the user something after the outermost frame, unless a failure or another message is to be told then. Within a
    /// frame that drops failures, and for an empty text, it does nothing. The text is in the user's language.
    static void tell(const std::wstring& text);

    /// What the user reads after the exception that is being handled; empty where that is nothing. Result::Cancelled and
    /// Result::NoProject tell nothing.
    static std::wstring messageOfFailure();

private:
    class Frame {
    public:
        explicit Frame(Cause cause);
        Frame(const Frame&) = delete;
        Frame& operator=(const Frame&) = delete;
        /// Tells of the failure when this was the outermost frame.
        ~Frame();

        /// Call it while the exception is being handled.
        void failed() const noexcept;

    private:
        Cause m_cause;
    };
};

/// What the user has done.
template <class Function>
bool guardUser(Function&& function) noexcept
{
    return Guard::run(Guard::Cause::User, std::forward<Function>(function));
}

/// Everything else.
template <class Function>
bool guardSystem(Function&& function) noexcept
{
    return Guard::run(Guard::Cause::System, std::forward<Function>(function));
}

} // namespace cadrel::gui
