// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/window/FocusedWindow.h"

#include "tests/support/window/MessagePump.h"

#include <chrono>
#include <memory>
#include <stdexcept>

namespace cadrel::tests {

namespace {

/// Shows nothing anywhere.
class ScreenlessPeer : public juce::ComponentPeer {
public:
    using ComponentPeer::ComponentPeer;

    bool hasKeyboard = true;

    /// Of no window; JUCE only takes it for one.
    void* getNativeHandle() const override { return const_cast<ScreenlessPeer*>(this); }
    void setVisible(bool) override {}
    void setTitle(const juce::String&) override {}
    void setBounds(const juce::Rectangle<int>& bounds, bool) override
    {
        m_bounds = bounds;
        handleMovedOrResized();
    }
    juce::Rectangle<int> getBounds() const override { return m_bounds; }
    juce::Point<float> localToGlobal(juce::Point<float> place) override
    {
        return place + m_bounds.getPosition().toFloat();
    }
    juce::Point<float> globalToLocal(juce::Point<float> place) override
    {
        return place - m_bounds.getPosition().toFloat();
    }
    void setMinimised(bool) override {}
    bool isMinimised() const override { return false; }
    void setFullScreen(bool) override {}
    bool isFullScreen() const override { return false; }
    void setIcon(const juce::Image&) override {}
    bool contains(juce::Point<int> place, bool) const override { return m_bounds.withZeroOrigin().contains(place); }
    OptionalBorderSize getFrameSizeIfPresent() const override { return OptionalBorderSize(juce::BorderSize<int>()); }
    juce::BorderSize<int> getFrameSize() const override { return {}; }
    bool setAlwaysOnTop(bool) override { return true; }
    void toFront(bool) override {}
    void toBehind(ComponentPeer*) override {}
    bool isFocused() const override { return hasKeyboard; }
    void grabFocus() override {}
    void repaint(const juce::Rectangle<int>&) override {}
    void performAnyPendingRepaintsNow() override {}
    void setAlpha(float) override {}
    juce::StringArray getAvailableRenderingEngines() override { return {"none"}; }
    void textInputRequired(juce::Point<int>, juce::TextInputTarget&) override {}

private:
    juce::Rectangle<int> m_bounds;
};

} // namespace

FocusedWindow::FocusedWindow(int width, int height)
{
    setSize(width, height);
    setVisible(true);
    setWantsKeyboardFocus(true);
    addToDesktop(0);
    grabKeyboardFocus();
}

FocusedWindow::~FocusedWindow()
{
    removeFromDesktop();
}

juce::ComponentPeer* FocusedWindow::createNewPeer(int styleFlags, void*)
{
    return new ScreenlessPeer(*this, styleFlags);
}

void FocusedWindow::loseKeyboard()
{
    dynamic_cast<ScreenlessPeer&>(*getPeer()).hasKeyboard = false;
    getPeer()->handleFocusLoss();
}

void FocusedWindow::regainKeyboard()
{
    dynamic_cast<ScreenlessPeer&>(*getPeer()).hasKeyboard = true;
    getPeer()->handleFocusGain();
}

bool FocusedWindow::press(int keyCode, juce::ModifierKeys modifiers)
{
    const auto character = keyCode >= ' ' && keyCode < 0x7f ? static_cast<juce::juce_wchar>(keyCode) : 0;
    const bool isUsed = getPeer()->handleKeyPress(juce::KeyPress(keyCode, modifiers, character));
    pump();
    return isUsed;
}

void FocusedWindow::type(const std::string& text)
{
    for (const char character : text)
        press(character);
}

void FocusedWindow::click(const juce::Component& component)
{
    click(getLocalPoint(&component, component.getLocalBounds().getCentre()));
}

void FocusedWindow::click(juce::Point<int> place)
{
    const juce::WeakReference<juce::Component> self(this);
    const juce::ModifierKeys held(juce::ModifierKeys::leftButtonModifier);
    for (const juce::ModifierKeys buttons : {juce::ModifierKeys(), held, juce::ModifierKeys()}) {
        if (self)
            getPeer()->handleMouseEvent(juce::MouseInputSource::mouse, place.toFloat(), buttons,
                                        juce::MouseInputSource::defaultPressure,
                                        juce::MouseInputSource::defaultOrientation, juce::Time::currentTimeMillis());
    }
    pump();
}

void FocusedWindow::pump()
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(60);
    // The last message sends others, which come after it.
    for (int round = 0; round < 3; ++round) {
        const auto isDone = std::make_shared<bool>(false);
        juce::MessageManager::callAsync([isDone] { *isDone = true; });
        while (!*isDone) {
            if (std::chrono::steady_clock::now() > end)
                throw std::runtime_error("a message wasn't delivered");
            deliverMessages();
        }
    }
}

} // namespace cadrel::tests
