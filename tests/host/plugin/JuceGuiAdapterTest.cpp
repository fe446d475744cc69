// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/JuceGuiAdapter.h"

#include "standin/Application.h"
#include "standin/edit/ActionManager.h"
#include "standin/window/HostWindow.h"
#include "velmark/Context.h"

#include "tests/support/x11/HostLoop.h"
#include "tests/support/x11/VirtualScreen.h"
#include "tests/support/x11/XUser.h"
#include "tests/support/x11/XWindows.h"

#include <gtest/gtest.h>

#include <X11/XF86keysym.h>
#include <X11/keysym.h>

#include <algorithm>
#include <clocale>
#include <cstdlib>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::host::JuceGuiAdapter;
using cadrel::host::JuceLayer;
using cadrel::tests::VirtualScreen;
using cadrel::tests::XUser;
using cadrel::tests::XWindows;

namespace {

/// Notes what comes to it, and holds a text field at the top.
class Content : public juce::Component {
public:
    explicit Content(std::vector<std::string>& calls) : m_calls(calls)
    {
        setOpaque(true);
        setWantsKeyboardFocus(true);
        addAndMakeVisible(field);
        addAndMakeVisible(second);
    }
    ~Content() override { m_calls.push_back("gone"); }

    void paint(juce::Graphics& graphics) override { graphics.fillAll(juce::Colour(0xff336699)); }
    void resized() override
    {
        field.setBounds(10, 10, 200, 24);
        second.setBounds(10, 40, 200, 24);
    }
    void focusLost(FocusChangeType) override
    {
        if (throwsAtFocusLost)
            throw std::runtime_error("focus");
    }
    void parentHierarchyChanged() override
    {
        if (throwsWhenAttached)
            throw std::runtime_error("parent");
    }
    void mouseDown(const juce::MouseEvent& event) override
    {
        place = event.getPosition();
        grabKeyboardFocus();
        m_calls.push_back("mouse");
        if (throws)
            throw std::runtime_error("mouse");
    }
    void mouseWheelMove(const juce::MouseEvent& event, const juce::MouseWheelDetails& wheel) override
    {
        place = event.getPosition();
        m_calls.push_back(wheel.deltaY > 0 ? "wheel up" : "wheel down");
    }
    bool keyPressed(const juce::KeyPress& key) override
    {
        m_calls.push_back("key " + key.getTextDescription().toStdString());
        return usesAllKeys || key.getKeyCode() == 'a';
    }

    juce::TextEditor field;
    juce::TextEditor second;
    juce::Point<int> place;
    bool usesAllKeys = false;
    bool throws = false;
    bool throwsAtFocusLost = false;
    bool throwsWhenAttached = false;

private:
    std::vector<std::string>& m_calls;
};

/// The action handler that undo and redo would reach through the host.
class Actions : public Implements<Actions, FObject, IActionManager, IHostContext> {
public:
    static constexpr const char* ClassName = "Actions";

    int32 addHandler(IActionHandler*) override { return ResultFalse; }
    int32 removeHandler(IActionHandler*) override { return ResultFalse; }
    int32 invoke(const char* category, const char* action, int32) override
    {
        invoked.push_back(std::string(category) + "/" + action);
        return ResultOk;
    }
    int32 getInterface(const Identifier& id, void** out) override { return queryInterface(id, out); }

    std::vector<std::string> invoked;
};

class JuceGuiAdapterTest : public testing::Test, protected cadrel::tests::HostLoop {
protected:
    ~JuceGuiAdapterTest() override
    {
        if (m_window)
            m_window->show(false);
        m_window.reset();
        m_view.reset();
    }

    void startServer(int width = 1600, int height = 1000, int dpi = 0)
    {
        m_screen = std::make_unique<VirtualScreen>(width, height);
        if (dpi != 0)
            m_screen->setDpi(std::to_string(dpi));
        m_windows = std::make_unique<XWindows>();
        m_user = std::make_unique<XUser>();
        m_layer.emplace();
    }
    void makeView()
    {
        auto content = std::make_unique<Content>(m_calls);
        m_content = content.get();
        m_view = makeCounted<JuceGuiAdapter>(std::move(content), m_actions.get(), nullptr);
    }
    void open(bool isResizable = true)
    {
        const auto ignore = [](standin::HostWindow&, bool) {};
        m_window = makeCounted<standin::HostWindow>(
            *m_windows, standin::WindowDescription{"Window", "Test", isResizable}, Counted<IPlugView>(m_view), ignore);
        ASSERT_EQ(m_window->open(), ResultOk);
        ASSERT_TRUE(turnUntil([this] { return m_content->isShowing() && m_windows->colourAt(500, 400) == 0x336699; }));
    }
    /// A window of the host without a frame.
    std::unique_ptr<standin::NativeWindow> makeNative()
    {
        struct Listener : standin::NativeWindow::Listener {
            void resizedByUser(std::int32_t, std::int32_t) override {}
            void givenRoom(std::int32_t, std::int32_t) override {}
            void closedByUser() override {}
            void focusChanged(bool) override {}
        };
        static Listener listener;
        return m_windows->createWindow("Test", 1300, 750, listener);
    }
    void start()
    {
        startServer();
        makeView();
        open();
    }

