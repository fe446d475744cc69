// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/plugin/XConnection.h"

#include <memory>

namespace cadrel::host {

/// Sends the keys that a window of JUCE's gets and doesn't use on to the window around it, as the server has sent them.
/// JUCE keeps the events to itself, so that a connection of our own hears of them too:
///
///     X server > JUCE > components > sendOn() of what they haven't used
///              > here: waits until JUCE has been served
class UnusedKeys {
public:
    /// Of the window `ours`, which is inside `parent`.
    UnusedKeys(XConnection::Window ours, XConnection::Window parent);
    UnusedKeys(const UnusedKeys&) = delete;
    UnusedKeys& operator=(const UnusedKeys&) = delete;
    ~UnusedKeys();

    /// Sends the first press that is this key of JUCE's, by its code and its character or 0; and its release when that comes.
    void sendOn(int code, wchar_t character);
    /// Around each serving of JUCE: what it hasn't left over by the end it has used, but for the keys that it hands to no
    /// component, which are sent on.
    void beginServing();
    void endServing();

private:
    struct Keys;

    void receive();
    /// Sends the releases on whose presses were, and drops those of the others.
    void settleReleases();

    XConnection m_connection;
    std::unique_ptr<Keys> m_keys;
};

} // namespace cadrel::host
