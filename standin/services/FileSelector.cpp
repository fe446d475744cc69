// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/FileSelector.h"

#include "standin/base/FilePath.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"

namespace standin {

using namespace Velmark;

int32 FileSelector::select(const char16_t* /*title*/, const FileType* filters, int32 filterCount, int32 sameCount,
                           IFilePath* path, int32 flags, IObjectList* chosen)
{
    const bool filtersFit = filterCount >= 0 && filterCount == sameCount && (filters || filterCount == 0);
    if (!filtersFit || !path || (flags != Open && flags != Save) || !chosen)
        return Failed;
    if (m_choices.empty())
        return Cancelled;

    const std::vector<std::u16string> files = std::move(m_choices.front());
    m_choices.pop_front();
    for (const std::u16string& file : files) {
        const Counted<IFilePath> chosenFile = makeCounted<FilePath>(file);
        if (chosen->add(chosenFile.get(), 0) != ResultOk)
            return Failed;
    }
    return files.empty() ? Cancelled : ResultOk;
}

} // namespace standin