    void work() override
    {
        m_windows->serve();
        m_view->idle();
    }
    bool has(const std::string& call) const { return std::find(m_calls.begin(), m_calls.end(), call) != m_calls.end(); }
    /// In the empty part of the content.
    void clickContent()
    {
        m_user->moveTo(500, 400);
        m_user->click();
        ASSERT_TRUE(turnUntil([this] { return has("mouse") && m_content->hasKeyboardFocus(false); }));
        m_calls.clear();
    }
    ViewRect size()
    {
        ViewRect rect;
        m_view->getSize(rect);
        return rect;
    }

    std::unique_ptr<VirtualScreen> m_screen;
    std::unique_ptr<XWindows> m_windows;
    std::unique_ptr<XUser> m_user;
    std::optional<JuceLayer> m_layer; ///< the content is made before its view
    Counted<Actions> m_actions = makeCounted<Actions>();
    std::vector<std::string> m_calls;
    Counted<JuceGuiAdapter> m_view;
    Content* m_content = nullptr;
    Counted<standin::HostWindow> m_window;
};

} // namespace

TEST(JuceLayerScale, IsInQuartersFromOneToFourWhateverTheUserHasWritten)
{
    VirtualScreen screen;
    EXPECT_EQ(JuceLayer::screenScale(), 1.0);
    const std::vector<std::pair<std::string, double>> expected = {
        {"96", 1.0},   {"95", 1.0},   {"24", 1.0},  {"0", 1.0},    {"-192", 1.0}, {"107", 1.0},  {"108", 1.25},
        {"120", 1.25}, {"144", 1.5},  {"192", 2.0}, {"371", 3.75}, {"372", 4.0},  {"384", 4.0},  {"385", 4.0},
        {"9600", 4.0}, {"fine", 1.0}, {"", 1.0},    {"nan", 1.0},  {"inf", 1.0},  {"-inf", 1.0}, {"1e999", 1.0},
    };
    for (const auto& [dpi, scale] : expected) {
        screen.setDpi(dpi);
        EXPECT_EQ(JuceLayer::screenScale(), scale) << dpi;
    }
}

TEST_F(JuceGuiAdapterTest, HasItsSizeBeforeItIsAttached)
{
    startServer();
    makeView();

    EXPECT_EQ(size().right, 1300);
    EXPECT_EQ(size().bottom, 750);
    EXPECT_EQ(m_content->getWidth(), 1300);
    EXPECT_EQ(m_content->getHeight(), 750);
}

TEST_F(JuceGuiAdapterTest, IsAttachedToOneWindowOfTheXServerAlone)
{
    startServer();
    makeView();
    const auto native = makeNative();

    EXPECT_EQ(m_view->isPlatformTypeSupported("X11Window"), ResultOk);
    EXPECT_NE(m_view->isPlatformTypeSupported("Other"), ResultOk);
    EXPECT_NE(m_view->isPlatformTypeSupported(nullptr), ResultOk);
    EXPECT_NE(m_view->attached(native->parent(), "Other"), ResultOk);
    EXPECT_NE(m_view->attached(nullptr, "X11Window"), ResultOk);
    EXPECT_EQ(m_view->removed(), ResultOk);

    EXPECT_EQ(m_view->attached(native->parent(), "X11Window"), ResultOk);
    EXPECT_NE(m_view->attached(native->parent(), "X11Window"), ResultOk);
    EXPECT_TRUE(m_view->isOnDesktop());
    EXPECT_EQ(m_view->removed(), ResultOk);
    EXPECT_FALSE(m_view->isOnDesktop());
    EXPECT_EQ(m_view->removed(), ResultOk);
    EXPECT_EQ(m_view->attached(native->parent(), "X11Window"), ResultOk);
}

