// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <string>

namespace standin {

/// The path of a file.
class FilePath : public Velmark::Implements<FilePath, Velmark::FObject, Velmark::IFilePath> {
public:
    static constexpr const char* ClassName = "FilePath";

    FilePath() = default;
    explicit FilePath(std::u16string path) : m_path(std::move(path)) {}

    Velmark::int32 setPath(const char16_t* path, Velmark::int32 flags) override;
    /// Refuses a path that is longer than the buffer.
    Velmark::int32 getPath(char16_t* buffer) override;

    const std::u16string& path() const { return m_path; }

private:
    std::u16string m_path;
};

} // namespace standin
