// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cadrel::util {

/// Helpers for the two kinds of text: UTF-8 in the model and in files, and wide text for file names and for what the
/// user reads.
class StringUtil {
public:
    /// Converts between the two and translates; one object for the whole process.
    class StringConverterInterface {
    public:
        virtual std::string toUtf8(const std::wstring& text) const = 0;
        virtual std::wstring toWide(const std::string& text) const = 0;
        /// The text in the user's language.
        virtual std::wstring translate(const std::wstring& text) const = 0;

    protected:
        ~StringConverterInterface() = default;
    };

    /// Installs the converter, or removes it with null. Not owned.
    static void setConverter(const StringConverterInterface* converter);

    /// These four forward to the converter. They throw Result::NotAvailable when none is installed, and what the
    /// converter throws.
    static std::string toUtf8(const std::wstring& text);
    static std::wstring toWide(const std::string& text);
    static std::wstring translate(const std::wstring& text);
    /// UTF-8 with every byte outside the printable 7-bit characters replaced by "?".
    static std::string toPrintable(const std::wstring& text);

    /// Deletes the file; true on success. Needs the converter, as above.
    static bool removeFile(const std::wstring& path);

    /// Makes capitals of a to z; every other byte stays.
    static std::string toUpperAscii(std::string text);
    /// Without blanks, line feeds, tabs and carriage returns at both ends.
    static std::string trim(const std::string& text);
    static std::string_view trimView(std::string_view text);
    /// Splits at each `separator` and trims the pieces. With `dropEmpty`, pieces that are empty before trimming are
    /// left out. A separator at the very end gives no empty last piece.
    static std::vector<std::string> split(const std::string& text, char separator, bool dropEmpty);

    /// All path operations take the backslash as the separator when the path contains one, otherwise the slash.
    static wchar_t separatorOf(const std::wstring& path);
    /// Up to and including the last separator.
    static std::wstring directoryOf(const std::wstring& path);
    static std::wstring fileNameOf(const std::wstring& path);
    /// What comes after the last "." of the file name; empty without one.
    static std::wstring extensionOf(const std::wstring& path);
    /// The file name up to its last ".".
    static std::wstring baseNameOf(const std::wstring& path);
    /// Directory, base name, "_", the index in decimal, ".", extension.
    static std::wstring withIndex(const std::wstring& path, int index);
};

} // namespace cadrel::util
