// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainGui.h"

#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextNotificationBase.h"

namespace cadrel::gui {

namespace {

const juce::Colour Background(0xff2b2c2d);

} // namespace

MainGui::MainGui()
{
    setOpaque(true);
    setWantsKeyboardFocus(true);
}

MainGui::~MainGui()
{
    if (m_notifier)
        m_notifier->removeListener(this);
}

void MainGui::setNotifier(core::ChangeContextNotificationBase* notifier)
{
    if (m_notifier)
        m_notifier->removeListener(this);
    m_notifier = notifier;
    if (m_notifier)
        m_notifier->addListener(this);
    else
        onChange(core::DataModelChangeContext(nullptr));
}

void MainGui::onChange(const core::ChangeContext& context)
{
    if (context.type != core::ChangeContext::DataModelChanged)
        return;
    m_model = static_cast<const core::DataModelChangeContext&>(context).dataModel;
    repaint();
}

void MainGui::paint(juce::Graphics& graphics)
{
    graphics.fillAll(Background);
}

} // namespace cadrel::gui
