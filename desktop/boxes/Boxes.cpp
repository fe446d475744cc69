// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/Boxes.h"

#include "desktop/boxes/AlertBox.h"
#include "desktop/boxes/BoxText.h"
#include "desktop/boxes/FileBox.h"
#include "standin/base/Utf16.h"

namespace desktop {

namespace {

constexpr std::chrono::milliseconds ProgressDelay(300);
constexpr std::chrono::milliseconds ProgressInterval(30);

} // namespace

Boxes::Boxes(EventLoop& loop, juce::Component& window, juce::Component& beneath, std::filesystem::path home)
    : m_loop(loop), m_window(window), m_beneath(beneath), m_folders(std::move(home))
{
}

Boxes::~Boxes()
{
    if (m_progress)
        hide(*m_progress);
}

std::size_t Boxes::ask(const std::u16string& message, const std::vector<std::u16string>& buttons, std::size_t byReturn)
{
    juce::StringArray labels;
    for (const std::u16string& label : buttons)
        labels.add(toJuce(label));
    return ask("Cadrel", toJuce(message), labels, byReturn);
}

std::size_t Boxes::ask(const juce::String& title, const juce::String& message, const juce::StringArray& buttons,
                       std::size_t byReturn)
{
    AlertBox box(title, message, buttons, byReturn);
    run(box);
    return box.answer();
}

std::vector<std::u16string> Boxes::chooseFiles(const FileQuestion& question)
{
    const auto askBack = [this](const juce::String& text, const juce::String& yes) {
        enum { Yes, Cancel };
        return ask("Save", text, {yes, "Cancel"}, Cancel) == Yes;
    };
    const auto tell = [this](const juce::String& text) { ask("Cadrel", text, {"OK"}, 0); };
    FileBox box(question, m_folders.startOf(standin::toUtf8(question.folder)), askBack, tell);
    run(box);
    std::vector<std::u16string> files;
    for (const std::filesystem::path& file : box.files())
        files.push_back(standin::toUtf16(file.string()));
    if (!box.files().empty())
        m_folders.remember(box.files().front());
    return files;
}

bool Boxes::showProgress(const Progress& progress)
{
    const Clock::time_point now = Clock::now();
    if (!m_hasProgress) {
        m_hasProgress = true;
        m_progressStart = now;
    }
    if (!m_progress && now - m_progressStart < ProgressDelay)
        return false;
    if (!m_progress) {
        m_progress = std::make_unique<ProgressBox>(progress);
        show(*m_progress);
    } else if (now - m_progressServed < ProgressInterval)
        return m_progress->isCancelled();
    m_progress->update(progress);
    keepKeyboard();
    m_loop.turnWithoutWaiting();
    m_progressServed = Clock::now();
    return m_progress->isCancelled();
}

void Boxes::endProgress()
{
    m_hasProgress = false;
    if (!m_progress)
        return;
    hide(*m_progress);
    m_progress.reset();
}

void Boxes::show(Box& box)
{
    if (m_open.empty() && m_openChanged)
        m_openChanged(true);
    m_open.push_back(&box);
    box.setBeneath(&m_beneath);
    m_window.addChildComponent(box);
    box.setVisible(true);
}

void Boxes::hide(Box& box)
{
    box.setVisible(false);
    m_window.removeChildComponent(&box);
    std::erase(m_open, &box);
    if (!m_open.empty())
        m_open.back()->takeFocus();
    else if (m_openChanged)
        m_openChanged(false);
}

void Boxes::run(Box& box)
{
    show(box);
    m_loop.runUntil([&] {
        keepKeyboard();
        return box.isDone();
    });
    hide(box);
}

/// A window that gets the keyboard from another one gives it to what had it before, or to nothing, even if a box has come up since.
void Boxes::keepKeyboard()
{
    juce::Component* const focused = juce::Component::getCurrentlyFocusedComponent();
    const juce::ComponentPeer* const peer = m_window.getPeer();
    if (focused ? m_window.isParentOf(focused) : peer && peer->isFocused())
        m_open.back()->keepFocus(focused);
}

} // namespace desktop