TEST_F(JuceGuiAdapterTest, BringsMouseAndWheelToTheContent)
{
    start();
    m_user->moveTo(540, 430);
    m_user->click();
    EXPECT_TRUE(turnUntil([this] { return has("mouse"); }));
    // The window of the host stands at 40, 30.
    EXPECT_EQ(m_content->place, juce::Point<int>(500, 400));

    m_user->wheelUp();
    EXPECT_TRUE(turnUntil([this] { return has("wheel up"); }));

    m_calls.clear();
    EXPECT_EQ(m_view->onWheel(-1.0F), 1);
    EXPECT_TRUE(has("wheel down"));
}

TEST_F(JuceGuiAdapterTest, KnowsItsPlaceOnTheScreenAtOnce)
{
    start();

    EXPECT_TRUE(turnUntil([this] { return m_content->getScreenPosition() == juce::Point<int>(40, 30); }));
}

TEST_F(JuceGuiAdapterTest, LeavesTheKeysToTheHostThatItDoesNotUse)
{
    start();
    clickContent();

    m_user->press(XK_space);
    EXPECT_TRUE(turnUntil([this] { return has("key spacebar") && !m_windows->keys().empty(); }));
    EXPECT_EQ(m_windows->keys(), std::vector<unsigned long>{XK_space});

    m_user->press('a');
    EXPECT_TRUE(turnUntil([this] { return has("key A"); }));
    m_user->press(XK_F5);
    EXPECT_TRUE(turnUntil([this] { return m_windows->keys().size() > 1; }));
    EXPECT_EQ(m_windows->keys(), (std::vector<unsigned long>{XK_space, XK_F5}));
}

TEST_F(JuceGuiAdapterTest, SendsAKeyOnAsTheUserHasPressedIt)
{
    start();
    clickContent();

    m_user->press(XK_KP_Add);
    m_user->press('a');
    m_user->press(XK_equal, XK_Shift_L);
    m_user->press(XK_KP_Subtract);
    m_user->press(XK_KP_Home);
    m_user->press(XK_KP_Enter);
    m_user->press('b', XK_Control_L);
    EXPECT_TRUE(turnUntil([this] { return m_windows->keyEvents().size() >= 12; }));
    turn(5);
    EXPECT_EQ(m_windows->keyEvents(),
              (std::vector<std::string>{"press KP_Add", "release KP_Add", "press plus", "release plus",
                                        "press KP_Subtract", "release KP_Subtract", "press KP_Home", "release KP_Home",
                                        "press KP_Enter", "release KP_Enter", "press b", "release b"}));
}

namespace {

constexpr unsigned long CyrillicZheByNumber = 0x01000416;

/// With the locale of the user, which a program takes over that asks for it, and the one of the host itself.
class JuceGuiAdapterLocale : public JuceGuiAdapterTest,
                             public testing::WithParamInterface<std::pair<const char*, const char*>> {
protected:
    JuceGuiAdapterLocale() : m_users(std::getenv("LC_ALL") ? std::getenv("LC_ALL") : "")
    {
        setenv("LC_ALL", GetParam().first, 1);
        std::setlocale(LC_ALL, GetParam().second);
    }
    ~JuceGuiAdapterLocale() override
    {
        std::setlocale(LC_ALL, "C");
        if (m_users.empty())
            unsetenv("LC_ALL");
        else
            setenv("LC_ALL", m_users.c_str(), 1);
    }

    /// Beyond ASCII, with the keysyms of Latin-1, of other sets of characters and by their number in Unicode; and an accent.
    const std::vector<unsigned long> m_letters = {XK_adiaeresis, XK_EuroSign, XK_Cyrillic_ef, CyrillicZheByNumber,
                                                  XK_dead_acute};

private:
    std::string m_users;
};

} // namespace

INSTANTIATE_TEST_SUITE_P(OfUserAndHost, JuceGuiAdapterLocale,
                         testing::Values(std::pair("C.UTF-8", "C"), std::pair("C.UTF-8", "C.UTF-8"),
                                         std::pair("C", "C"), std::pair("C", "C.UTF-8")));

TEST_P(JuceGuiAdapterLocale, LeavesTheLettersOfAllLanguagesToTheHost)
{
    startServer();
    for (const unsigned long letter : m_letters)
        m_user->addKey(letter);
    makeView();
    open();
    clickContent();

    for (const unsigned long letter : m_letters) {
        m_user->press(letter);
        m_user->press('a');
    }
    EXPECT_TRUE(turnUntil([this] { return m_windows->keys().size() >= m_letters.size(); }));
    turn(5);
    EXPECT_EQ(m_windows->keys(), m_letters);
    EXPECT_EQ(m_windows->keyEvents().size(), 2 * m_letters.size());
    EXPECT_STREQ(std::setlocale(LC_ALL, nullptr), GetParam().second);
}

