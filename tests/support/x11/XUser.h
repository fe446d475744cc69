// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string_view>

struct _XDisplay;

namespace cadrel::tests {

/// Mouse and keyboard of the screen, moved by a test. Places are pixels of the screen.
class XUser {
public:
    XUser();
    XUser(const XUser&) = delete;
    XUser& operator=(const XUser&) = delete;
    ~XUser();

    /// Puts a keysym on a key that has had none, for as long as the server runs.
    void addKey(unsigned long key);

    void moveTo(int x, int y);
    /// Where the mouse is, with the key of a keysym held where that isn't 0.
    void click(unsigned long held = 0);
    void doubleClick();
    /// From where the mouse is to another place.
    void dragTo(int x, int y);
    void rightClick();
    /// One notch.
    void wheelUp();
    void wheelDown();
    /// By keysym, with the key of another keysym held where that isn't 0.
    void press(unsigned long key, unsigned long held = 0, unsigned long heldToo = 0);
    /// Characters of ASCII that are on the keyboard, capitals with Shift.
    void type(std::string_view text);
    /// The key stays down until it is released.
    void hold(unsigned long key);
    void release(unsigned long key);
    /// Which window has the keyboard.
    unsigned long focus() const;
    void setFocus(unsigned long window);

private:
    void button(unsigned int number);
    void change(unsigned long key, bool isDown);

    _XDisplay* m_display;
};

} // namespace cadrel::tests
