// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/UnusedKeys.h"

#include <juce_core/juce_core.h>

#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <X11/keysym.h>

#include <algorithm>
#include <set>
#include <vector>

namespace cadrel::host {

namespace {

struct WaitingKey {
    ::XKeyEvent event;
    bool isServed; ///< JUCE has had it at the end of this serving
};

/// The key of the same name that isn't on the keypad.
KeySym withoutKeypad(KeySym symbol)
{
    if (symbol >= XK_KP_Home && symbol <= XK_KP_End)
        return symbol - XK_KP_Home + XK_Home;
    if (symbol == XK_KP_Insert)
        return XK_Insert;
    return symbol == XK_KP_Delete ? KeySym{XK_Delete} : symbol;
}

/// JUCE takes a key's character from Xlib in the same way. The codes of its keys without one end as their symbols do.
bool isKey(::XKeyEvent event, int code, wchar_t character)
{
    constexpr KeySym NamedKeys = 0xff00;
    constexpr KeySym LastByte = 0xff;
    char text[64] = {};
    KeySym symbol = NoSymbol;
    XLookupString(&event, text, sizeof text - 1, &symbol, nullptr);
    const wchar_t found = *juce::CharPointer_UTF8(text);
    if (found != 0 || character != 0)
        return found == character;
    const KeySym named = withoutKeypad(symbol);
    return (named & NamedKeys) == NamedKeys && (named & LastByte) == (static_cast<KeySym>(code) & LastByte);
}

bool isPressOf(const WaitingKey& key, unsigned int keycode)
{
    return key.event.type == KeyPress && key.event.keycode == keycode;
}

void send(::Display* display, ::Window window, const ::XKeyEvent& key)
{
    ::XEvent event = {};
    event.xkey = key;
    event.xkey.window = window;
    event.xkey.subwindow = 0;
    XSendEvent(display, window, True, key.type == KeyPress ? KeyPressMask : KeyReleaseMask, &event);
    XFlush(display);
}

} // namespace

struct UnusedKeys::Keys {
    std::vector<WaitingKey> waiting; ///< the oldest first
    std::set<unsigned int> sent;     ///< keycodes whose press was sent on, and whose release wasn't yet
};

UnusedKeys::UnusedKeys(XConnection::Window ours, XConnection::Window parent)
    : m_parent(parent), m_keys(std::make_unique<Keys>())
{
    if (!m_connection.isOpen())
        return;
    XSelectInput(m_connection.display(), ours, KeyPressMask | KeyReleaseMask);
    XSync(m_connection.display(), False);
}

UnusedKeys::~UnusedKeys() = default;

void UnusedKeys::sendOn(int code, wchar_t character)
{
    if (!m_connection.isOpen())
        return;
    // By the time of its answer, the server has sent us what it has sent JUCE.
    XSync(m_connection.display(), False);
    receive();
    std::vector<WaitingKey>& waiting = m_keys->waiting;
    const auto found = std::ranges::find_if(waiting, [&](const WaitingKey& key) {
        return key.event.type == KeyPress && isKey(key.event, code, character);
    });
    if (found == waiting.end())
        return;
    send(m_connection.display(), m_parent, found->event);
    m_keys->sent.insert(found->event.keycode);
    waiting.erase(found);
    settleReleases();
}

void UnusedKeys::beginServing()
{
    if (!m_connection.isOpen())
        return;
    receive();
    for (WaitingKey& key : m_keys->waiting)
        key.isServed = true;
}

void UnusedKeys::endServing()
{
    std::erase_if(m_keys->waiting, [](const WaitingKey& key) { return key.isServed && key.event.type == KeyPress; });
    settleReleases();
}

void UnusedKeys::receive()
{
    while (XPending(m_connection.display()) > 0) {
        ::XEvent event;
        XNextEvent(m_connection.display(), &event);
        if (event.type == KeyPress || event.type == KeyRelease)
            m_keys->waiting.push_back({event.xkey, false});
        else if (event.type == MappingNotify)
            XRefreshKeyboardMapping(&event.xmapping);
    }
    settleReleases();
}

void UnusedKeys::settleReleases()
{
    std::vector<WaitingKey>& waiting = m_keys->waiting;
    for (auto key = waiting.begin(); key != waiting.end();) {
        const unsigned int keycode = key->event.keycode;
        const bool pressIsWaiting =
            std::any_of(waiting.begin(), key, [&](const WaitingKey& earlier) { return isPressOf(earlier, keycode); });
        if (key->event.type == KeyPress || pressIsWaiting) {
            ++key;
            continue;
        }
        if (m_keys->sent.erase(keycode) > 0)
            send(m_connection.display(), m_parent, key->event);
        key = waiting.erase(key);
    }
}

} // namespace cadrel::host