/// JUCE knows no letters but those of ASCII where the user's locale has no others.
class JuceGuiAdapterText : public JuceGuiAdapterLocale {};

INSTANTIATE_TEST_SUITE_P(OfUserAndHost, JuceGuiAdapterText,
                         testing::Values(std::pair("C.UTF-8", "C"), std::pair("C.UTF-8", "C.UTF-8")));

TEST_P(JuceGuiAdapterText, KeepsTheLettersThatATextFieldUses)
{
    startServer();
    m_user->addKey(XK_adiaeresis);
    makeView();
    open();
    m_user->moveTo(100, 52);
    m_user->click();
    ASSERT_TRUE(turnUntil([this] { return m_content->field.hasKeyboardFocus(true); }));

    m_user->press(XK_adiaeresis);
    m_user->press('b');
    EXPECT_TRUE(turnUntil([this] { return m_content->field.getText() == juce::String::fromUTF8("äb"); }));
    turn(5);
    EXPECT_EQ(m_windows->keys(), std::vector<unsigned long>());
}

TEST_F(JuceGuiAdapterTest, LeavesTheKeysToTheHostThatNoComponentCanHave)
{
    constexpr unsigned long EndsAsLeft = 0x1008ff51;
    const std::vector<unsigned long> keys = {XK_Pause,         XK_F5,      XK_Print, XK_space, XK_Menu,
                                             XF86XK_AudioPlay, EndsAsLeft, XK_Left};
    startServer();
    m_user->addKey(XF86XK_AudioPlay);
    m_user->addKey(EndsAsLeft);
    makeView();
    open();
    clickContent();

    for (const unsigned long key : keys) {
        m_user->press(key);
        m_user->press('a');
    }
    EXPECT_TRUE(turnUntil([&] { return m_windows->keys().size() >= keys.size(); }));
    turn(5);
    EXPECT_EQ(m_windows->keys(), keys);
    EXPECT_EQ(m_windows->keyEvents().size(), 2 * keys.size());
}

TEST_F(JuceGuiAdapterTest, KeepsTheKeysWithoutACharacterThatAComponentUses)
{
    const std::vector<unsigned long> keys = {XK_F1,     XK_F12,    XK_F35,     XK_Left,      XK_Home,     XK_End,
                                             XK_Insert, XK_Delete, XK_KP_Home, XK_KP_Insert, XK_KP_Delete};
    startServer();
    m_user->addKey(XK_F35);
    makeView();
    open();
    clickContent();
    m_content->usesAllKeys = true;

    for (const unsigned long key : keys)
        m_user->press(key);
    m_user->press(XK_space, XK_Control_L);
    EXPECT_TRUE(turnUntil([&] { return m_calls.size() > keys.size(); }));
    turn(5);
    EXPECT_EQ(m_calls.size(), keys.size() + 1);
    EXPECT_EQ(m_windows->keyEvents(), std::vector<std::string>());
}

TEST_F(JuceGuiAdapterTest, SendsNoKeyOnThatOnlyChangesOthers)
{
    const std::vector<unsigned long> keys = {XK_Shift_L,          XK_Control_R, XK_Alt_L,    XK_Super_L,
                                             XK_Caps_Lock,        XK_Caps_Lock, XK_Num_Lock, XK_Num_Lock,
                                             XK_ISO_Level3_Shift, XK_Multi_key};
    startServer();
    m_user->addKey(XK_Multi_key);
    makeView();
    open();
    clickContent();

    for (const unsigned long key : keys)
        m_user->press(key);
    m_user->press('b');
    EXPECT_TRUE(turnUntil([this] { return m_windows->keyEvents().size() >= 2; }));
    turn(5);
    EXPECT_EQ(m_windows->keyEvents(), (std::vector<std::string>{"press b", "release b"}));
}

TEST_F(JuceGuiAdapterTest, LeavesTheKeysToTheHostThatControlTakesTheCharacterFrom)
{
    start();
    clickContent();

    m_user->press(XK_space, XK_Control_L);
    m_user->press('2', XK_Control_L);
    m_user->press('2', XK_Control_L, XK_Shift_L);
    EXPECT_TRUE(turnUntil([this] { return m_windows->keyEvents().size() >= 6; }));
    turn(5);
    EXPECT_EQ(m_windows->keyEvents(), (std::vector<std::string>{"press space", "release space", "press 2", "release 2",
                                                                "press at", "release at"}));
}

