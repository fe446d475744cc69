// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/module/WindowPlaces.h"
#include "tests/support/x11/XUser.h"
#include "tests/support/x11/XWindows.h"

#include <chrono>
#include <filesystem>
#include <functional>
#include <string>
#include <vector>

#include <sys/types.h>

struct _XDisplay;

namespace standin {
class Project;
} // namespace standin

namespace desktop::tests {

/// The desktop program in a process of its own, and a user in front of it with mouse and keyboard. The window gets a size in which
/// Cadrel's has its smallest one, so that its controls stand where WindowPlaces says. Everything that doesn't come about within
/// a minute, or before the program ends, throws std::runtime_error.
class DesktopUser {
public:
    /// Whether the window gets the size in which controls can be found, or keeps the one that the program has given it.
    enum class Size { OfPlaces, Own };

    static constexpr const char* Main = "";
    static constexpr const char* Files = "m_fileDialog";
    static constexpr const char* Settings = "m_settingsDialog";
    static constexpr const char* Videos = "m_videosDialog";

    /// Starts the program on the screen of the environment, with its state in the folder `home`, and waits for its window and
    /// for Cadrel's. `answer` is the key that a question before that is answered with, or 0.
    DesktopUser(const std::filesystem::path& home, const std::vector<std::string>& arguments, unsigned long answer = 0,
                Size size = Size::OfPlaces);
    DesktopUser(const DesktopUser&) = delete;
    DesktopUser& operator=(const DesktopUser&) = delete;
    /// Kills the program if it still runs.
    ~DesktopUser();

    /// In the middle of a control of Cadrel's, named as in WindowPlaces.
    void click(const std::string& sheet, const std::string& name, const std::string& text = "");
    void doubleClick(const std::string& sheet, const std::string& name, std::chrono::milliseconds pause);
    /// On the tracks at their left edge, over which a box lies, but not its panel.
    void clickBesideTheBox();
    /// At a place of the tracks of which all is shown, in the row with that index; in seconds of the project.
    void clickTrack(const standin::Project& project, std::size_t row, double seconds);
    /// What stands there in the band with the names of clips, as 0xRRGGBB.
    unsigned long trackColour(const standin::Project& project, std::size_t row, double seconds) const;
    /// On the name of a project, counted from 0.
    void clickTab(int tab);
    /// On an event of the change list, counted from 0.
    void clickChangeEvent(int row);
    /// In the second row of the videos, below the title of a column.
    void clickSecondVideo(const char* column);
    /// Chooses an entry of a menu by the keyboard: both are counted from 0, the entries without the lines between them.
    void chooseInMenu(int menu, int entry);
    /// Drags a file from another program to the middle of a control of Cadrel's, or of the tracks, and lets it go there.
    void dropOn(const std::string& sheet, const std::string& name, const std::filesystem::path& file);
    void dropOnTracks(const std::filesystem::path& file);
    void press(unsigned long key, unsigned long held = 0, unsigned long heldToo = 0)
    {
        m_user.press(key, held, heldToo);
    }
    void type(const std::string& text) { m_user.type(text); }
    /// Waits until the keyboard is in Cadrel's window.
    void waitForKeyboardInModule();
    /// Presses a key that changes what the tracks show, and waits until it does.
    void pressOnTracks(unsigned long key);
    /// Opens the menus by the keyboard, and closes them again.
    void openAndCloseMenus();
    /// As a window manager does it for the user.
    void closeWindow();
    void resizeTo(int width, int height);
    void switchMaximised();
    /// From where it is to a place so many pixels lower.
    void dragDivider(int distance);

    struct Area {
        int x;
        int y;
        int width;
        int height;
    };
    /// Of the window, and of the frame that a window manager has put around it; on the screen.
    Area area() const { return areaOf(m_window); }
    Area frame() const;
    /// Of Cadrel's window.
    Area moduleArea() const { return areaOf(m_container); }

    /// Writes what the window shows to the folder `window` of the build, when it has come to rest. Without a window manager.
    void picture(const std::string& name);
    /// The same of Cadrel's window alone.
    void modulePicture(const std::string& name);
    /// The same of the menu of an event of the change list, counted from 0, with the part for healing open.
    void menuPicture(int row, const std::string& name);

    /// Waits until Cadrel's window shows both stills with these numbers in their bars.
    void waitForStills(int oldNumber, int newNumber);

    /// What the window shows.
    std::vector<char> pixels() const { return m_windows.pixelsOf(m_window); }
    /// Until what the window shows has stayed the same for so many turns of ten milliseconds or more.
    void waitForRest(int turns);
    std::string title() const;
    bool isBoxOpen() const;
    void waitForBox(bool isOpen);
    void waitForTitle(const std::string& what, const std::function<bool(const std::string&)>& fits);
    /// Saves by the keyboard, and waits until there is no mark of unsaved work.
    void save();
    /// At once, from any thread.
    void killProgram() const;
    /// As the system does when the user logs out.
    void signalProgram(int signal) const;
    /// The time of the processors that the program has taken so far, in seconds.
    double processorSeconds() const;
    /// Waits for the end of the program and answers its exit status; -1 where a signal has ended it.
    int status();
    bool isRunning();

private:
    unsigned long findWindow(unsigned long within) const;
    void waitFor(const std::string& what, const std::function<bool()>& condition);
    /// Of the screen.
    struct Pixel {
        int x;
        int y;
    };
    Pixel originOf(unsigned long window) const;
    Pixel trackPixel(const standin::Project& project, std::size_t row, double seconds) const;
    Area areaOf(unsigned long window) const;
    void sendToManager(const char* message, long first, long second, long third);
    Pixel middleOf(const cadrel::tests::WindowPlaces::Place& place) const;
    void moveTo(const cadrel::tests::WindowPlaces::Place& place);
    void clickAt(const cadrel::tests::WindowPlaces::Place& place);
    cadrel::tests::WindowPlaces::Place changeEventPlace(int row) const;
    void waitForRestOf(unsigned long window, int turns);
    void writePicture(unsigned long window, const std::string& name);

    _XDisplay* m_display;
    pid_t m_process;
    int m_status = 0;
    bool m_hasEnded = false;
    unsigned long m_window = 0;    ///< of the program
    unsigned long m_container = 0; ///< what Cadrel's lies in
    cadrel::tests::WindowPlaces m_places;
    cadrel::tests::XUser m_user;
    cadrel::tests::XWindows m_windows;
};

} // namespace desktop::tests
