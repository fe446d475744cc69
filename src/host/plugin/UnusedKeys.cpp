// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/UnusedKeys.h"

#include <juce_core/juce_core.h>

#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <X11/keysym.h>

#include <algorithm>
#include <clocale>
#include <cstddef>
#include <set>
#include <string>
#include <vector>

namespace cadrel::host {

namespace {

struct WaitingKey {
    ::XKeyEvent event;
    bool isServed; ///< JUCE has had it at the end of this serving
};

/// The locale of the user, in which JUCE takes the characters of keys from Xlib. A host needn't have taken it over.
class UserLocale {
public:
    UserLocale() : m_before(std::setlocale(LC_CTYPE, nullptr)) { std::setlocale(LC_CTYPE, ""); }
    UserLocale(const UserLocale&) = delete;
    UserLocale& operator=(const UserLocale&) = delete;
    ~UserLocale() { std::setlocale(LC_CTYPE, m_before.c_str()); }

private:
    std::string m_before;
};

/// What Xlib makes of a press.
struct LookedUpKey {
    KeySym symbol = NoSymbol;
    wchar_t character = 0; ///< 0 for none

    explicit LookedUpKey(::XKeyEvent event)
    {
        const UserLocale locale;
        char text[64] = {};
        XLookupString(&event, text, sizeof text - 1, &symbol, nullptr);
        character = *juce::CharPointer_UTF8(text);
    }
};

bool isWithin(KeySym symbol, KeySym first, KeySym last)
{
    return symbol >= first && symbol <= last;
}

/// The key of the same name that isn't on the keypad.
KeySym withoutKeypad(KeySym symbol)
{
    if (isWithin(symbol, XK_KP_Home, XK_KP_End))
        return symbol - XK_KP_Home + XK_Home;
    if (symbol == XK_KP_Insert)
        return XK_Insert;
    return symbol == XK_KP_Delete ? KeySym{XK_Delete} : symbol;
}

bool isLatin1(KeySym symbol)
{
    return symbol <= 0xff;
}

/// One that JUCE knows by its name, and not by a character.
bool isNamed(KeySym symbol)
{
    const KeySym named = withoutKeypad(symbol);
    return isWithin(named, XK_Home, XK_End) || named == XK_Insert || named == XK_Delete ||
           isWithin(named, XK_F1, XK_F35);
}

/// Whether a press is that key of JUCE's. The codes of its named keys end as their symbols do.
bool isKey(const ::XKeyEvent& event, int code, wchar_t character)
{
    constexpr KeySym LastByte = 0xff;
    const LookedUpKey key(event);
    if (key.symbol == XK_ISO_Left_Tab)
        return code == '\t';
    if (key.character != 0 || character != 0)
        return key.character == character;
    if (isLatin1(key.symbol))
        return key.symbol == static_cast<KeySym>(code);
    return isNamed(key.symbol) && (withoutKeypad(key.symbol) & LastByte) == (static_cast<KeySym>(code) & LastByte);
}

/// Whether a press means nothing by itself: it changes what the next one means, or moves the keyboard to another field.
bool isForOthers(KeySym symbol)
{
    return IsModifierKey(symbol) || symbol == XK_ISO_Left_Tab || isWithin(symbol, XK_Multi_key, XK_PreviousCandidate);
}

/// Whether JUCE hands a press to no component, so that none can have used it.
bool isLeftOut(const ::XKeyEvent& event)
{
    const LookedUpKey key(event);
    return key.character == 0 && !isLatin1(key.symbol) && !isNamed(key.symbol) && !isForOthers(key.symbol);
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
    ::Display* display;
    ::Window parent;
    std::vector<WaitingKey> waiting; ///< the oldest first
    std::set<unsigned int> sent;     ///< keycodes whose press was sent on, and whose release wasn't yet

    void sendPress(const ::XKeyEvent& press)
    {
        send(display, parent, press);
        sent.insert(press.keycode);
    }
    /// JUCE has dealt with the presses among the first so many, and used those that it hasn't left out.
    void settlePresses(std::ptrdiff_t count)
    {
        const auto end = waiting.begin() + count;
        const auto kept = std::remove_if(waiting.begin(), end, [this](const WaitingKey& key) {
            if (key.event.type == KeyPress && isLeftOut(key.event))
                sendPress(key.event);
            return key.event.type == KeyPress;
        });
        waiting.erase(kept, end);
    }
    void sendRelease(const ::XKeyEvent& release)
    {
        if (sent.erase(release.keycode) > 0)
            send(display, parent, release);
    }
};

UnusedKeys::UnusedKeys(XConnection::Window ours, XConnection::Window parent)
    : m_keys(std::make_unique<Keys>(Keys{m_connection.display(), parent, {}, {}}))
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
    const ::XKeyEvent press = found->event;
    const auto before = found - waiting.begin();
    waiting.erase(found);
    m_keys->settlePresses(before);
    m_keys->sendPress(press);
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
    m_keys->settlePresses(std::ranges::count_if(m_keys->waiting, &WaitingKey::isServed));
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
        m_keys->sendRelease(key->event);
        key = waiting.erase(key);
    }
}

} // namespace cadrel::host
