// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/ParserChoice.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <string>
#include <sys/stat.h>

namespace cadrel::tests {
namespace {

using core::EventList;
using core::Framerate;
using core::fileio::CmxParser;
using core::fileio::parserFor;
using core::fileio::ParserInterface;
using core::fileio::ParserMaker;
using core::fileio::SourceLine;
using util::Result;

/// A format whose files begin with "SHOTS", and in which each line after that is the roll name of an event.
class ShotListParser : public ParserInterface {
public:
    Result::Type parse(const std::wstring&, EventList& events, Framerate& framerate, bool) override
    {
        events.add(std::make_shared<core::EventBase>());
        return detect(L"", framerate);
    }

    Result::Type detect(const std::wstring&, Framerate& framerate) override
    {
        framerate = Framerate(25, 0);
        return Result::Ok;
    }

    bool recognises(std::string_view beginning) const override { return beginning.starts_with("SHOTS"); }
    std::optional<SourceLine> rateLine() const override { return SourceLine{1, "SHOTS"}; }
    void readThoroughly() override {}
    const core::fileio::FileRemarks& remarks() const override { return m_remarks; }

private:
    core::fileio::FileRemarks m_remarks;
};

template <class Parser>
std::shared_ptr<ParserInterface> make()
{
    return std::make_shared<Parser>();
}

const std::array<ParserMaker, 2> Formats{&make<ShotListParser>, &make<CmxParser>};

bool isCmx(const std::shared_ptr<ParserInterface>& parser)
{
    return dynamic_cast<CmxParser*>(parser.get()) != nullptr;
}

TEST(ParserChoice, TakesTheFormatThatRecognisesTheContent)
{
    const TestProject project;
    const TempFolder folder;
    const std::wstring shots = widePath(folder.write("reel.edl", "SHOTS\nA001\n"));
    const std::wstring other = widePath(folder.write("reel.txt", "SHOT\nA001\n"));

    EXPECT_FALSE(isCmx(parserFor(shots, Formats)));
    EXPECT_TRUE(isCmx(parserFor(other, Formats)));
    EXPECT_TRUE(isCmx(parserFor(shots))) << "no such format is built in";
}

TEST(ParserChoice, TakesTheLastFormatForWhatCannotBeRead)
{
    const TestProject project;
    const TempFolder folder;
    const std::string pipe = folder / "pipe";
    ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);

    for (const std::wstring& path : {widePath(folder / "none.edl"), widePath(folder.path()), widePath(pipe),
                                     widePath(folder.write("empty.edl", "")), std::wstring(L"a\0b", 3)})
        EXPECT_TRUE(isCmx(parserFor(path, Formats)));
}

TEST(ParserChoice, AListIsLoadedWithWhateverParserItIsGiven)
{
    const TestProject project;
    const TempFolder folder;
    const std::wstring shots = widePath(folder.write("reel.shots", "SHOTS\n"));
    EventList events;
    Framerate shown;

    const auto parser = parserFor(shots, Formats);
    events.load(shots, shown, false, false, *parser);
    events.load(shots, shown, false, false, *parser);

    EXPECT_EQ(events.size(), 2U);
    EXPECT_EQ(shown.framesPerSecond, 25);
    EXPECT_EQ(parser->rateLine(), (SourceLine{1, "SHOTS"}));
}

} // namespace
} // namespace cadrel::tests
