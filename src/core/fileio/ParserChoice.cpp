// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/ParserChoice.h"

#include "core/fileio/CmxParser.h"
#include "util/FilePath.h"
#include "util/Result.h"

#include <array>
#include <filesystem>
#include <fstream>
#include <system_error>

namespace cadrel::core::fileio {

namespace {

constexpr std::size_t BeginningSize = 4096;

template <class Parser>
std::shared_ptr<ParserInterface> make()
{
    return std::make_shared<Parser>();
}

/// All formats that can be read. The one that takes any text stands last.
constexpr std::array<ParserMaker, 1> Formats{&make<CmxParser>};

/// Empty for what is no regular file, so that a pipe isn't waited for.
std::string beginningOf(const std::wstring& path)
try {
    const std::filesystem::path file = util::toFilePath(path);
    std::error_code error;
    if (!std::filesystem::is_regular_file(file, error))
        return {};
    std::string beginning(BeginningSize, '\0');
    std::ifstream stream(file, std::ios::binary);
    stream.read(beginning.data(), static_cast<std::streamsize>(beginning.size()));
    beginning.resize(static_cast<std::size_t>(stream.gcount()));
    return beginning;
} catch (util::Result::Type) {
    return {};
}

} // namespace

std::shared_ptr<ParserInterface> parserFor(const std::wstring& path)
{
    return parserFor(path, Formats);
}

std::shared_ptr<ParserInterface> parserFor(const std::wstring& path, std::span<const ParserMaker> formats)
{
    const std::string beginning = beginningOf(path);
    for (const ParserMaker format : formats.first(formats.size() - 1)) {
        std::shared_ptr<ParserInterface> parser = format();
        if (parser->recognises(beginning))
            return parser;
    }
    return formats.back()();
}

} // namespace cadrel::core::fileio
