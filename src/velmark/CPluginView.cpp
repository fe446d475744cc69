// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/CPluginView.h"

namespace Velmark {

int32 CPluginView::attached(void* parent, const char* /*type*/)
{
    m_systemWindow = parent;
    attachedToParent();
    return ResultOk;
}

int32 CPluginView::removed()
{
    m_systemWindow = nullptr;
    removedFromParent();
    return ResultOk;
}

int32 CPluginView::onWheel(float /*distance*/)
{
    return ResultOk;
}

int32 CPluginView::onKeyDown(char16_t /*key*/, int32 /*virtualKey*/, int32 /*modifiers*/)
{
    return ResultOk;
}

int32 CPluginView::onKeyUp(char16_t /*key*/, int32 /*virtualKey*/, int32 /*modifiers*/)
{
    return ResultOk;
}

int32 CPluginView::getSize(ViewRect& rect)
{
    rect = m_rect;
    return ResultOk;
}

int32 CPluginView::onSize(const ViewRect& rect)
{
    m_rect = rect;
    return ResultOk;
}

int32 CPluginView::onFocus(bool /*state*/)
{
    return ResultOk;
}

int32 CPluginView::setFrame(IPlugFrame* frame)
{
    m_plugFrame = Counted<IPlugFrame>::share(frame);
    return ResultOk;
}

int32 CPluginView::checkSizeConstraint(ViewRect& /*rect*/)
{
    return ResultOk;
}

int32 CPluginView::isPlatformTypeSupported(const char* /*type*/)
{
    return ResultOk;
}

} // namespace Velmark
