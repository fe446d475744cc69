// SPDX-License-Identifier: GPL-3.0-or-later

// The page that describes the project file.

#include "standin/stage/ProjectKeys.h"
#include "tests/standin/file/ProjectText.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <string>

namespace standin::tests {

namespace {

std::string page()
{
    return cadrel::tests::contentOf(cadrel::tests::treePath("docs/project-file.md"));
}

/// What stands between the first line of that kind and the end of the block.
std::string firstBlock(const std::string& text, const std::string& opening)
{
    const std::size_t begin = text.find(opening) + opening.size();
    return text.substr(begin, text.find("```\n", begin) - begin);
}

TEST(ProjectFilePage, ShowsAFileAsItIsWritten)
{
    const std::string example = firstBlock(page(), "```json\n");

    EXPECT_EQ(ProjectTexts().textAgain(example), example);
}

TEST(ProjectFilePage, ExplainsEveryKey)
{
    const std::string text = page();
    const auto isExplained = [&](std::string_view key) {
        return text.find(std::string("`").append(key).append("`")) != std::string::npos;
    };

    for (const KnownKeys keys : {KnownKeys(ProjectKeys), KnownKeys(PoolClipKeys), KnownKeys(TrackKeys),
                                 KnownKeys(CurveKeys), KnownKeys(PointKeys), KnownKeys(EventKeys)}) {
        for (const std::string_view key : keys)
            EXPECT_TRUE(isExplained(key)) << key;
    }
    EXPECT_FALSE(isExplained("nothing"));
}

TEST(ProjectFilePage, ShowsAFaultAsItIsTold)
{
    const std::string event = R"({"kind": "clip", "start": 2, "end": 1})";
    const std::string track = R"({"kind": "audio", "events": []})";
    std::string events;
    for (int index = 0; index < 17; ++index)
        events += R"({"kind": "clip", "start": 0, "end": 1}, )";

    const std::string fault =
        ProjectTexts().faultOf(projectWith("\"tracks\": [" + track + ", " + track + ", " + track +
                                           R"(, {"kind": "audio", "events": [)" + events + event + "]}]"));

    EXPECT_NE(page().find(std::string("reel3.stage").append(fault, fault.find(':'))), std::string::npos) << fault;
}

} // namespace

} // namespace standin::tests
