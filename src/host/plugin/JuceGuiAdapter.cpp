// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/JuceGuiAdapter.h"

#include "host/border/HostFailure.h"
#include "host/plugin/HostKeys.h"
#include "host/plugin/XConnection.h"
#include "velmark/Context.h"
#include "velmark/UserInterface.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <utility>

namespace cadrel::host {

using namespace Velmark;

namespace {

/// That of the content.
const juce::Colour Background(0xff070c10);

constexpr ViewRect MinimumRect{0, 0, JuceGuiAdapter::MinimumWidth, JuceGuiAdapter::MinimumHeight};

int32 widthOf(const ViewRect& rect)
{
    return rect.right - rect.left;
}

int32 heightOf(const ViewRect& rect)
{
    return rect.bottom - rect.top;
}

XConnection::Window windowOf(const void* handle)
{
    return static_cast<XConnection::Window>(reinterpret_cast<std::uintptr_t>(handle));
}

/// Whether a key is one of the host's: its letter with Control and with or without Shift.
bool isEditKey(const juce::KeyPress& key, char letter, bool withShift)
{
    const juce::ModifierKeys modifiers = key.getModifiers();
    return juce::CharacterFunctions::toLowerCase(static_cast<juce::juce_wchar>(key.getKeyCode())) ==
               static_cast<juce::juce_wchar>(letter) &&
           modifiers.isCtrlDown() && !modifiers.isAltDown() && modifiers.isShiftDown() == withShift;
}

} // namespace

JuceGuiAdapter::JuceGuiAdapter(std::unique_ptr<juce::Component> content, IHostContext* context, Counted<FObject> engine)
    : Implements(MinimumRect), m_content(std::move(content)), m_context(context), m_engine(std::move(engine))
{
    setOpaque(true);
    setVisible(true);
    setTopLeftPosition(0, 0);
    setSize(MinimumWidth, MinimumHeight);
    addAndMakeVisible(*m_content, -1);
    layOutContent();
    addMouseListener(this, true);
}

JuceGuiAdapter::~JuceGuiAdapter()
{
    dispose();
}

void JuceGuiAdapter::dispose() noexcept
{
    const juce::MessageManagerLock lock;
    leaveDesktop();
    resultOf([&] { removeChildComponent(m_content.get()); });
    m_selectChange = {};
    m_content.reset();
    m_engine.reset();
}

void JuceGuiAdapter::leaveDesktop() noexcept
{
    const juce::MessageManagerLock lock;
    m_unusedKeys.reset();
    // What a component throws when it loses the keyboard mustn't come out of a destructor of JUCE's.
    resultOf([&] { giveAwayKeyboardFocus(); });
    resultOf([&] { removeFromDesktop(); });
}

int32 JuceGuiAdapter::isPlatformTypeSupported(const char* type)
{
    return type && std::strcmp(type, ParentType::X11Window) == 0 ? ResultOk : ResultFalse;
}

int32 JuceGuiAdapter::attached(void* parent, const char* type)
{
    if (!parent || !m_content || systemWindow() || isPlatformTypeSupported(type) != ResultOk)
        return ResultFalse;
    if (resultOf([&] { attachTo(parent); }) == util::Result::Ok)
        return CPluginView::attached(parent, type);
    leaveDesktop();
    return ResultFalse;
}

void JuceGuiAdapter::attachTo(void* parent)
{
    // Without a server JUCE has no screen, and would make a window that isn't anywhere.
    if (!juce::Desktop::getInstance().getDisplays().getPrimaryDisplay())
        throw util::Result::HostObjectMissing;
    setVisible(true);
    removeFromDesktop();
    addToDesktop(0, parent);
    if (!getPeer() || !getPeer()->getNativeHandle())
        throw util::Result::HostObjectMissing;
    setVisible(true);
    const XConnection::Window ours = windowOf(getPeer()->getNativeHandle());
    // Until its parent first moves, JUCE takes the window to be at the corner of the screen, and opens menus there.
    if (const XConnection connection; connection.isOpen())
        connection.tellPlace(ours);
    m_unusedKeys.emplace(ours, windowOf(parent));
    askForSize();
}

void JuceGuiAdapter::askForSize()
{
    const ViewRect wanted = rectOnScreen(getLocalBounds());
    const bool hasIt = widthOf(wanted) == widthOf(rect()) && heightOf(wanted) == heightOf(rect());
    if (hasIt || !plugFrame() || plugFrame()->resizeView(this, wanted) != ResultOk)
        onSize(ViewRect(rect()));
}

int32 JuceGuiAdapter::removed()
{
    if (!systemWindow())
        return ResultOk;
    leaveDesktop();
    return CPluginView::removed();
}

int32 JuceGuiAdapter::idle()
{
    // A host may give the view back in the midst of it.
    const auto self = Counted<JuceGuiAdapter>::share(this);
    const util::Result::Type result = resultOf([&] {
        if (m_unusedKeys)
            m_unusedKeys->beginServing();
        // The view may be removed meanwhile.
        if (serve() && m_unusedKeys)
            m_unusedKeys->endServing();
    });
    endPassingOver();
    return result;
}

int32 JuceGuiAdapter::onWheel(float distance)
{
    juce::ComponentPeer* const peer = getPeer();
    if (!peer)
        return ResultFalse;
    resultOf([&] {
        juce::MouseWheelDetails wheel = {};
        wheel.deltaY = distance;
        const auto place =
            peer->globalToLocal(juce::Desktop::getInstance().getMainMouseSource().getRawScreenPosition());
        peer->handleMouseWheel(juce::MouseInputSource::InputSourceType::mouse, place, juce::Time::currentTimeMillis(),
                               wheel);
    });
    return ResultFalse;
}

int32 JuceGuiAdapter::onKeyDown(char16_t key, int32 virtualKey, int32 modifiers)
{
    bool isUsed = false;
    resultOf([&] {
        const juce::ScopedValueSetter<bool> fromHost(m_keyIsFromHost, true);
        const auto press = toKeyPress(key, virtualKey, modifiers);
        if (juce::ComponentPeer* const peer = getPeer(); peer && press)
            isUsed = peer->handleKeyPress(*press);
    });
    return isUsed ? ResultFalse : ResultOk;
}

int32 JuceGuiAdapter::onKeyUp(char16_t /*key*/, int32 /*virtualKey*/, int32 /*modifiers*/)
{
    bool isUsed = false;
    resultOf([&] {
        if (juce::ComponentPeer* const peer = getPeer())
            isUsed = peer->handleKeyUpOrDown(false);
    });
    return isUsed ? ResultFalse : ResultOk;
}

int32 JuceGuiAdapter::onSize(const ViewRect& rect)
{
    CPluginView::onSize(rect);
    return resultOf([&] {
        const auto toOurs = [](int32 pixels) { return static_cast<int>(std::lround(pixels / scale())); };
        setSize(toOurs(widthOf(rect)), toOurs(heightOf(rect)));
    });
}

int32 JuceGuiAdapter::onFocus(bool state)
{
    return resultOf([&] {
        if (!state || !m_content || !isShowing())
            return;
        // A host may say so again while a field of the content has it, and before JUCE hears that it has lost it.
        if (!hasKeyboardFocus(true))
            m_content->grabKeyboardFocus();
        else if (!getPeer()->isFocused())
            getPeer()->grabFocus();
    });
}

int32 JuceGuiAdapter::checkSizeConstraint(ViewRect& rect)
{
    return resultOf([&] {
        const ViewRect least = rectOnScreen({MinimumWidth, MinimumHeight});
        rect.right = std::max(rect.right, rect.left + widthOf(least));
        rect.bottom = std::max(rect.bottom, rect.top + heightOf(least));
    });
}

int32 JuceGuiAdapter::selectChange(double source, double destination)
{
    bool isSelected = false;
    resultOf([&] { isSelected = m_selectChange && m_selectChange(source, destination); });
    return isSelected ? ResultOk : ResultFalse;
}

double JuceGuiAdapter::scale()
{
    return juce::Desktop::getInstance().getGlobalScaleFactor();
}

ViewRect JuceGuiAdapter::rectOf(juce::Rectangle<int> size) const
{
    const auto toHosts = [](int pixels) { return static_cast<int32>(std::lround(pixels * scale())); };
    return {rect().left, rect().top, rect().left + toHosts(size.getWidth()), rect().top + toHosts(size.getHeight())};
}

ViewRect JuceGuiAdapter::rectOnScreen(juce::Rectangle<int> size) const
{
    if (const auto* const display = juce::Desktop::getInstance().getDisplays().getPrimaryDisplay()) {
        const auto& area = display->userArea;
        size = size.withSize(std::min(size.getWidth(), area.getWidth()), std::min(size.getHeight(), area.getHeight()));
    }
    return rectOf(size);
}

void JuceGuiAdapter::paint(juce::Graphics& graphics)
{
    // A content that is shown smaller may leave a part of the last pixels free.
    graphics.fillAll(Background);
}

void JuceGuiAdapter::resized()
{
    layOutContent();
}

void JuceGuiAdapter::layOutContent()
{
    // A window of ours has at least one pixel, also where the host has left none.
    if (!m_content || widthOf(rect()) <= 0 || heightOf(rect()) <= 0)
        return;
    const juce::ScopedValueSetter<bool> layingOut(m_isLayingOut, true);
    const double widthShare = static_cast<double>(getWidth()) / MinimumWidth;
    const double heightShare = static_cast<double>(getHeight()) / MinimumHeight;
    const double factor = std::min({widthShare, heightShare, 1.0});
    m_content->setTransform(juce::AffineTransform::scale(static_cast<float>(factor)));
    m_content->setBounds(0, 0, static_cast<int>(std::lround(getWidth() / factor)),
                         static_cast<int>(std::lround(getHeight() / factor)));
}

void JuceGuiAdapter::childBoundsChanged(juce::Component* child)
{
    if (m_isLayingOut || !m_content || child != m_content.get() || !plugFrame())
        return;
    const ViewRect wanted = rectOf(getLocalArea(m_content.get(), m_content->getLocalBounds()));
    if (widthOf(wanted) == widthOf(rect()) && heightOf(wanted) == heightOf(rect()))
        return;
    if (plugFrame()->resizeView(this, wanted) != ResultOk)
        layOutContent();
}

bool JuceGuiAdapter::keyPressed(const juce::KeyPress& key)
{
    if (isEditKey(key, 'z', false))
        return invokeEditAction(IActionManager::Undo);
    if (isEditKey(key, 'z', true))
        return invokeEditAction(IActionManager::Redo);
    // Tab without Control moves the keyboard after this. What the host has handed over it has got.
    const bool isForUs = key.isKeyCode(juce::KeyPress::tabKey) && !key.getModifiers().isCtrlDown();
    if (!isForUs && !m_keyIsFromHost && m_unusedKeys)
        m_unusedKeys->sendOn(key.getKeyCode(), key.getTextCharacter());
    return false;
}

void JuceGuiAdapter::focusOfChildComponentChanged(FocusChangeType /*cause*/)
{
    if (!hasKeyboardFocus(true))
        m_hasLostKeyboard = true;
}

void JuceGuiAdapter::mouseDown(const juce::MouseEvent& /*event*/)
{
    juce::ComponentPeer* const peer = getPeer();
    if (!std::exchange(m_hasLostKeyboard, false) || !peer || !hasKeyboardFocus(true))
        return;
    // A window manager may take the keyboard away just before a click. The click gets it back, and JUCE hears of that afterwards.
    // It would then hand the keyboard to the component that had it before.
    juce::Component* const former = peer->getLastFocusedSubcomponent();
    if (former == this || former == getCurrentlyFocusedComponent() || !former->getWantsKeyboardFocus())
        return;
    endPassingOver(); // of a click before this one in the same turn
    former->setWantsKeyboardFocus(false);
    m_passedOver = former;
}

void JuceGuiAdapter::endPassingOver()
{
    if (m_passedOver)
        m_passedOver->setWantsKeyboardFocus(true);
    m_passedOver = nullptr;
}

bool JuceGuiAdapter::invokeEditAction(const char* action)
{
    const auto actions = service<IActionManager>(m_context);
    return actions && actions->invoke(IActionManager::EditCategory, action, 0) == ResultOk;
}

} // namespace cadrel::host