TEST_F(JuceGuiAdapterTest, SendsTheReleaseOfAKeyOnWhenItComes)
{
    start();
    clickContent();

    m_user->hold(XK_F5);
    EXPECT_TRUE(turnUntil([this] { return !m_windows->keyEvents().empty(); }));
    turn(5);
    EXPECT_EQ(m_windows->keyEvents(), std::vector<std::string>{"press F5"});
    m_user->release(XK_F5);
    EXPECT_TRUE(turnUntil([this] { return m_windows->keyEvents().size() > 1; }));
    EXPECT_EQ(m_windows->keyEvents(), (std::vector<std::string>{"press F5", "release F5"}));
}

TEST_F(JuceGuiAdapterTest, KeepsTabWhichMovesTheKeyboardFromFieldToField)
{
    start();
    m_user->moveTo(100, 52);
    m_user->click();
    ASSERT_TRUE(turnUntil([this] { return m_content->field.hasKeyboardFocus(true); }));

    m_user->press(XK_Tab);
    EXPECT_TRUE(turnUntil([this] { return m_content->second.hasKeyboardFocus(true); }));
    m_user->press(XK_Tab, XK_Shift_L);
    EXPECT_TRUE(turnUntil([this] { return m_content->field.hasKeyboardFocus(true); }));
    turn(5);
    EXPECT_EQ(m_windows->keyEvents(), std::vector<std::string>());
}

TEST_F(JuceGuiAdapterTest, KeepsTheKeysThatATextFieldUses)
{
    start();
    m_user->moveTo(100, 52);
    m_user->click();
    ASSERT_TRUE(turnUntil([this] { return m_content->field.hasKeyboardFocus(true); }));

    m_user->press('b');
    m_user->press(XK_space);
    m_user->press('c');
    EXPECT_TRUE(turnUntil([this] { return m_content->field.getText() == "b c"; })) << m_content->field.getText();
    EXPECT_EQ(m_windows->keys(), std::vector<unsigned long>());
    EXPECT_EQ(m_calls, std::vector<std::string>());
}

TEST_F(JuceGuiAdapterTest, TurnsUndoAndRedoIntoActionsOfTheHost)
{
    start();
    clickContent();

    m_user->press('z', XK_Control_L);
    EXPECT_TRUE(turnUntil([this] { return !m_actions->invoked.empty(); }));
    m_user->press('z', XK_Control_L, XK_Shift_L);
    EXPECT_TRUE(turnUntil([this] { return m_actions->invoked.size() > 1; }));

    EXPECT_EQ(m_actions->invoked, (std::vector<std::string>{"Edit/Undo", "Edit/Redo"}));
    EXPECT_EQ(std::count(m_windows->keys().begin(), m_windows->keys().end(), static_cast<unsigned long>('z')), 0);
}

TEST_F(JuceGuiAdapterTest, AnswersWhetherItHasUsedAKeyOfTheHost)
{
    start();
    clickContent();

    EXPECT_EQ(m_view->onKeyDown(u'a', 0, 0), 1);
    EXPECT_TRUE(has("key A"));
    EXPECT_EQ(m_view->onKeyDown(u'b', 0, 0), 0);
    EXPECT_EQ(m_view->onKeyDown(0, VirtualKey::Left, 0), 0);
    EXPECT_TRUE(has("key cursor left"));
    EXPECT_EQ(m_view->onKeyDown(0, VirtualKey::F12, KeyModifier::Shift | KeyModifier::Alt), 0);
    EXPECT_TRUE(has("key shift + alt + F12"));
    EXPECT_EQ(m_view->onKeyDown(0, 0, 0), 0);
    EXPECT_EQ(m_view->onKeyUp(u'a', 0, 0), 0);
    turn(5);
    EXPECT_TRUE(m_windows->keys().empty());
}

TEST_F(JuceGuiAdapterTest, TakesKeysOfTheHostWithControlHeld)
{
    start();
    clickContent();

    EXPECT_EQ(m_view->onKeyDown(u'z', 0, KeyModifier::Control), 1);
    EXPECT_EQ(m_view->onKeyDown(u'Z', 0, KeyModifier::Control | KeyModifier::Shift), 1);
    EXPECT_EQ(m_actions->invoked, (std::vector<std::string>{"Edit/Undo", "Edit/Redo"}));
    EXPECT_EQ(m_view->onKeyDown(u'z', 0, KeyModifier::Control | KeyModifier::Alt), 0);
    EXPECT_EQ(m_view->onKeyDown(u'b', 0, KeyModifier::Control), 0);
    EXPECT_TRUE(has("key ctrl + B"));
    EXPECT_EQ(m_actions->invoked.size(), 2U);
}

