// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainGui.h"

#include "core/model/DataModel.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <optional>
#include <vector>

using cadrel::core::ChangeContextListenerInterface;
using cadrel::core::ChangeContextNotificationBase;
using cadrel::core::DataModel;
using cadrel::core::DataModelChangeContext;
using cadrel::gui::LookAndFeel;
using cadrel::gui::MainGui;
using cadrel::tests::NoScreen;

namespace {

class Notifier : public ChangeContextNotificationBase {
public:
    void addListener(ChangeContextListenerInterface* listener) override
    {
        ++listeners;
        ChangeContextNotificationBase::addListener(listener);
    }
    void removeListener(ChangeContextListenerInterface* listener) override
    {
        --listeners;
        ChangeContextNotificationBase::removeListener(listener);
    }

    int listeners = 0;
};

class MainGuiTest : public testing::Test {
protected:
    const NoScreen m_noScreen;
    juce::ScopedJuceInitialiser_GUI m_juce;
    Notifier m_notifier;
    DataModel m_model;
};

} // namespace

TEST_F(MainGuiTest, HasTheModelThatItsNotifierNames)
{
    MainGui gui;
    EXPECT_EQ(gui.model(), nullptr);
    gui.setNotifier(&m_notifier);
    EXPECT_EQ(gui.model(), nullptr);

    m_notifier.notify(DataModelChangeContext(&m_model));
    EXPECT_EQ(gui.model(), &m_model);
    m_notifier.notify(DataModelChangeContext(nullptr));
    EXPECT_EQ(gui.model(), nullptr);
}

TEST_F(MainGuiTest, HasNoModelWithoutANotifier)
{
    MainGui gui;
    gui.setNotifier(&m_notifier);
    m_notifier.notify(DataModelChangeContext(&m_model));
    gui.setNotifier(nullptr);

    EXPECT_EQ(gui.model(), nullptr);
    EXPECT_EQ(m_notifier.listeners, 0);
    m_notifier.notify(DataModelChangeContext(&m_model));
    EXPECT_EQ(gui.model(), nullptr);
}

TEST_F(MainGuiTest, ListensToOneNotifierAtATime)
{
    Notifier other;
    MainGui gui;
    gui.setNotifier(&m_notifier);
    gui.setNotifier(&other);

    EXPECT_EQ(m_notifier.listeners, 0);
    EXPECT_EQ(other.listeners, 1);
    gui.setNotifier(nullptr);
}

TEST_F(MainGuiTest, SharesOneLookWithOtherWindowsWhichGoesWithTheLast)
{
    const auto isOurs = [] {
        return dynamic_cast<LookAndFeel*>(&juce::LookAndFeel::getDefaultLookAndFeel()) != nullptr;
    };
    EXPECT_FALSE(isOurs());
    std::optional<MainGui> first(std::in_place);
    std::optional<MainGui> second(std::in_place);
    EXPECT_EQ(&first->getLookAndFeel(), &second->getLookAndFeel());

    first.reset();
    EXPECT_TRUE(isOurs());
    second.reset();
    EXPECT_FALSE(isOurs());
}

TEST_F(MainGuiTest, ListensNoLongerWhenItHasGone)
{
    std::optional<MainGui> gui(std::in_place);
    gui->setNotifier(&m_notifier);
    EXPECT_EQ(m_notifier.listeners, 1);
    gui.reset();

    EXPECT_EQ(m_notifier.listeners, 0);
    m_notifier.notify(DataModelChangeContext(&m_model));
}
