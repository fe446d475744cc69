// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/page/Browser.h"

#include <array>
#include <csignal>
#include <cstdint>
#include <fcntl.h>
#include <poll.h>
#include <stdexcept>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace cadrel::tests {

using nlohmann::json;

namespace {

constexpr int LongestAnswer = 30000; // milliseconds
/// The browser reads what it is told from 3, and answers to 4.
constexpr int BrowserReads = 3;
constexpr int BrowserWrites = 4;

struct Pipe {
    Pipe()
    {
        std::array<int, 2> ends{};
        if (pipe2(ends.data(), O_CLOEXEC) != 0)
            throw std::runtime_error("no pipe");
        // Away from the numbers that the browser knows.
        readEnd = fcntl(ends[0], F_DUPFD_CLOEXEC, 10);
        writeEnd = fcntl(ends[1], F_DUPFD_CLOEXEC, 10);
        close(ends[0]);
        close(ends[1]);
    }

    int readEnd = -1;
    int writeEnd = -1;
};

[[noreturn]] void becomeBrowser(const Pipe& orders, const Pipe& answers, const std::string& profile)
{
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    const int nothing = open("/dev/null", O_RDWR);
    dup2(nothing, STDOUT_FILENO);
    dup2(nothing, STDERR_FILENO);
    dup2(orders.readEnd, BrowserReads);
    dup2(answers.writeEnd, BrowserWrites);
    const std::string folder = "--user-data-dir=" + profile;
    // The pages are this tree's own, and a sandbox is no more to be had for root or in many containers.
    execlp("chromium", "chromium", "--headless", "--no-sandbox", "--disable-gpu", "--hide-scrollbars", "--no-first-run",
           "--disable-background-networking", "--disable-component-update", "--disable-sync", "--disable-extensions",
           "--disable-dev-shm-usage", "--remote-debugging-pipe", folder.c_str(), "about:blank",
           static_cast<char*>(nullptr));
    _exit(127);
}

struct Key {
    std::string key;
    std::string code;
    int number;       ///< of the virtual key
    std::string text; ///< that it types
};

Key keyOf(const std::string& name)
{
    if (name == "Enter")
        return {name, name, 13, "\r"};
    if (name == "Tab")
        return {name, name, 9, ""};
    if (name == "Space")
        return {" ", name, 32, " "};
    if (name == "ArrowLeft" || name == "ArrowRight")
        return {name, name, name == "ArrowLeft" ? 37 : 39, ""};
    return {name, "", 0, name};
}

std::string decoded(const std::string& base64)
{
    constexpr std::string_view Digits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    std::string bytes;
    std::uint32_t bits = 0;
    int count = 0;
    for (const char digit : base64) {
        const std::size_t value = Digits.find(digit);
        if (value == std::string_view::npos)
            break;
        bits = (bits << 6U) | static_cast<std::uint32_t>(value);
        count += 6;
        if (count >= 8) {
            count -= 8;
            bytes += static_cast<char>((bits >> static_cast<unsigned>(count)) & 0xffU);
        }
    }
    return bytes;
}

} // namespace

Browser::Browser()
{
    const Pipe orders;
    const Pipe answers;
    m_process = fork();
    if (m_process == 0)
        becomeBrowser(orders, answers, m_profile.path());
    close(orders.readEnd);
    close(answers.writeEnd);
    m_toBrowser = orders.writeEnd;
    m_fromBrowser = answers.readEnd;
    signal(SIGPIPE, SIG_IGN); // a browser that has ended is told of by what it doesn't answer
    const json target = call("Target.createTarget", {{"url", "about:blank"}});
    m_session = call("Target.attachToTarget", {{"targetId", target.at("targetId")}, {"flatten", true}})
                    .at("sessionId")
                    .get<std::string>();
    for (const char* const domain : {"Page", "Runtime", "Log", "Network"})
        call(std::string(domain).append(".enable"));
}

Browser::~Browser()
{
    close(m_toBrowser); // which ends it
    close(m_fromBrowser);
    kill(m_process, SIGTERM);
    waitpid(m_process, nullptr, 0);
}

void Browser::send(const json& message) const
{
    std::string text = message.dump();
    text += '\0';
    for (std::size_t sent = 0; sent < text.size();) {
        const ssize_t count = write(m_toBrowser, text.data() + sent, text.size() - sent);
        if (count <= 0)
            throw std::runtime_error("no browser; chromium has to be installed");
        sent += static_cast<std::size_t>(count);
    }
}

