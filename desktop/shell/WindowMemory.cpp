// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/WindowMemory.h"

#include "desktop/document/RecentFiles.h"
#include "standin/project/FileFault.h"
#include "standin/stage/JsonMembers.h"
#include "util/FileReplacement.h"
#include "util/Result.h"

#include <algorithm>
#include <cstdint>
#include <fstream>
#include <iterator>
#include <string>
#include <system_error>

namespace desktop {

namespace fs = std::filesystem;

namespace {

constexpr std::uintmax_t LargestFile = 4096; // bytes
constexpr std::size_t Depth = 4;             // of what is passed over

constexpr const char* Width = "width";
constexpr const char* Height = "height";
constexpr const char* IsMaximised = "maximised";
constexpr const char* TracksHeight = "tracks";

/// What window managers put around a window, at most as a rule.
constexpr int FrameWidth = 16;
constexpr int FrameHeight = 48;

} // namespace

WindowForm startForm(const std::optional<WindowForm>& remembered, const WindowRoom& room)
{
    const int width = room.width - (room.hasManager ? FrameWidth : 0);
    const int height = room.height - (room.hasManager ? FrameHeight : 0);
    WindowForm form = remembered.value_or(WindowForm());
    if (!remembered)
        form.isMaximised = form.width > width || form.height > height;
    form.isMaximised = form.isMaximised && room.hasManager;
    form.width = std::clamp(form.width, 1, std::max(width, 1));
    form.height = std::clamp(form.height, 1, std::max(height, 1));
    return form;
}

fs::path WindowMemory::defaultFile()
{
    const fs::path recent = RecentFiles::defaultFile();
    return recent.empty() ? recent : recent.parent_path() / "window.json";
}

std::optional<WindowForm> WindowMemory::read() const
try {
    std::error_code error;
    if (m_file.empty() || !fs::is_regular_file(m_file, error) || fs::file_size(m_file, error) > LargestFile || error)
        return std::nullopt;
    std::ifstream stream(m_file, std::ios::binary);
    const std::string text{std::istreambuf_iterator<char>(stream), {}};
    const standin::JsonDocument document(text, Depth);
    const standin::JsonPlace place;
    const standin::JsonMembers members(document.root(), place);
    WindowForm form;
    form.width = members.wholeNumber(Width, WindowForm::LeastWidth, WindowForm::Largest);
    form.height = members.wholeNumber(Height, WindowForm::LeastHeight, WindowForm::Largest);
    form.isMaximised = members.flag(IsMaximised);
    if (members.has(TracksHeight))
        form.tracksHeight = members.wholeNumber(TracksHeight, 0, WindowForm::Largest);
    return form;
} catch (const standin::FileFault&) {
    return std::nullopt;
}

bool WindowMemory::keep(const WindowForm& form)
try {
    if (m_kept == form)
        return true;
    if (m_file.empty())
        return false;
    std::string json = std::string("{\"").append(Width).append("\": ").append(std::to_string(form.width));
    json.append(", \"").append(Height).append("\": ").append(std::to_string(form.height));
    json.append(", \"").append(IsMaximised).append("\": ").append(form.isMaximised ? "true" : "false");
    if (form.tracksHeight >= 0)
        json.append(", \"").append(TracksHeight).append("\": ").append(std::to_string(form.tracksHeight));
    json.append("}\n");
    std::error_code error;
    fs::create_directories(m_file.parent_path(), error);
    cadrel::util::FileReplacement replacement(m_file);
    replacement.write(json);
    replacement.commit();
    m_kept = form;
    return true;
} catch (const cadrel::util::Result::Type&) {
    return false;
}

} // namespace desktop
