// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <memory>
#include <span>
#include <string>

namespace cadrel::core::fileio {

class ParserInterface;

using ParserMaker = std::shared_ptr<ParserInterface> (*)();

/// A parser for a file: of the first format that recognises its content. CMX EDLs may hold any text, so they come last,
/// and for a file that can't be read there is their parser, too, whose `parse` then tells what is wrong.
std::shared_ptr<ParserInterface> parserFor(const std::wstring& path);

/// Of these formats. The last one is taken when none recognises the file.
std::shared_ptr<ParserInterface> parserFor(const std::wstring& path, std::span<const ParserMaker> formats);

} // namespace cadrel::core::fileio
