// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/EmbeddedView.h"

#include "gui/look/Text.h"
#include "velmark/PlugView.h"

#include <cmath>
#include <cstdint>
#include <utility>

namespace desktop {

namespace {

constexpr int HintFont = 0;
constexpr std::chrono::milliseconds PaintTime(300);

juce::Image imageOf(const XContainer::Picture& picture)
{
    juce::Image image(juce::Image::RGB, picture.width, picture.height, false);
    juce::Image::BitmapData data(image, juce::Image::BitmapData::writeOnly);
    auto pixel = picture.pixels.begin();
    for (int y = 0; y < picture.height; ++y) {
        for (int x = 0; x < picture.width; ++x)
            data.setPixelColour(x, y, juce::Colour(0xff000000U | *pixel++));
    }
    return image;
}

juce::KeyPress keyPressOf(const XContainer::Key& key)
{
    // The codes of JUCE's keys end as their symbols do; those that move something have a mark.
    constexpr unsigned long FirstNamed = 0xff00;
    constexpr unsigned long FirstMoving = 0xff50;
    constexpr int MovingMark = 0x10000000;
    const juce::ModifierKeys modifiers((key.hasShift ? juce::ModifierKeys::shiftModifier : 0) |
                                       (key.hasControl ? juce::ModifierKeys::ctrlModifier : 0) |
                                       (key.hasAlt ? juce::ModifierKeys::altModifier : 0));
    const int code = key.symbol >= FirstNamed
                         ? static_cast<int>(key.symbol & 0xff) | (key.symbol >= FirstMoving ? MovingMark : 0)
                         : static_cast<int>(key.symbol);
    return {code, modifiers, static_cast<juce::juce_wchar>(key.hasControl ? '\0' : key.character)};
}

} // namespace

XContainer::Window windowOf(const juce::ComponentPeer* peer)
{
    return peer ? static_cast<XContainer::Window>(reinterpret_cast<std::uintptr_t>(peer->getNativeHandle())) : 0;
}

class EmbeddedView::Window : public standin::NativeWindow {
public:
    Window(EmbeddedView& owner, XContainer::Window around, Listener& listener)
        : m_owner(owner), m_listener(listener), m_container(around)
    {
        m_owner.m_window = this;
        m_container.onKey = [this](const XContainer::Key& key) { m_owner.pass(key); };
        juce::LinuxEventLoop::registerFdCallback(m_container.descriptor(), [this](int) { m_container.serve(); });
    }
    ~Window() override
    {
        juce::LinuxEventLoop::unregisterFdCallback(m_container.descriptor());
        m_owner.m_window = nullptr;
        m_owner.m_picture = {};
        m_owner.repaint();
    }

    void* parent() override { return reinterpret_cast<void*>(static_cast<std::uintptr_t>(m_container.window())); }
    bool hasFixedRoom() const override { return true; }
    void setSize(std::int32_t /*width*/, std::int32_t /*height*/) override {}
    void show() override
    {
        m_isShown = true;
        m_owner.layOut();
        if (!m_owner.m_isCovered)
            m_container.show();
    }

    bool isShown() const { return m_isShown; }
    XContainer& container() { return m_container; }
    Listener& listener() { return m_listener; }

private:
    EmbeddedView& m_owner;
    Listener& m_listener;
    XContainer m_container;
    bool m_isShown = false;
};

EmbeddedView::~EmbeddedView() = default;

const char* EmbeddedView::parentType() const
{
    return Velmark::ParentType::X11Window;
}

std::unique_ptr<standin::NativeWindow> EmbeddedView::createWindow(const std::string& /*title*/, std::int32_t /*width*/,
                                                                  std::int32_t /*height*/,
                                                                  standin::NativeWindow::Listener& listener)
{
    const XContainer::Window around = windowOf(getPeer());
    if (m_window || around == 0)
        return nullptr;
    return std::make_unique<Window>(*this, around, listener);
}

XContainer::Place EmbeddedView::place() const
{
    const juce::Component* const top = getTopLevelComponent();
    const double scale = juce::Desktop::getInstance().getGlobalScaleFactor();
    const juce::Rectangle<double> area = top->getLocalArea(this, getLocalBounds()).toDouble() * scale;
    const juce::Rectangle<int> pixels = area.getSmallestIntegerContainer();
    return {pixels.getX(), pixels.getY(), pixels.getWidth(), pixels.getHeight()};
}

void EmbeddedView::layOut()
{
    if (!m_window || !m_window->isShown())
        return;
    const XContainer::Place room = place();
    if (m_window->container().moveTo(room))
        m_window->listener().givenRoom(room.width, room.height);
}

void EmbeddedView::resized()
{
    layOut();
}

void EmbeddedView::moved()
{
    layOut();
}

void EmbeddedView::setCovered(bool isCovered)
{
    if (isCovered == std::exchange(m_isCovered, isCovered) || !m_window || !m_window->isShown())
        return;
    XContainer& container = m_window->container();
    if (isCovered) {
        m_hadKeyboard = container.hasKeyboard();
        m_picture = takePicture();
        container.hide();
    } else {
        m_formerPicture = std::exchange(m_picture, {});
        m_uncovered = std::chrono::steady_clock::now();
        container.show();
        if (m_hadKeyboard)
            m_window->listener().focusChanged(true);
    }
    repaint();
}

bool EmbeddedView::hasKeyboard() const
{
    return m_window && m_window->container().hasKeyboard();
}

void EmbeddedView::takeKeyboard()
{
    if (m_window && m_window->isShown() && !m_isCovered)
        m_window->listener().focusChanged(true);
}

juce::Image EmbeddedView::takePicture()
{
    const auto picture = m_window->container().picture();
    juce::Image image = picture ? imageOf(*picture) : juce::Image();
    // Where one box comes right after another, the module's window hasn't been painted yet, and shows what was in its place.
    const bool isPainted = std::chrono::steady_clock::now() - m_uncovered > PaintTime;
    return !isPainted && image.getBounds() == m_formerPicture.getBounds() ? m_formerPicture : image;
}

void EmbeddedView::giveKeyboardAway()
{
    if (hasKeyboard())
        m_window->container().giveKeyboardAway();
}

bool EmbeddedView::drop(const std::vector<std::string>& files, juce::Point<int> place)
{
    if (!m_window || !m_window->isShown() || m_isCovered || !getLocalBounds().contains(place))
        return false;
    const juce::Point<double> pixels = place.toDouble() * juce::Desktop::getInstance().getGlobalScaleFactor();
    m_window->container().drop(files, static_cast<int>(pixels.x), static_cast<int>(pixels.y));
    return true;
}

void EmbeddedView::pass(const XContainer::Key& key)
{
    if (juce::ComponentPeer* const peer = getPeer(); peer && !m_isCovered)
        peer->handleKeyPress(keyPressOf(key));
}

void EmbeddedView::paint(juce::Graphics& graphics)
{
    graphics.fillAll(cadrel::gui::toColour(cadrel::gui::Palette::panel));
    if (m_picture.isValid())
        graphics.drawImage(m_picture, getLocalBounds().toFloat());
    else if (!m_window)
        cadrel::gui::drawText(graphics, m_hint, 0.0F, 0.0F, static_cast<float>(getWidth()),
                              static_cast<float>(getHeight()), juce::Justification::centred,
                              cadrel::gui::getFont(HintFont), cadrel::gui::toColour(cadrel::gui::Palette::text), true);
}

} // namespace desktop
