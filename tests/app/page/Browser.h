// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/TempFolder.h"

#include <nlohmann/json.hpp>
#include <string>
#include <sys/types.h>
#include <vector>

namespace cadrel::tests {

/// A headless browser with one page, which is driven over the browser's own pipe. Everything throws std::runtime_error when
/// the browser doesn't do what it is told, or doesn't answer for half a minute.
class Browser {
public:
    /// Throws where there is no `chromium`.
    Browser();
    Browser(const Browser&) = delete;
    Browser& operator=(const Browser&) = delete;
    ~Browser();

    /// Opens a file, and returns when it is there with all that it loads.
    void open(const std::filesystem::path& page);
    /// The value of an expression of JavaScript.
    nlohmann::json valueOf(const std::string& expression);

    /// "light" or "dark", as the user has it.
    void prefer(const std::string& scheme, const std::string& medium = "screen");
    /// The size of the window, in its own pixels.
    void resize(int width, int height);

    /// Presses and lets go of a key: "n", "+", "Enter", "Tab", "Space", "ArrowRight".
    void press(const std::string& key);
    /// Presses and lets go of the mouse there.
    void click(double x, double y);
    void turnWheel(double x, double y, double down, bool withControl);
    /// The page on paper, as a PDF.
    std::string printed();

    /// What the page has asked for since it was opened, but for itself, and what went wrong in it.
    const std::vector<std::string>& requests() const { return m_requests; }
    const std::vector<std::string>& errors() const { return m_errors; }

private:
    nlohmann::json call(const std::string& method, const nlohmann::json& parameters = nlohmann::json::object());
    void send(const nlohmann::json& message) const;
    nlohmann::json receive();
    void note(const nlohmann::json& event);

    const TempFolder m_profile;
    pid_t m_process = 0;
    int m_toBrowser = -1;
    int m_fromBrowser = -1;
    std::string m_received;
    int m_calls = 0;
    std::string m_session;
    std::string m_page;
    bool m_isLoaded = false;
    std::vector<std::string> m_requests;
    std::vector<std::string> m_errors;
};

} // namespace cadrel::tests