TEST_F(JuceGuiAdapterTest, TakesTheKeyboardWhenTheHostSaysSo)
{
    start();
    EXPECT_EQ(m_view->onFocus(true), ResultOk);
    EXPECT_TRUE(turnUntil([this] { return m_content->hasKeyboardFocus(false); }));

    m_user->press('a');
    EXPECT_TRUE(turnUntil([this] { return has("key A"); }));
}

TEST_F(JuceGuiAdapterTest, TakesTheKeyboardBackThatItHasLostSinceItLastLooked)
{
    start();
    clickContent();
    const unsigned long ours = m_user->focus();
    m_user->setFocus(reinterpret_cast<std::uintptr_t>(m_window->native()->parent()));
    ASSERT_NE(m_user->focus(), ours);

    EXPECT_EQ(m_view->onFocus(true), ResultOk);
    EXPECT_TRUE(turnUntil([&] { return m_user->focus() == ours && m_content->hasKeyboardFocus(false); }));
    m_user->press('a');
    EXPECT_TRUE(turnUntil([this] { return has("key A"); }));
}

// Window managers do so with a click: first their window gets the keyboard, and then the click comes.
TEST_F(JuceGuiAdapterTest, GivesTheKeyboardToWhatIsClickedRightAfterTheHostHasTakenIt)
{
    start();
    m_user->moveTo(100, 52);
    m_user->click();
    ASSERT_TRUE(turnUntil([this] { return m_content->field.hasKeyboardFocus(true); }));

    for (juce::TextEditor* const clicked : {&m_content->second, &m_content->field}) {
        m_user->setFocus(reinterpret_cast<std::uintptr_t>(m_window->native()->parent()));
        m_user->moveTo(100, clicked == &m_content->second ? 82 : 52);
        m_user->click();
        ASSERT_TRUE(turnUntil([&] { return clicked->hasKeyboardFocus(true); }));
        turn(5);
        m_user->press('b');
        EXPECT_TRUE(turnUntil([&] { return clicked->getText() == "b"; }));
    }
    m_user->press(XK_Tab);
    EXPECT_TRUE(turnUntil([this] { return m_content->second.hasKeyboardFocus(true); })) << "It can still be reached.";
}

TEST_F(JuceGuiAdapterTest, FollowsTheSizeOfTheHost)
{
    start();
    EXPECT_EQ(m_view->onSize({0, 0, 1500, 900}), ResultOk);
    EXPECT_EQ(m_content->getBounds(), juce::Rectangle<int>(0, 0, 1500, 900));
    EXPECT_EQ(size().right, 1500);

    EXPECT_EQ(m_view->onSize({10, 20, 1310, 770}), ResultOk);
    EXPECT_EQ(m_content->getBounds(), juce::Rectangle<int>(0, 0, 1300, 750));
}

TEST_F(JuceGuiAdapterTest, LeavesTheContentAsItIsAtASizeOfNothing)
{
    startServer();
    makeView();
    EXPECT_EQ(m_view->onSize({0, 0, 0, 750}), ResultOk);
    EXPECT_EQ(m_view->getWidth(), 0);
    EXPECT_EQ(m_content->getWidth(), 1300);
    m_view->onSize({0, 0, 1300, 750});
    open();

    EXPECT_EQ(m_view->onSize({0, 0, 1300, 0}), ResultOk);
    EXPECT_EQ(m_content->getBounds(), juce::Rectangle<int>(0, 0, 1300, 750));
    EXPECT_EQ(m_view->onSize({0, 0, 1300, 750}), ResultOk);
    EXPECT_EQ(m_content->getBounds(), juce::Rectangle<int>(0, 0, 1300, 750));
}

TEST_F(JuceGuiAdapterTest, AsksTheHostWhenTheContentWantsAnotherSize)
{
    start();
    m_content->setSize(1400, 800);

    EXPECT_EQ(size().right, 1400);
    EXPECT_EQ(size().bottom, 800);
    EXPECT_EQ(m_view->getBounds().getWidth(), 1400);
}

TEST_F(JuceGuiAdapterTest, PutsTheSizeBackThatTheHostRefuses)
{
    startServer();
    makeView();
    open(false);

    m_content->setSize(1400, 800);

    EXPECT_EQ(m_content->getWidth(), 1300);
    EXPECT_EQ(m_content->getHeight(), 750);
    EXPECT_EQ(size().right, 1300);
}

TEST_F(JuceGuiAdapterTest, ShowsTheContentSmallerInASmallerWindow)
{
    start();

    m_view->onSize({0, 0, 650, 750});
    EXPECT_EQ(m_content->getWidth(), 1300);
    EXPECT_EQ(m_content->getHeight(), 1500);
    EXPECT_EQ(m_view->getLocalArea(m_content, m_content->getLocalBounds()), juce::Rectangle<int>(0, 0, 650, 750));
}

