// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/PlainConverter.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "util/StringUtil.h"

#include <map>
#include <regex>
#include <string>

namespace cadrel::tests {

/// While it lives, texts are translated into German. The project that gives texts their converter has to be opened anew
/// afterwards.
class GermanTexts : public PlainConverter {
public:
    GermanTexts()
    {
        const std::string table = contentOf(treePath("resources/translation.xml"));
        const std::regex row(R"re(<text source="([^"]*)">([^<]*)</text>)re");
        for (std::sregex_iterator found(table.begin(), table.end(), row), end; found != end; ++found)
            m_texts[toWide((*found)[1])] = toWide((*found)[2]);
        util::StringUtil::setConverter(this);
    }
    ~GermanTexts() { util::StringUtil::setConverter(nullptr); }

    std::wstring translate(const std::wstring& text) const override
    {
        const auto found = m_texts.find(text);
        return found == m_texts.end() ? text : found->second;
    }

private:
    std::map<std::wstring, std::wstring> m_texts;
};

} // namespace cadrel::tests
