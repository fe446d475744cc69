// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/FileBrowserDialog.h"

#include "host/border/HostFailure.h"
#include "util/HostString.h"
#include "util/StringUtil.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"
#include "velmark/Media.h"
#include "velmark/UserInterface.h"

#include <array>
#include <cstddef>
#include <memory>

namespace cadrel::host {

using namespace Velmark;
using util::HostString;
using util::Result;

namespace {

/// Copies as many whole characters as fit before the zero at the end.
template <std::size_t Size>
void fill(char (&field)[Size], const std::wstring& text)
{
    const std::string utf8 = util::StringUtil::toUtf8(text);
    const auto continuesCharacter = [&](std::size_t at) {
        return (static_cast<unsigned char>(utf8[at]) & 0xC0U) == 0x80U;
    };
    std::size_t length = utf8.size();
    if (length >= Size) {
        length = Size - 1;
        while (length > 0 && continuesCharacter(length))
            --length;
    }
    utf8.copy(field, length);
}

std::string pathOf(FUnknown* file)
{
    std::array<char16_t, IFilePath::Capacity> buffer{};
    requireOk(required(query<IFilePath>(file))->getPath(buffer.data()));
    return util::StringUtil::toUtf8(HostString(buffer.data()).wide());
}

std::vector<std::string> pathsOf(IObjectList& files)
{
    std::vector<std::string> paths;
    for (int32 index = 0; index < files.count(); ++index)
        paths.push_back(pathOf(files.at(index)));
    return paths;
}

} // namespace

void FileBrowserDialog::install(IHostContext* context)
{
    FileBrowserDialogBase::install(std::make_unique<FileBrowserDialog>(context));
}

void FileBrowserDialog::browse(const std::wstring& title, const std::wstring& startFolder,
                               const std::wstring& extension, const std::wstring& description, bool saveMode,
                               std::vector<std::string>& results)
{
    const auto selector = service<IFileSelector>(m_context);
    const auto folder = create<IFilePath>(m_context);
    const auto chosen = create<IObjectList>(m_context);
    if (!selector || !folder || !chosen)
        throw Result::NotAvailable;

    FileType filter;
    fill(filter.extension, extension);
    fill(filter.description, description);
    const bool hasFilter = !extension.empty();
    const int32 filterCount = hasFilter ? 1 : 0;

    folder->setPath(HostString(startFolder).utf16(), 0);
    const int32 result =
        selector->select(HostString(title).utf16(), hasFilter ? &filter : nullptr, filterCount, filterCount,
                         folder.get(), saveMode ? IFileSelector::Save : IFileSelector::Open, chosen.get());
    if (result == IFileSelector::Cancelled)
        return;
    if (result != ResultOk)
        throw Result::NotAvailable;
    // All of them or none.
    const std::vector<std::string> paths = pathsOf(*chosen);
    results.insert(results.end(), paths.begin(), paths.end());
}

} // namespace cadrel::host