TEST_F(JuceGuiAdapterTest, HoldsToItsLeastSize)
{
    startServer();
    makeView();
    const auto constrained = [this](int32 width, int32 height) {
        ViewRect rect{5, 6, 5 + width, 6 + height};
        EXPECT_EQ(m_view->checkSizeConstraint(rect), ResultOk);
        EXPECT_EQ(rect.left, 5);
        EXPECT_EQ(rect.top, 6);
        return std::pair(rect.right - 5, rect.bottom - 6);
    };
    EXPECT_EQ(constrained(1299, 749), std::pair(1300, 750));
    EXPECT_EQ(constrained(1300, 750), std::pair(1300, 750));
    EXPECT_EQ(constrained(1301, 751), std::pair(1301, 751));
    EXPECT_EQ(constrained(1299, 751), std::pair(1300, 751));
    EXPECT_EQ(constrained(0, 0), std::pair(1300, 750));
    EXPECT_EQ(constrained(-1, -1), std::pair(1300, 750));
}

TEST_F(JuceGuiAdapterTest, HoldsToItsLeastSizeOnAFineScreen)
{
    startServer(3200, 2000, 192);
    makeView();
    const auto constrained = [this](int32 width, int32 height) {
        ViewRect rect{0, 0, width, height};
        EXPECT_EQ(m_view->checkSizeConstraint(rect), ResultOk);
        return std::pair(rect.right, rect.bottom);
    };
    EXPECT_EQ(constrained(2599, 1499), std::pair(2600, 1500));
    EXPECT_EQ(constrained(2600, 1500), std::pair(2600, 1500));
    EXPECT_EQ(constrained(2601, 1501), std::pair(2601, 1501));
}

TEST_F(JuceGuiAdapterTest, TakesASmallScreenForTheLeastSize)
{
    startServer(1024, 600);
    makeView();
    ViewRect rect{0, 0, 100, 100};
    m_view->checkSizeConstraint(rect);

    EXPECT_EQ(rect.right, 1024);
    EXPECT_EQ(rect.bottom, 600);
}

TEST_F(JuceGuiAdapterTest, AsksForPhysicalPixelsOnAFineScreen)
{
    startServer(3200, 2000, 192);
    makeView();
    EXPECT_EQ(size().right, 1300);
    open();

    EXPECT_EQ(size().right, 2600);
    EXPECT_EQ(size().bottom, 1500);
    EXPECT_EQ(m_content->getWidth(), 1300);
    EXPECT_EQ(m_content->getHeight(), 750);
    EXPECT_TRUE(turnUntil([this] { return m_windows->colourAt(40 + 2590, 30 + 1490) == 0x336699; }));

    m_user->moveTo(40 + 1000, 30 + 800);
    m_user->click();
    EXPECT_TRUE(turnUntil([this] { return has("mouse"); }));
    EXPECT_EQ(m_content->place, juce::Point<int>(500, 400));

    m_content->place = {};
    m_view->onWheel(1.0F);
    EXPECT_TRUE(has("wheel up"));
    EXPECT_EQ(m_content->place, juce::Point<int>(500, 400));
}

TEST_F(JuceGuiAdapterTest, ShowsTheContentSmallerWhereTheHostGivesNoMorePixels)
{
    startServer(3200, 2000, 192);
    makeView();
    open(false);

    EXPECT_EQ(size().right, 1300);
    EXPECT_EQ(size().bottom, 750);
    EXPECT_EQ(m_view->getLocalBounds(), juce::Rectangle<int>(0, 0, 650, 375));
    EXPECT_EQ(m_content->getLocalBounds(), juce::Rectangle<int>(0, 0, 1300, 750));
    EXPECT_EQ(m_view->getLocalArea(m_content, m_content->getLocalBounds()), juce::Rectangle<int>(0, 0, 650, 375));
}

TEST_F(JuceGuiAdapterTest, PaintsWhatTheContentLeavesFree)
{
    startServer();
    makeView();
    m_content->setVisible(false);
    const juce::Image image = m_view->createComponentSnapshot(m_view->getLocalBounds());

    EXPECT_EQ(image.getPixelAt(0, 0), juce::Colour(0xff070c10));
    EXPECT_EQ(image.getPixelAt(1299, 749), juce::Colour(0xff070c10));
}

