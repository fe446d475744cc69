// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/Implements.h"
#include "velmark/PlugView.h"

namespace Velmark {

/// A view that does nothing but remember what the host says: its rectangle, its native parent and its frame. A derived
/// class fills it.
class CPluginView : public Implements<CPluginView, FObject, IPlugView> {
public:
    static constexpr const char* ClassName = "CPluginView";

    explicit CPluginView(const ViewRect& rect) : m_rect(rect) {}

    int32 attached(void* parent, const char* type) override;
    int32 removed() override;
    int32 idle() override { return ResultOk; }
    int32 onWheel(float distance) override;
    int32 onKeyDown(char16_t key, int32 virtualKey, int32 modifiers) override;
    int32 onKeyUp(char16_t key, int32 virtualKey, int32 modifiers) override;
    int32 getSize(ViewRect& rect) override;
    int32 onSize(const ViewRect& rect) override;
    int32 onFocus(bool state) override;
    int32 setFrame(IPlugFrame* frame) override;
    int32 canResize() override { return 1; }
    int32 checkSizeConstraint(ViewRect& rect) override;
    int32 isPlatformTypeSupported(const char* type) override;

protected:
    /// After systemWindow() was set, and after it was cleared.
    virtual void attachedToParent() {}
    virtual void removedFromParent() {}

    const ViewRect& rect() const { return m_rect; }
    /// The native parent; null while the view isn't attached.
    void* systemWindow() const { return m_systemWindow; }
    /// Null without one.
    IPlugFrame* plugFrame() const { return m_plugFrame.get(); }

private:
    ViewRect m_rect;
    void* m_systemWindow = nullptr;
    Counted<IPlugFrame> m_plugFrame;
};

} // namespace Velmark
