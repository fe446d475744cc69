// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/services/UserBoxes.h"
#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

#include <deque>
#include <string>
#include <vector>

namespace standin {

/// File boxes. Without boxes nobody sees them: each answers the next of the choices that were made beforehand.
class FileSelector : public Velmark::Implements<FileSelector, Velmark::FObject, Velmark::IFileSelector> {
public:
    static constexpr const char* ClassName = "FileSelector";

    /// What select answers to arguments that it can't work with.
    static constexpr Velmark::int32 Failed = 2;

    /// Not owned; null for none.
    void setBoxes(UserBoxes* boxes) { m_boxes = boxes; }
    /// What the user chooses in the next box for which there is no choice yet. No files cancel it.
    void choose(std::vector<std::u16string> files) { m_choices.push_back(std::move(files)); }

    /// Cancelled when there is no choice left.
    Velmark::int32 select(const char16_t* title, const Velmark::FileType* filters, Velmark::int32 filterCount,
                          Velmark::int32 sameCount, Velmark::IFilePath* path, Velmark::int32 flags,
                          Velmark::IObjectList* chosen) override;

private:
    std::vector<std::u16string> nextChoice();

    UserBoxes* m_boxes = nullptr;
    std::deque<std::vector<std::u16string>> m_choices;
};

} // namespace standin