TEST_F(JuceGuiAdapterTest, ShowsTheContentSmallerOnAFineScreenWithoutAFrame)
{
    startServer(3200, 2000, 192);
    makeView();
    const auto native = makeNative();

    ASSERT_EQ(m_view->attached(native->parent(), "X11Window"), ResultOk);
    EXPECT_EQ(m_view->getLocalBounds(), juce::Rectangle<int>(0, 0, 650, 375));
    EXPECT_EQ(m_content->getLocalBounds(), juce::Rectangle<int>(0, 0, 1300, 750));
    m_view->removed();
}

TEST_F(JuceGuiAdapterTest, AsksForNoMoreThanAFineScreenHas)
{
    startServer(1920, 1080, 192);
    makeView();
    open();

    EXPECT_EQ(size().right, 1920);
    EXPECT_EQ(size().bottom, 1080);
    EXPECT_EQ(m_view->getLocalBounds(), juce::Rectangle<int>(0, 0, 960, 540));
}

TEST_F(JuceGuiAdapterTest, AsksForNoMoreThanASmallScreenHas)
{
    startServer(1024, 600);
    makeView();
    open();

    EXPECT_EQ(size().right, 1024);
    EXPECT_EQ(size().bottom, 600);
}

TEST_F(JuceGuiAdapterTest, LetsNoExceptionOfTheContentReachTheHost)
{
    start();
    m_content->throws = true;
    m_user->moveTo(540, 430);
    m_user->click();
    EXPECT_TRUE(turnUntil([this] { return has("mouse"); }));

    m_content->throws = false;
    m_calls.clear();
    m_user->click();
    EXPECT_TRUE(turnUntil([this] { return has("mouse"); }));
}

TEST_F(JuceGuiAdapterTest, LetsNoExceptionOutWhenItIsClosed)
{
    start();
    clickContent();
    m_content->throwsAtFocusLost = true;

    EXPECT_EQ(m_view->removed(), ResultOk);
    EXPECT_FALSE(m_view->isOnDesktop());
    EXPECT_FALSE(m_content->hasKeyboardFocus(true));
}

TEST_F(JuceGuiAdapterTest, LetsNoExceptionOutWhenItIsDisposedOf)
{
    start();
    clickContent();
    m_content->throwsAtFocusLost = true;

    m_view->dispose();
    EXPECT_TRUE(has("gone"));
    EXPECT_FALSE(m_view->isOnDesktop());
}

TEST_F(JuceGuiAdapterTest, LetsNoExceptionOutWhenItIsAttached)
{
    startServer();
    makeView();
    const auto native = makeNative();
    m_content->throwsWhenAttached = true;
    EXPECT_NE(m_view->attached(native->parent(), "X11Window"), ResultOk);
    EXPECT_FALSE(m_view->isOnDesktop());

    m_content->throwsWhenAttached = false;
    EXPECT_EQ(m_view->attached(native->parent(), "X11Window"), ResultOk);
    m_view->removed();
}

TEST_F(JuceGuiAdapterTest, IsAttachedToNothingWithoutAServer)
{
    m_layer.emplace();
    makeView();

    EXPECT_NE(m_view->attached(this, "X11Window"), ResultOk);
    EXPECT_FALSE(m_view->isOnDesktop());
}

TEST_F(JuceGuiAdapterTest, LetsTheContentHaveItsSizeWhereThereIsNobodyToAsk)
{
    startServer();
    makeView();
    const auto native = makeNative();
    ASSERT_EQ(m_view->attached(native->parent(), "X11Window"), ResultOk);

    m_content->setSize(1400, 800);
    EXPECT_EQ(m_content->getWidth(), 1400);
    EXPECT_EQ(size().right, 1300);
    EXPECT_EQ(m_view->getWidth(), 1300);
    m_view->removed();
}

TEST_F(JuceGuiAdapterTest, EndsItsContentWhenItIsDisposedOf)
{
    start();
    m_view->dispose();

    EXPECT_TRUE(has("gone"));
    EXPECT_FALSE(m_view->isOnDesktop());
    EXPECT_EQ(m_view->onSize({0, 0, 1300, 750}), ResultOk);
    EXPECT_EQ(m_view->onKeyDown(u'a', 0, 0), 0);
    EXPECT_EQ(m_view->onFocus(true), ResultOk);
    EXPECT_EQ(m_view->idle(), ResultOk);
}

TEST_F(JuceGuiAdapterTest, KeepsWhatItsContentWorksOn)
{
    startServer();
    const auto engine = makeCounted<FObject>();
    m_view = makeCounted<JuceGuiAdapter>(std::make_unique<Content>(m_calls), m_actions.get(), engine);
    EXPECT_EQ(engine->refCount(), 2);

    m_view.reset();
    EXPECT_EQ(engine->refCount(), 1);
}