json Browser::receive()
{
    std::size_t end = 0;
    while ((end = m_received.find('\0')) == std::string::npos) {
        pollfd waiting{m_fromBrowser, POLLIN, 0};
        std::array<char, 65536> part{};
        const ssize_t count = poll(&waiting, 1, LongestAnswer) > 0 ? read(m_fromBrowser, part.data(), part.size()) : 0;
        if (count <= 0)
            throw std::runtime_error("the browser doesn't answer; chromium has to be installed");
        m_received.append(part.data(), static_cast<std::size_t>(count));
    }
    const json message = json::parse(m_received.substr(0, end));
    m_received.erase(0, end + 1);
    return message;
}

json Browser::call(const std::string& method, const json& parameters)
{
    json message{{"id", ++m_calls}, {"method", method}, {"params", parameters}};
    if (!m_session.empty())
        message["sessionId"] = m_session;
    send(message);
    for (;;) {
        const json answer = receive();
        if (!answer.contains("id"))
            note(answer);
        else if (answer.at("id") == m_calls && answer.contains("result"))
            return answer.at("result");
        else if (answer.at("id") == m_calls)
            throw std::runtime_error(method + ": " + answer.dump());
    }
}

/// An event that the browser tells of by itself.
void Browser::note(const json& event)
{
    const std::string method = event.at("method");
    const json& facts = event.at("params");
    if (method == "Page.loadEventFired")
        m_isLoaded = true;
    else if (method == "Network.requestWillBeSent" && facts.at("request").at("url") != m_page)
        m_requests.push_back(facts.at("request").at("url"));
    else if (method == "Runtime.exceptionThrown")
        m_errors.push_back(facts.at("exceptionDetails").dump());
    else if (method == "Log.entryAdded" && facts.at("entry").at("level") == "error")
        m_errors.push_back(facts.at("entry").at("text"));
    else if (method == "Runtime.consoleAPICalled" && (facts.at("type") == "error" || facts.at("type") == "warning"))
        m_errors.push_back(facts.at("args").dump());
}

void Browser::open(const std::filesystem::path& page)
{
    m_page = "file://" + page.string();
    m_requests.clear();
    m_errors.clear();
    m_isLoaded = false;
    const json result = call("Page.navigate", {{"url", m_page}});
    if (result.contains("errorText"))
        throw std::runtime_error(m_page + ": " + result.at("errorText").get<std::string>());
    while (!m_isLoaded)
        note(receive());
}

json Browser::valueOf(const std::string& expression)
{
    const json answer = call("Runtime.evaluate", {{"expression", expression}, {"returnByValue", true}});
    if (answer.contains("exceptionDetails"))
        throw std::runtime_error(expression + ": " + answer.at("exceptionDetails").dump());
    return answer.at("result").value("value", json());
}

void Browser::prefer(const std::string& scheme, const std::string& medium)
{
    call("Emulation.setEmulatedMedia",
         {{"media", medium}, {"features", json::array({{{"name", "prefers-color-scheme"}, {"value", scheme}}})}});
}

void Browser::resize(int width, int height)
{
    call("Emulation.setDeviceMetricsOverride",
         {{"width", width}, {"height", height}, {"deviceScaleFactor", 1}, {"mobile", false}});
}

void Browser::press(const std::string& name)
{
    const Key key = keyOf(name);
    json event{{"type", key.text.empty() ? "rawKeyDown" : "keyDown"},
               {"key", key.key},
               {"code", key.code},
               {"windowsVirtualKeyCode", key.number},
               {"text", key.text}};
    call("Input.dispatchKeyEvent", event);
    event["type"] = "keyUp";
    event.erase("text");
    call("Input.dispatchKeyEvent", event);
}

void Browser::click(double x, double y)
{
    for (const char* const type : {"mousePressed", "mouseReleased"})
        call("Input.dispatchMouseEvent", {{"type", type}, {"x", x}, {"y", y}, {"button", "left"}, {"clickCount", 1}});
}

void Browser::turnWheel(double x, double y, double down, bool withControl)
{
    call("Input.dispatchMouseEvent", {{"type", "mouseWheel"},
                                      {"x", x},
                                      {"y", y},
                                      {"deltaX", 0},
                                      {"deltaY", down},
                                      {"modifiers", withControl ? 2 : 0}});
}

std::string Browser::printed()
{
    call("Emulation.setEmulatedMedia", {{"media", ""}}); // or the paper would be that of the screen
    return decoded(call("Page.printToPDF", {{"preferCSSPageSize", true}, {"printBackground", true}})
                       .at("data")
                       .get<std::string>());
}

} // namespace cadrel::tests
