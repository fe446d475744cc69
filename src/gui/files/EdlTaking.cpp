// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/EdlTaking.h"

#include "gui/files/EdlFile.h"
#include "gui/files/TakenFiles.h"
#include "gui/services/AlertWindowBase.h"
#include "util/FilledText.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

#include <cstdint>

namespace cadrel::gui {

using util::Result;
using util::StringUtil;

namespace {

/// Of the unread lines of a file in an alert; the rest is counted.
constexpr std::size_t MostLinesOfAnAlert = 5;

constexpr std::int32_t Abort = 2;

void tell(const std::wstring& message)
{
    AlertWindowBase::instance().show(message, {}, {}, {});
}

std::wstring about(const std::wstring& sentence, const std::string& path)
{
    return util::filled(StringUtil::translate(sentence), util::toShownLine(path));
}

std::unique_ptr<EdlFile> readEdl(const std::string& path, std::int32_t listKind, bool renameBRolls)
{
    try {
        return std::make_unique<EdlFile>(path, listKind, renameBRolls);
    } catch (Result::Type) {
        return nullptr;
    }
}

/// The questions about one file.
class FileCheck {
public:
    FileCheck(const EdlFile& file, const std::weak_ptr<TakenFiles>& taken) : m_file(file), m_taken(taken) {}

    /// Whether the file is to be taken.
    bool isPassed() const { return fitsRate() && isReadable() && isWholeEnough(); }

private:
    /// Whether the user goes on, and there still is what the file is for.
    bool ask(const std::wstring& message) const
    {
        return AlertWindowBase::instance().show(message, L"Continue", L"Abort", {}) != Abort && !m_taken.expired();
    }

    bool fitsRate() const
    {
        if (m_file.hasOtherRate())
            return ask(about(L"Frame rate mismatch between current project and loaded EDL %s", m_file.path()));
        return !m_file.hasInvalidTimecodes() ||
               ask(about(L"Some timecodes in the loaded EDL file %s do not match the current project frame rate.",
                         m_file.path()));
    }

    bool isReadable() const
    {
        if (m_file.hasReadableEvent())
            return true;
        const std::wstring unread = m_file.unreadText(MostLinesOfAnAlert);
        tell(about(L"The loaded EDL file %s does not contain valid entries.", m_file.path()) +
             (unread.empty() ? L"" : L"\n\n" + unread));
        return false;
    }

    bool isWholeEnough() const
    {
        return !m_file.hasUnreadLines() ||
               ask(about(L"Some lines of the EDL file %s could not be read:", m_file.path()) + L"\n\n" +
                   m_file.unreadText(MostLinesOfAnAlert));
    }

    const EdlFile& m_file;
    const std::weak_ptr<TakenFiles>& m_taken;
};

} // namespace

void takeEdls(const std::weak_ptr<TakenFiles>& taken, const std::vector<std::string>& paths, bool renameBRolls)
{
    for (const std::string& path : paths) {
        if (taken.expired())
            return;
        const std::unique_ptr<EdlFile> file = readEdl(path, taken.lock()->listKind(), renameBRolls);
        if (!file)
            tell(StringUtil::translate(L"An error occurred while loading the file.") + L"\n\n" +
                 util::toShownLine(path));
        else if (FileCheck(*file, taken).isPassed())
            taken.lock()->take(*file);
    }
}

} // namespace cadrel::gui
