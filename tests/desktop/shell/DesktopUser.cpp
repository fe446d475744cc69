// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/desktop/shell/DesktopUser.h"

#include "desktop/shell/ShellLayout.h"
#include "desktop/shell/WindowMemory.h"
#include "desktop/tracks/RowLayout.h"
#include "desktop/tracks/TimeRuler.h"
#include "desktop/tracks/TimeScale.h"
#include "desktop/tracks/TrackHeaders.h"
#include "desktop/tracks/TrackIndex.h"
#include "tests/module/MainStills.h"
#include "tests/support/TreePaths.h"
#include "tests/support/x11/XDrag.h"

#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <X11/keysym.h>

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <thread>
#include <utility>

#include <sys/wait.h>
#include <unistd.h>

namespace desktop::tests {

using cadrel::tests::WindowPlaces;

namespace {

constexpr int Width = 1300;
constexpr int ModuleHeight = 750;
constexpr int TracksHeight = 300;
constexpr int Height =
    ShellLayout::MenuHeight + ShellLayout::TabHeight + TracksHeight + ShellLayout::DividerHeight + ModuleHeight;

/// Or a window that is larger than the screen would come up maximised, and couldn't be resized.
void rememberSize(const std::filesystem::path& home)
{
    const std::filesystem::path file = home / "state/cadrel/window.json";
    if (std::filesystem::exists(file))
        return;
    std::filesystem::create_directories(file.parent_path());
    WindowForm form;
    form.width = Width;
    form.height = Height;
    WindowMemory(file).keep(form);
}

pid_t startProgram(const std::filesystem::path& home, const std::vector<std::string>& arguments, DesktopUser::Size size)
{
    if (size == DesktopUser::Size::OfPlaces)
        rememberSize(home);
    std::string program = cadrel::tests::programPath("cadrel");
    std::vector<std::string> texts{program, "open"};
    texts.insert(texts.end(), arguments.begin(), arguments.end());
    const pid_t process = fork();
    if (process != 0)
        return process;
    setenv("HOME", home.c_str(), 1);
    setenv("XDG_STATE_HOME", (home / "state").c_str(), 1);
    std::vector<char*> pointers;
    for (std::string& text : texts)
        pointers.push_back(text.data());
    pointers.push_back(nullptr);
    execv(program.c_str(), pointers.data());
    _exit(127);
}

std::vector<Window> childrenOf(Display* display, Window window)
{
    Window root = 0;
    Window parent = 0;
    Window* children = nullptr;
    unsigned count = 0;
    if (XQueryTree(display, window, &root, &parent, &children, &count) == 0)
        return {};
    const std::vector<Window> found(children, children + count);
    if (children)
        XFree(children);
    return found;
}

/// 0 for one that lies in no other, and for one that has gone.
Window parentOf(Display* display, Window window)
{
    Window root = 0;
    Window parent = 0;
    Window* children = nullptr;
    unsigned count = 0;
    if (XQueryTree(display, window, &root, &parent, &children, &count) == 0)
        return 0;
    if (children)
        XFree(children);
    return parent == root ? 0 : parent;
}

bool isViewable(Display* display, Window window)
{
    XWindowAttributes attributes;
    return XGetWindowAttributes(display, window, &attributes) != 0 && attributes.map_state == IsViewable;
}

/// A window may go while it is looked at.
int passOver(Display* /*display*/, XErrorEvent* /*error*/)
{
    return 0;
}

/// In UTF-8.
std::string nameOf(Display* display, Window window)
{
    XTextProperty text = {};
    if (XGetWMName(display, window, &text) == 0 || !text.value)
        return {};
    const std::string name(reinterpret_cast<const char*>(text.value), text.nitems);
    XFree(text.value);
    return name;
}

/// Whether what is shown has stayed the same.
class Rest {
public:
    /// For more than so many calls.
    bool isReached(std::vector<char> shown, int turns)
    {
        m_still = shown == m_shown ? m_still + 1 : 0;
        m_shown = std::move(shown);
        return m_still > turns;
    }

private:
    std::vector<char> m_shown;
    int m_still = 0;
};

} // namespace

DesktopUser::DesktopUser(const std::filesystem::path& home, const std::vector<std::string>& arguments,
                         unsigned long answer, Size size)
    : m_display(XOpenDisplay(nullptr)), m_process(startProgram(home, arguments, size))
{
    XSetErrorHandler(passOver);
    waitFor("the window is there", [this] {
        m_window = findWindow(DefaultRootWindow(m_display));
        return m_window != 0;
    });
    m_user.setFocus(m_window);
    constexpr int TurnsBetweenKeys = 50;
    waitFor("Cadrel's window is in it", [&, turns = 0]() mutable {
        const auto children = childrenOf(m_display, m_window);
        // Not every window manager takes the first wish of a window that it has only just framed.
        if (size == Size::OfPlaces)
            XResizeWindow(m_display, m_window, Width, Height);
        if (children.empty() && answer != 0 && ++turns % TurnsBetweenKeys == 0)
            press(answer);
        XWindowAttributes attributes;
        if (children.empty() || XGetWindowAttributes(m_display, children.front(), &attributes) == 0)
            return false;
        m_container = children.front();
        const bool hasSize = attributes.width == Width && attributes.height == ModuleHeight;
        return attributes.map_state == IsViewable && (size == Size::Own || hasSize);
    });
}

DesktopUser::~DesktopUser()
{
    if (!m_hasEnded) {
        killProgram();
        waitpid(m_process, nullptr, 0);
    }
    XCloseDisplay(m_display);
    XSetErrorHandler(nullptr);
}

unsigned long DesktopUser::findWindow(unsigned long within) const
{
    for (const Window window : childrenOf(m_display, within)) {
        const std::string name = nameOf(m_display, window);
        if (isViewable(m_display, window) && (name == "Cadrel" || name.ends_with(" - Cadrel")))
            return window;
        if (const Window found = findWindow(window))
            return found;
    }
    return 0;
}

void DesktopUser::waitFor(const std::string& what, const std::function<bool()>& condition)
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::minutes(1);
    while (!condition()) {
        if (!isRunning() || std::chrono::steady_clock::now() > end)
            throw std::runtime_error("it doesn't come about that " + what + "; the title is " + title());
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
}

DesktopUser::Pixel DesktopUser::originOf(unsigned long window) const
{
    Pixel origin{0, 0};
    Window child = 0;
    XTranslateCoordinates(m_display, window, DefaultRootWindow(m_display), 0, 0, &origin.x, &origin.y, &child);
    return origin;
}

DesktopUser::Pixel DesktopUser::middleOf(const WindowPlaces::Place& place) const
{
    const Pixel origin = originOf(m_container);
    return {origin.x + place.x + place.width / 2, origin.y + place.y + place.height / 2};
}

void DesktopUser::moveTo(const WindowPlaces::Place& place)
{
    const Pixel middle = middleOf(place);
    m_user.moveTo(middle.x, middle.y);
}

void DesktopUser::clickAt(const WindowPlaces::Place& place)
{
    moveTo(place);
    m_user.click();
}

void DesktopUser::click(const std::string& sheet, const std::string& name, const std::string& text)
{
    clickAt(m_places.at(sheet, name, text));
}

void DesktopUser::doubleClick(const std::string& sheet, const std::string& name, std::chrono::milliseconds pause)
{
    const Pixel middle = middleOf(m_places.at(sheet, name));
    m_user.moveTo(middle.x, middle.y);
    m_user.click();
    std::this_thread::sleep_for(pause);
    m_user.click();
}

void DesktopUser::clickBesideTheBox()
{
    constexpr int Inside = 20;
    const Pixel origin = originOf(m_window);
    m_user.moveTo(origin.x + Inside, origin.y + ShellLayout::of(Height, -1).tracksTop + TracksHeight / 2);
    m_user.click();
}

DesktopUser::Pixel DesktopUser::trackPixel(const standin::Project& project, std::size_t row, double seconds) const
{
    constexpr int ScrollBar = 12;
    constexpr int IntoTheRow = 6;
    const TrackIndex index(project);
    const RowLayout rows(index.rows(), RowLayout::Size::Medium);
    TimeScale scale;
    scale.fit(index.programme()->start, index.programme()->end, Width - TrackHeaders::Width - ScrollBar);
    const Pixel origin = originOf(m_window);
    return {origin.x + TrackHeaders::Width + static_cast<int>(scale.pixelAt(seconds)),
            origin.y + ShellLayout::of(Height, -1).tracksTop + TimeRuler::Height + rows.top(row) + IntoTheRow};
}

void DesktopUser::clickTrack(const standin::Project& project, std::size_t row, double seconds)
{
    const Pixel place = trackPixel(project, row, seconds);
    m_user.moveTo(place.x, place.y);
    m_user.click();
}

unsigned long DesktopUser::trackColour(const standin::Project& project, std::size_t row, double seconds) const
{
    const Pixel place = trackPixel(project, row, seconds);
    return m_windows.colourAt(place.x, place.y);
}

void DesktopUser::clickTab(int tab)
{
    constexpr int TabWidth = 240;
    constexpr int IntoTheTab = 60;
    const Pixel origin = originOf(m_window);
    m_user.moveTo(origin.x + tab * TabWidth + IntoTheTab,
                  origin.y + ShellLayout::MenuHeight + ShellLayout::TabHeight / 2);
    m_user.click();
}

WindowPlaces::Place DesktopUser::changeEventPlace(int row) const
{
    const WindowPlaces::Place first = m_places.at(Main, "Change Table List Box Row");
    return first.movedBy(0, row * first.height);
}

void DesktopUser::clickChangeEvent(int row)
{
    clickAt(changeEventPlace(row));
}

void DesktopUser::clickSecondVideo(const char* column)
{
    waitForRest(10);
    const WindowPlaces::Place row = m_places.at(Videos, "VideosTable Row");
    const WindowPlaces::Place title = m_places.at(Videos, "VideosTable Column", column);
    clickAt({title.x, row.y + row.height, title.width, row.height});
}

void DesktopUser::chooseInMenu(int menu, int entry)
{
    const int windows = m_windows.windowCount();
    press(XK_F10);
    waitFor("the menus are open", [&] { return m_windows.windowCount() > windows; });
    std::vector<unsigned long> keys(static_cast<std::size_t>(menu), XK_Right);
    keys.insert(keys.end(), static_cast<std::size_t>(entry) + 1, XK_Down);
    keys.push_back(XK_Return);
    for (const unsigned long key : keys) {
        // A menu takes no key before it is open.
        waitForRest(10);
        press(key);
    }
    waitFor("the menus are closed", [&] { return m_windows.windowCount() == windows; });
}

void DesktopUser::dropOn(const std::string& sheet, const std::string& name, const std::filesystem::path& file)
{
    constexpr int RestTurns = 20;
    const Pixel middle = middleOf(m_places.at(sheet, name));
    waitForRest(RestTurns);
    const auto before = m_windows.pixelsOf(m_window);
    cadrel::tests::dragFilesTo(m_window, {file}, middle.x, middle.y);
    // The program hands it on to Cadrel's window, which opens a sheet.
    waitFor("Cadrel takes the file", [&] { return m_windows.pixelsOf(m_window) != before; });
    waitForRest(RestTurns);
}

void DesktopUser::dropOnTracks(const std::filesystem::path& file)
{
    const Pixel origin = originOf(m_window);
    cadrel::tests::dragFilesTo(m_window, {file}, origin.x + Width / 2,
                               origin.y + ShellLayout::of(Height, -1).tracksTop + TracksHeight / 2);
}

void DesktopUser::waitForStills(int oldNumber, int newNumber)
{
    const Pixel origin = originOf(m_container);
    const cadrel::tests::MainStills stills(m_windows, {Width, ModuleHeight}, origin.x, origin.y);
    waitFor("the stills show " + std::to_string(oldNumber) + " and " + std::to_string(newNumber),
            [&] { return stills.oldNumber() == oldNumber && stills.newNumber() == newNumber; });
}

void DesktopUser::closeWindow()
{
    XEvent event = {};
    event.xclient.type = ClientMessage;
    event.xclient.window = m_window;
    event.xclient.message_type = XInternAtom(m_display, "WM_PROTOCOLS", False);
    event.xclient.format = 32;
    event.xclient.data.l[0] = static_cast<long>(XInternAtom(m_display, "WM_DELETE_WINDOW", False));
    XSendEvent(m_display, m_window, False, NoEventMask, &event);
    XSync(m_display, False);
}

void DesktopUser::sendToManager(const char* message, long first, long second, long third)
{
    XEvent event = {};
    event.xclient.type = ClientMessage;
    event.xclient.window = m_window;
    event.xclient.message_type = XInternAtom(m_display, message, False);
    event.xclient.format = 32;
    event.xclient.data.l[0] = first;
    event.xclient.data.l[1] = second;
    event.xclient.data.l[2] = third;
    XSendEvent(m_display, DefaultRootWindow(m_display), False, SubstructureRedirectMask | SubstructureNotifyMask,
               &event);
    XSync(m_display, False);
}

void DesktopUser::switchMaximised()
{
    constexpr long Switch = 2;
    const Area before = area();
    sendToManager("_NET_WM_STATE", Switch,
                  static_cast<long>(XInternAtom(m_display, "_NET_WM_STATE_MAXIMIZED_HORZ", False)),
                  static_cast<long>(XInternAtom(m_display, "_NET_WM_STATE_MAXIMIZED_VERT", False)));
    waitFor("the window has another size", [&] { return area().height != before.height; });
    waitForRest(20);
}

void DesktopUser::resizeTo(int width, int height)
{
    waitForRest(20);
    XResizeWindow(m_display, m_window, static_cast<unsigned>(width), static_cast<unsigned>(height));
    waitFor("the window has its size", [&] { return area().width == width && area().height == height; });
    waitForRest(20);
}

void DesktopUser::dragDivider(int distance)
{
    const Area module = moduleArea();
    const int x = module.x + module.width / 2;
    const int y = module.y - ShellLayout::DividerHeight / 2 - 1;
    m_user.moveTo(x, y);
    m_user.dragTo(x, y + distance);
    waitFor("the line is dragged", [&] { return moduleArea().y == module.y + distance; });
}

DesktopUser::Area DesktopUser::areaOf(unsigned long window) const
{
    XWindowAttributes attributes = {};
    XGetWindowAttributes(m_display, window, &attributes);
    const Pixel origin = originOf(window);
    return {origin.x, origin.y, attributes.width, attributes.height};
}

DesktopUser::Area DesktopUser::frame() const
{
    Window window = m_window;
    while (const Window around = parentOf(m_display, window))
        window = around;
    return areaOf(window);
}

void DesktopUser::waitForKeyboardInModule()
{
    waitFor("Cadrel's window has the keyboard", [this] {
        Window window = m_user.focus();
        while (window > PointerRoot && window != m_container)
            window = parentOf(m_display, window);
        return window == m_container;
    });
}

void DesktopUser::pressOnTracks(unsigned long key)
{
    waitForRest(20);
    const auto before = m_windows.pixelsOf(m_window);
    press(key);
    waitFor("the tracks take the key", [&] { return m_windows.pixelsOf(m_window) != before; });
}

void DesktopUser::openAndCloseMenus()
{
    waitForRest(20);
    const int windows = m_windows.windowCount();
    press(XK_F10);
    waitFor("the menus are open", [&] { return m_windows.windowCount() > windows; });
    waitForRest(20);
    press(XK_Escape);
    waitFor("the menus are closed", [&] { return m_windows.windowCount() == windows; });
}

void DesktopUser::waitForRest(int turns)
{
    waitForRestOf(m_window, turns);
}

void DesktopUser::waitForRestOf(unsigned long window, int turns)
{
    waitFor("the window comes to rest", [this, window, turns, rest = Rest()]() mutable {
        return rest.isReached(m_windows.pixelsOf(window), turns);
    });
}

void DesktopUser::picture(const std::string& name)
{
    writePicture(m_window, name);
}

void DesktopUser::modulePicture(const std::string& name)
{
    writePicture(m_container, name);
}

void DesktopUser::menuPicture(int row, const std::string& name)
{
    const int windows = m_windows.windowCount();
    moveTo(changeEventPlace(row));
    m_user.rightClick();
    waitFor("the menu is open", [&] { return m_windows.windowCount() > windows; });
    // A menu takes no key before it is open.
    waitForRestOf(m_container, 10);
    press(XK_Down);
    waitForRestOf(m_container, 10);
    press(XK_Right);
    waitFor("the menu within it is open", [&] { return m_windows.windowCount() > windows + 1; });
    modulePicture(name);
    press(XK_Escape);
    waitForRestOf(m_container, 10);
    press(XK_Escape);
    waitFor("the menus are closed", [&] { return m_windows.windowCount() == windows; });
}

void DesktopUser::writePicture(unsigned long window, const std::string& name)
{
    // Longer than from a change to its being drawn. A picture of a slow machine, on which something moves all the time, is as good.
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    for (Rest rest; !rest.isReached(m_windows.pixelsOf(window), 40) && std::chrono::steady_clock::now() < end;)
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    const std::filesystem::path folder =
        std::filesystem::path(cadrel::tests::programPath("../window")).lexically_normal();
    std::filesystem::create_directories(folder);
    m_windows.writePicture(window, folder / (name + ".png"));
}

std::string DesktopUser::title() const
{
    return m_window != 0 ? nameOf(m_display, m_window) : "";
}

bool DesktopUser::isBoxOpen() const
{
    return !isViewable(m_display, m_container);
}

void DesktopUser::waitForBox(bool isOpen)
{
    waitFor(isOpen ? "a box is open" : "no box is open", [&] { return isBoxOpen() == isOpen; });
}

void DesktopUser::waitForTitle(const std::string& what, const std::function<bool(const std::string&)>& fits)
{
    waitFor(what, [&] { return fits(title()); });
}

void DesktopUser::save()
{
    waitForTitle("there is unsaved work", [](const std::string& text) { return text.starts_with("*"); });
    press('s', XK_Control_L);
    waitForTitle("the work is saved", [](const std::string& text) { return !text.starts_with("*"); });
}

bool DesktopUser::isRunning()
{
    if (!m_hasEnded && waitpid(m_process, &m_status, WNOHANG) == m_process)
        m_hasEnded = true;
    return !m_hasEnded;
}

void DesktopUser::killProgram() const
{
    kill(m_process, SIGKILL);
}

void DesktopUser::signalProgram(int signal) const
{
    kill(m_process, signal);
}

double DesktopUser::processorSeconds() const
{
    std::ifstream file("/proc/" + std::to_string(m_process) + "/stat");
    std::string text((std::istreambuf_iterator<char>(file)), {});
    // The name stands in parentheses and may hold blanks; the time of the program and of the system for it are the 12th and
    // 13th after it.
    std::istringstream fields(text.substr(text.rfind(')') + 1));
    std::string passedOver;
    for (int field = 0; field < 11; ++field)
        fields >> passedOver;
    double own = 0.0;
    double system = 0.0;
    fields >> own >> system;
    return (own + system) / static_cast<double>(sysconf(_SC_CLK_TCK));
}

int DesktopUser::status()
{
    waitFor("the program ends", [this] { return !isRunning(); });
    return WIFEXITED(m_status) ? WEXITSTATUS(m_status) : -1;
}

} // namespace desktop::tests
