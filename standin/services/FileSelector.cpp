// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/FileSelector.h"

#include "standin/base/FilePath.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/FieldText.h"

#include <array>

namespace standin {

using namespace Velmark;

namespace {

UserBoxes::FileQuestion questionOf(const char16_t* title, const FileType* filters, int32 filterCount, IFilePath& path,
                                   bool isSave)
{
    UserBoxes::FileQuestion question;
    question.title = title ? title : u"";
    question.isSave = isSave;
    for (int32 index = 0; index < filterCount; ++index)
        question.filters.push_back(
            {std::string(textOf(filters[index].extension)), std::string(textOf(filters[index].description))});
    std::array<char16_t, IFilePath::Capacity> folder{};
    if (path.getPath(folder.data()) == ResultOk)
        question.folder = folder.data();
    return question;
}

} // namespace

int32 FileSelector::select(const char16_t* title, const FileType* filters, int32 filterCount, int32 sameCount,
                           IFilePath* path, int32 flags, IObjectList* chosen)
{
    const bool filtersFit = filterCount >= 0 && filterCount == sameCount && (filters || filterCount == 0);
    if (!filtersFit || !path || (flags != Open && flags != Save) || !chosen)
        return Failed;
    const std::vector<std::u16string> files =
        m_boxes ? m_boxes->chooseFiles(questionOf(title, filters, filterCount, *path, flags == Save)) : nextChoice();
    for (const std::u16string& file : files) {
        const Counted<IFilePath> chosenFile = makeCounted<FilePath>(file);
        if (chosen->add(chosenFile.get(), 0) != ResultOk)
            return Failed;
    }
    return files.empty() ? Cancelled : ResultOk;
}

std::vector<std::u16string> FileSelector::nextChoice()
{
    if (m_choices.empty())
        return {};
    std::vector<std::u16string> files = std::move(m_choices.front());
    m_choices.pop_front();
    return files;
}

} // namespace standin
