// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/Settings.h"
#include "gui/settings/SettingsDialog.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/WindowOnScreen.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace cadrel::tests {
namespace {

using juce::KeyPress;

/// The sheet in a window, with the real menus of its combo boxes.
class SettingsDialogOnScreenTest : public testing::Test {
protected:
    SettingsDialogOnScreenTest()
    {
        m_dialog.setSettings(&m_settings);
        m_window.show(m_dialog);
        m_window.serve();
    }

    juce::ComboBox& healing()
    {
        for (juce::Component* const component : m_dialog.getChildren()) {
            if (component->getName() == "m_healProcessingSelect")
                return dynamic_cast<juce::ComboBox&>(*component);
        }
        throw std::runtime_error("there is no combo box for healing");
    }
    static juce::Component* openMenu() { return juce::Component::getCurrentlyModalComponent(); }
    void openHealing()
    {
        healing().grabKeyboardFocus();
        m_window.press(KeyPress::returnKey);
        ASSERT_TRUE(m_window.serveUntil([] { return openMenu() != nullptr; }));
    }
    bool waitForNoMenu()
    {
        return m_window.serveUntil([] { return openMenu() == nullptr; });
    }

    WindowOnScreen m_window;
    TestProject m_project;
    core::Settings m_settings;
    gui::SettingsDialog m_dialog;
};

TEST_F(SettingsDialogOnScreenTest, StoresWhatIsChosenInAMenu)
{
    openHealing();

    openMenu()->keyPressed(KeyPress(KeyPress::downKey));
    openMenu()->keyPressed(KeyPress(KeyPress::returnKey));

    // Normal was chosen before.
    EXPECT_TRUE(m_window.serveUntil([this] { return m_settings.healMode() == core::HealMode::GapsWithoutInserts; }));
    EXPECT_TRUE(m_dialog.isVisible());
}

TEST_F(SettingsDialogOnScreenTest, ClosesAMenuAlone)
{
    openHealing();

    openMenu()->keyPressed(KeyPress(KeyPress::escapeKey));

    EXPECT_TRUE(waitForNoMenu());
    EXPECT_TRUE(m_dialog.isVisible());
    EXPECT_EQ(m_settings.healMode(), core::HealMode::Normal);
}

TEST_F(SettingsDialogOnScreenTest, ClosesItsMenuWhenItCloses)
{
    openHealing();

    m_dialog.setVisible(false);

    EXPECT_TRUE(waitForNoMenu());
    EXPECT_EQ(m_settings.healMode(), core::HealMode::Normal);
}

} // namespace
} // namespace cadrel::tests
