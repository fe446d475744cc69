// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/StringUtil.h"

#include "util/Result.h"

#include <algorithm>
#include <filesystem>
#include <system_error>

namespace cadrel::util {

namespace {

bool isBlank(char character)
{
    return character == ' ' || character == '\n' || character == '\t' || character == '\r';
}

const StringUtil::StringConverterInterface* installedConverter = nullptr;

const StringUtil::StringConverterInterface& converter()
{
    if (installedConverter == nullptr)
        throw Result::NotAvailable;
    return *installedConverter;
}

/// Where the file name begins.
std::size_t fileNameStart(const std::wstring& path)
{
    const std::size_t separator = path.rfind(StringUtil::separatorOf(path));
    return separator == std::wstring::npos ? 0 : separator + 1;
}

} // namespace

void StringUtil::setConverter(const StringConverterInterface* newConverter)
{
    installedConverter = newConverter;
}

std::string StringUtil::toUtf8(const std::wstring& text)
{
    return converter().toUtf8(text);
}

std::wstring StringUtil::toWide(const std::string& text)
{
    return converter().toWide(text);
}

std::wstring StringUtil::translate(const std::wstring& text)
{
    return converter().translate(text);
}

std::string StringUtil::toPrintable(const std::wstring& text)
{
    std::string printable = toUtf8(text);
    const auto isUnprintable = [](char character) {
        const auto byte = static_cast<unsigned char>(character);
        return byte < 32 || byte >= 127;
    };
    std::replace_if(printable.begin(), printable.end(), isUnprintable, '?');
    return printable;
}

bool StringUtil::removeFile(const std::wstring& path)
{
    const std::string name = toUtf8(path);
    // The operating system would take the name up to the zero, which is another file.
    if (name.find('\0') != std::string::npos)
        return false;
    std::error_code error;
    const bool isFolder = std::filesystem::symlink_status(name, error).type() == std::filesystem::file_type::directory;
    return !isFolder && std::filesystem::remove(name, error);
}

std::string StringUtil::toUpperAscii(std::string text)
{
    for (char& character : text) {
        if (character >= 'a' && character <= 'z')
            character = static_cast<char>(character - 'a' + 'A');
    }
    return text;
}

std::string StringUtil::trim(const std::string& text)
{
    return std::string(trimView(text));
}

std::string_view StringUtil::trimView(std::string_view text)
{
    while (!text.empty() && isBlank(text.front()))
        text.remove_prefix(1);
    while (!text.empty() && isBlank(text.back()))
        text.remove_suffix(1);
    return text;
}

std::vector<std::string> StringUtil::split(const std::string& text, char separator, bool dropEmpty)
{
    std::vector<std::string> pieces;
    std::string_view rest = text;
    while (!rest.empty()) {
        const std::string_view piece = rest.substr(0, rest.find(separator));
        rest.remove_prefix(std::min(piece.size() + 1, rest.size()));
        if (!piece.empty() || !dropEmpty)
            pieces.emplace_back(trimView(piece));
    }
    return pieces;
}

wchar_t StringUtil::separatorOf(const std::wstring& path)
{
    return path.find(L'\\') != std::wstring::npos ? L'\\' : L'/';
}

std::wstring StringUtil::directoryOf(const std::wstring& path)
{
    return path.substr(0, fileNameStart(path));
}

std::wstring StringUtil::fileNameOf(const std::wstring& path)
{
    return path.substr(fileNameStart(path));
}

std::wstring StringUtil::extensionOf(const std::wstring& path)
{
    const std::wstring fileName = fileNameOf(path);
    const std::size_t dot = fileName.rfind(L'.');
    return dot == std::wstring::npos ? std::wstring() : fileName.substr(dot + 1);
}

std::wstring StringUtil::baseNameOf(const std::wstring& path)
{
    const std::wstring fileName = fileNameOf(path);
    return fileName.substr(0, fileName.rfind(L'.'));
}

std::wstring StringUtil::withIndex(const std::wstring& path, int index)
{
    return directoryOf(path) + baseNameOf(path) + L"_" + std::to_wstring(index) + L"." + extensionOf(path);
}

} // namespace cadrel::util
