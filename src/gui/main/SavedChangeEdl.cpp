// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/SavedChangeEdl.h"

#include "core/edl/EventList.h"
#include "core/fileio/CmxWriter.h"
#include "core/time/Timecode.h"
#include "gui/look/ShownText.h"
#include "util/FilePath.h"
#include "util/FilledText.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <system_error>

namespace cadrel::gui {

using core::fileio::CmxWriter;
using util::Result;

namespace fs = std::filesystem;

namespace {

constexpr std::size_t MostNamed = 10;
const wchar_t* const TooLong =
    L"The Change EDL has more events than one file can hold. These files would be overwritten:";

bool isThere(const std::wstring& path)
{
    std::error_code error;
    return fs::exists(util::toFilePath(path), error);
}

std::wstring nameOf(const std::wstring& path)
{
    return util::StringUtil::toWide(util::toFilePath(path).filename().string());
}

} // namespace

std::vector<std::wstring> SavedChangeEdl::overwritten() const
{
    std::vector<std::wstring> there;
    const std::vector<std::wstring> files = CmxWriter::filesOf(m_path, m_list.size());
    std::copy_if(files.begin(), files.end(), std::back_inserter(there),
                 [this](const std::wstring& file) { return file != m_path && isThere(file); });
    return there;
}

std::wstring SavedChangeEdl::question() const
{
    const std::vector<std::wstring> files = overwritten();
    if (files.empty())
        return {};
    std::wstring text = translated(TooLong);
    for (std::size_t index = 0; index < std::min(files.size(), MostNamed); ++index)
        text += L"\n" + nameOf(files[index]);
    if (files.size() > MostNamed)
        text += L"\n" + util::filled(translated(L"and %s more"), std::to_wstring(files.size() - MostNamed));
    return text;
}

void SavedChangeEdl::write() const
{
    CmxWriter writer(CmxWriter::modeFor(core::Timecode::framerate()));
    const Result::Type result = writer.write(m_path, m_list);
    if (result != Result::Ok)
        throw result;
}

} // namespace cadrel::gui
