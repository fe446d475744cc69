// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/app/ProgramRun.h"

#include <gtest/gtest.h>
#include <sstream>
#include <string>
#include <vector>

namespace cadrel::tests {

/// An old and a new cut in a folder of their own, and their notes.
class Cuts {
public:
    Cuts(const std::string& oldText, const std::string& newText)
        : m_old(folder.write("old.edl", oldText)), m_new(folder.write("new.edl", newText))
    {
    }

    Outcome notes(const std::vector<std::string>& more = {}) const
    {
        std::vector<std::string> arguments{"notes", "--old", m_old, "--new", m_new};
        arguments.insert(arguments.end(), more.begin(), more.end());
        return runCadrel(arguments);
    }

    /// The notes in the form of that extension.
    std::string file(const std::string& extension, std::vector<std::string> more = {}) const
    {
        const std::string path = folder / ("notes" + extension);
        more.insert(more.end(), {"-o", path});
        const Outcome outcome = notes(more);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        EXPECT_EQ(outcome.out, "");
        return contentOf(path);
    }

    const TempFolder folder;

private:
    const std::string m_old;
    const std::string m_new;
};

/// A text with a single blank wherever there are blanks or line ends.
inline std::string unbroken(const std::string& text)
{
    std::istringstream stream(text);
    std::string all;
    for (std::string word; stream >> word;)
        all.append(all.empty() ? "" : " ").append(word);
    return all;
}

inline std::string textOfPdf(const std::string& file)
{
    const Outcome outcome = runProgram("pdftotext", {"-layout", file, "-"});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return outcome.out;
}

} // namespace cadrel::tests
