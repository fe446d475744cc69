// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

#include <cstddef>

namespace Velmark {

class IPlugView;

/// The kinds of native parents: the `type` of IPlugView::attached.
struct ParentType {
    /// A window of the X Window System, whose number is passed in place of the pointer.
    static constexpr const char* X11Window = "X11Window";
};

/// The keys without a character: the `virtualKey` of IPlugView::onKeyDown and onKeyUp, which is 0
/// for all others.
struct VirtualKey {
    static constexpr int32 Backspace = 1;
    static constexpr int32 Tab = 2;
    static constexpr int32 Return = 3;
    static constexpr int32 Escape = 4;
    static constexpr int32 Insert = 5;
    static constexpr int32 Delete = 6;
    static constexpr int32 Home = 7;
    static constexpr int32 End = 8;
    static constexpr int32 PageUp = 9;
    static constexpr int32 PageDown = 10;
    static constexpr int32 Left = 11;
    static constexpr int32 Right = 12;
    static constexpr int32 Up = 13;
    static constexpr int32 Down = 14;
    /// F2 to F12 follow.
    static constexpr int32 F1 = 15;
    static constexpr int32 F12 = F1 + 11;
};

/// The modifier keys that are held, as bits: the `modifiers` of IPlugView::onKeyDown and onKeyUp.
struct KeyModifier {
    static constexpr int32 Shift = 1;
    static constexpr int32 Control = 2;
    static constexpr int32 Alt = 4;
};

/// A rectangle in physical pixels; right and bottom lie outside.
struct ViewRect {
    int32 left = 0;
    int32 top = 0;
    int32 right = 0;
    int32 bottom = 0;
};

static_assert(sizeof(ViewRect) == 16);
static_assert(offsetof(ViewRect, left) == 0 && offsetof(ViewRect, top) == 4);
static_assert(offsetof(ViewRect, right) == 8 && offsetof(ViewRect, bottom) == 12);

/// The host's side of a view. It has no identifier.
class IPlugFrame : public FUnknown {
public:
    /// The view asks for that size. If the host agrees, it calls the view's onSize.
    virtual int32 resizeView(IPlugView* view, const ViewRect& rect) = 0;
};

/// What the module puts into a window of the host. The host calls it, on the main thread. An input operation answers
/// ResultFalse when the view has dealt with it and the host is to do nothing more.
class IPlugView : public FUnknown {
public:
    static constexpr InterfaceId<IPlugView> iid{"5bc32507d06049eaa6151b522b755b29"};

    /// The view becomes visible in a native parent of the kind `type`.
    virtual int32 attached(void* parent, const char* type) = 0;
    /// The view is no longer visible.
    virtual int32 removed() = 0;
    virtual int32 idle() = 0;
    virtual int32 onWheel(float distance) = 0;
    /// The character, the number of a key without one, and the modifier keys held.
    virtual int32 onKeyDown(char16_t key, int32 virtualKey, int32 modifiers) = 0;
    virtual int32 onKeyUp(char16_t key, int32 virtualKey, int32 modifiers) = 0;
    virtual int32 getSize(ViewRect& rect) = 0;
    virtual int32 onSize(const ViewRect& rect) = 0;
    virtual int32 onFocus(bool state) = 0;
    /// The view keeps a reference; null takes the frame away.
    virtual int32 setFrame(IPlugFrame* frame) = 0;
    /// 1 when the user may change the size.
    virtual int32 canResize() = 0;
    /// Changes a size that the view can't have into one that it can.
    virtual int32 checkSizeConstraint(ViewRect& rect) = 0;
    /// 0 for a kind of native parent that the view can be attached to.
    virtual int32 isPlatformTypeSupported(const char* type) = 0;
};

} // namespace Velmark
