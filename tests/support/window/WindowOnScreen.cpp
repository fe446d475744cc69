// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/window/WindowOnScreen.h"

#include "tests/support/window/MessagePump.h"

#include <chrono>
#include <stdexcept>
#include <thread>

namespace cadrel::tests {

namespace {

constexpr auto Source = juce::MouseInputSource::InputSourceType::mouse;

} // namespace

WindowOnScreen::ManagedScreen::ManagedScreen()
{
    // JUCE takes for granted that they are there.
    introduceNames();
}

WindowOnScreen::WindowOnScreen()
{
    m_content.setSize(600, 400);
    m_content.setWantsKeyboardFocus(true);
    m_content.setOpaque(true);
    m_content.addToDesktop(0);
    m_content.setVisible(true);
    const bool hasFocus = serveUntil([this] {
        m_content.grabKeyboardFocus();
        return m_content.hasKeyboardFocus(true);
    });
    if (!hasFocus)
        throw std::runtime_error("the window got no focus");
    // JUCE gives the focus to the window once more when the server's word of it comes.
    serve();
}

WindowOnScreen::~WindowOnScreen() = default;

void WindowOnScreen::show(juce::Component& component)
{
    m_content.addAndMakeVisible(component);
}

bool WindowOnScreen::press(const juce::KeyPress& key)
{
    const bool isUsed = peer().handleKeyPress(key);
    serve();
    return isUsed;
}

void WindowOnScreen::type(const juce::String& text)
{
    for (const juce::juce_wchar letter : text)
        press(juce::KeyPress(static_cast<int>(letter), {}, letter));
}

void WindowOnScreen::click(juce::Component& component)
{
    const auto place = m_content.getLocalPoint(&component, component.getLocalBounds().getCentre()).toFloat();
    const auto left = juce::ModifierKeys(juce::ModifierKeys::leftButtonModifier);
    const auto now = juce::Time::currentTimeMillis();
    for (const juce::ModifierKeys& buttons : {juce::ModifierKeys(), left, juce::ModifierKeys()})
        peer().handleMouseEvent(Source, place, buttons, juce::MouseInputSource::defaultPressure,
                                juce::MouseInputSource::defaultOrientation, now);
    serve();
}

void WindowOnScreen::wheel(juce::Component& component, float deltaY)
{
    const auto place = m_content.getLocalPoint(&component, component.getLocalBounds().getCentre()).toFloat();
    juce::MouseWheelDetails details{};
    details.deltaY = deltaY;
    peer().handleMouseWheel(Source, place, juce::Time::currentTimeMillis(), details);
    serve();
}

void WindowOnScreen::serve()
{
    pumpMessages();
}

bool WindowOnScreen::serveUntil(const std::function<bool()>& condition)
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(60);
    while (std::chrono::steady_clock::now() < end) {
        serve();
        if (condition())
            return true;
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
    return false;
}

juce::ComponentPeer& WindowOnScreen::peer()
{
    return *m_content.getPeer();
}

} // namespace cadrel::tests
