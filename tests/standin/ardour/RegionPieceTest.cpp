// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/RegionPiece.h"

#include "standin/project/ClipEvent.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>
#include <rapidcheck/gtest.h>

namespace standin::tests {

namespace {

SessionClock clockAt(const std::string& rate)
{
    pugi::xml_document document;
    document.load_string(("<Session version=\"7002\" sample-rate=\"" + rate + "\"/>").c_str());
    return SessionClock(document.document_element());
}

/// An event that plays a region from `head` to `tail`, both in seconds of the programme before it moved by `moved`.
Velmark::Counted<ClipEvent> eventOf(const ArdourSession::Region& region, const SessionClock& clock, double head,
                                    double tail, double moved)
{
    auto event = Velmark::makeCounted<ClipEvent>();
    event->setSpan(head + moved, tail + moved);
    event->setSourceOffset(clock.secondsOf(region.start) + head - clock.secondsOf(region.position));
    return event;
}

constexpr ArdourSession::Region Whole{{}, 1000, 10000, 500};

TEST(RegionPiece, IsAllOfARegionThatOnlyMoved)
{
    const SessionClock clock = clockAt("48000");
    const auto event = eventOf(Whole, clock, 1000 / 48000.0, 11000 / 48000.0, 1.0);
    const auto pieces = piecesOf(Whole, {event.get()}, clock);
    ASSERT_EQ(pieces.size(), 1U);
    EXPECT_EQ(pieces[0].position, 49000);
    EXPECT_EQ(pieces[0].length, 10000);
    EXPECT_EQ(pieces[0].start, 500);
    EXPECT_EQ(pieces[0].head, RegionEdge::Old);
    EXPECT_EQ(pieces[0].tail, RegionEdge::Old);
    EXPECT_FALSE(pieces[0].isAll(Whole));
}

TEST(RegionPiece, HasANewEdgeWhereTheRegionWasCut)
{
    const SessionClock clock = clockAt("48000");
    const auto event = eventOf(Whole, clock, 3000 / 48000.0, 4000 / 48000.0, 1.0);
    const auto pieces = piecesOf(Whole, {event.get()}, clock);
    ASSERT_EQ(pieces.size(), 1U);
    EXPECT_EQ(pieces[0].start, 2500);
    EXPECT_EQ(pieces[0].length, 1000);
    EXPECT_EQ(pieces[0].head, RegionEdge::New);
    EXPECT_EQ(pieces[0].tail, RegionEdge::New);
}

TEST(RegionPiece, HasASeamWhereItsOtherHalfFollows)
{
    const SessionClock clock = clockAt("48000");
    const auto head = eventOf(Whole, clock, 1000 / 48000.0, 4000 / 48000.0, 1.0);
    const auto tail = eventOf(Whole, clock, 4000 / 48000.0, 11000 / 48000.0, 1.0);
    const auto other = eventOf(Whole, clock, 4000 / 48000.0, 11000 / 48000.0, 5.0);
    auto pieces = piecesOf(Whole, {head.get(), tail.get()}, clock);
    ASSERT_EQ(pieces.size(), 2U);
    EXPECT_EQ(pieces[0].tail, RegionEdge::Seam);
    EXPECT_EQ(pieces[1].head, RegionEdge::Seam);
    pieces = piecesOf(Whole, {head.get(), other.get()}, clock);
    EXPECT_EQ(pieces[0].tail, RegionEdge::New);
    EXPECT_EQ(pieces[1].head, RegionEdge::New);
}

TEST(RegionPiece, IsNoneWhenItPlaysNotASample)
{
    const SessionClock clock = clockAt("48000");
    const auto event = eventOf(Whole, clock, 3000.1 / 48000.0, 3000.3 / 48000.0, 1.0);
    EXPECT_TRUE(piecesOf(Whole, {event.get()}, clock).empty());
}

/// Cuts at frames of 30000/1001 a second don't fall on samples; all pieces of a stretch move by the same samples, and leave
/// neither a hole nor an overlap.
RC_GTEST_PROP(RegionPieceLaw, AllOfAStretchMovesByTheSameSamplesAndStaysWhole, ())
{
    const SessionClock clock = clockAt(*rc::gen::element<std::string>("44100", "48000", "96000"));
    const double frame = 1001.0 / 30000.0;
    ArdourSession::Region region{
        {}, *rc::gen::inRange(0, 1000000), *rc::gen::inRange(1, 1000000), *rc::gen::inRange(0, 100000)};
    const double start = clock.secondsOf(region.position);
    const double end = clock.secondsOf(region.position + region.length);
    const int last = static_cast<int>(end / frame);
    const int cut = *rc::gen::inRange(0, last + 2);
    const double moved = *rc::gen::inRange(0, 100000) * frame;
    const double middle = std::clamp(cut * frame, start, end);
    const auto head = eventOf(region, clock, start, middle, moved);
    const auto tail = eventOf(region, clock, middle, end, moved);
    const auto pieces = piecesOf(region, {head.get(), tail.get()}, clock);
    std::int64_t length = 0;
    for (const RegionPiece& piece : pieces) {
        RC_ASSERT(piece.position - piece.start == pieces.front().position - pieces.front().start);
        RC_ASSERT(piece.position == pieces.front().position + length);
        RC_ASSERT(piece.start >= region.start);
        length += piece.length;
    }
    RC_ASSERT(length == region.length);
    RC_ASSERT(pieces.front().position - region.position == clock.samplesOf(moved));
}

/// The element of a region of 10,000 samples from 1,000, of which a piece is cut.
class CutRegion : public testing::Test {
protected:
    std::int64_t edgeFade = ArdourSession::DefaultFade;

    pugi::xml_node cut(const std::string& content, const RegionPiece& piece, const std::string& attributes = "")
    {
        m_document.load_string(("<Region start=\"a2940000\" length=\"a58800000@a5880000\" sync-position=\"a2940000\" "
                                "sync-marked=\"0\" default-fade-in=\"0\" default-fade-out=\"0\" fade-in-active=\"1\" "
                                "fade-out-active=\"1\" whole-file=\"1\" " +
                                attributes + ">" + content + "</Region>")
                                   .c_str());
        pugi::xml_node element = m_document.document_element();
        cutRegion(element, Whole, piece, clockAt("48000"), edgeFade, [this] { return m_nextId++; });
        return element;
    }
    static std::string fade(const std::string& name, long samples, const std::string& values = "0 1")
    {
        return "<" + name +
               "><AutomationList id=\"7\" interpolation-style=\"Curved\" time-domain=\"AudioTime\"><events>a0 " +
               values.substr(0, 1) + "\na" + std::to_string(samples * 5880) + " " + values.substr(2) +
               "\n</events></AutomationList></" + name + ">";
    }
    static long lengthOf(const pugi::xml_node& element, const char* name)
    {
        const std::string events = element.child(name).child("AutomationList").child("events").text().get();
        const std::size_t last = events.rfind('\n', events.size() - 2) + 1;
        return std::stol(events.substr(last + 1)) / 5880;
    }

private:
    pugi::xml_document m_document;
    SessionId m_nextId = 900;
};

TEST_F(CutRegion, HasThePlaceOfItsPiece)
{
    const pugi::xml_node element = cut("", {48000, 1000, 2500, RegionEdge::New, RegionEdge::New});
    EXPECT_STREQ(element.attribute("length").value(), "a5880000@a282240000");
    EXPECT_STREQ(element.attribute("start").value(), "a14700000");
    EXPECT_STREQ(element.attribute("sync-position").value(), "a14700000");
    EXPECT_STREQ(element.attribute("whole-file").value(), "0");
}

TEST_F(CutRegion, KeepsASyncPointThatItStillHas)
{
    const RegionPiece piece{48000, 1000, 2500, RegionEdge::New, RegionEdge::New};
    const pugi::xml_node kept = cut("", piece);
    EXPECT_STREQ(kept.attribute("sync-marked").value(), "0");
    pugi::xml_document document;
    document.load_string("<Region start=\"a2940000\" length=\"a58800000@a5880000\" sync-marked=\"1\" "
                         "sync-position=\"a17640000\"/>");
    pugi::xml_node element = document.document_element();
    cutRegion(element, Whole, piece, clockAt("48000"), edgeFade, [] { return 1; });
    EXPECT_STREQ(element.attribute("sync-marked").value(), "1");
    EXPECT_STREQ(element.attribute("sync-position").value(), "a17640000");
    document.load_string("<Region start=\"a2940000\" length=\"a58800000@a5880000\" sync-marked=\"1\" "
                         "sync-position=\"a3000000\"/>");
    element = document.document_element();
    cutRegion(element, Whole, piece, clockAt("48000"), edgeFade, [] { return 1; });
    EXPECT_STREQ(element.attribute("sync-marked").value(), "0");
}

TEST_F(CutRegion, KeepsTheFadeOfTheEdgeThatItHasAndGetsAShortOneAtTheOther)
{
    const pugi::xml_node element =
        cut(fade("FadeIn", 800) + fade("FadeOut", 900), {48000, 5000, 500, RegionEdge::Old, RegionEdge::New});
    EXPECT_EQ(lengthOf(element, "FadeIn"), 800);
    EXPECT_STREQ(element.attribute("default-fade-in").value(), "0");
    EXPECT_FALSE(element.child("FadeOut"));
    EXPECT_STREQ(element.attribute("default-fade-out").value(), "1");
}

TEST_F(CutRegion, FadesAtANewEdgeEvenWhereTheUserHadNoFade)
{
    const pugi::xml_node element = cut("", {48000, 5000, 600, RegionEdge::New, RegionEdge::Old});
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "1");
}

TEST_F(CutRegion, FadesAtANewEdgeAsLongAsTheUserWants)
{
    edgeFade = 480;
    const pugi::xml_node element =
        cut(fade("FadeIn", 800), {48000, 5000, 600, RegionEdge::New, RegionEdge::New}, "id=\"51\"");
    EXPECT_EQ(lengthOf(element, "FadeIn"), 480);
    EXPECT_EQ(lengthOf(element, "FadeOut"), 480);
    EXPECT_EQ(lengthOf(element, "InverseFadeOut"), 480);
    EXPECT_STREQ(element.attribute("default-fade-in").value(), "0");
    EXPECT_STREQ(element.child("FadeOut").child("AutomationList").attribute("automation-id").value(), "fadeout");
}

TEST_F(CutRegion, HasNoFadeAtANewEdgeWhenTheUserWantsNone)
{
    edgeFade = 0;
    const pugi::xml_node element = cut(fade("FadeIn", 800), {48000, 5000, 600, RegionEdge::New, RegionEdge::New});
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "0");
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "0");
}

TEST_F(CutRegion, HasNoFadeAtASeam)
{
    const pugi::xml_node element = cut(fade("FadeIn", 800), {48000, 5000, 600, RegionEdge::Seam, RegionEdge::Seam});
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "0");
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "0");
}

TEST_F(CutRegion, HasFadesThatFitIntoIt)
{
    for (const long length : {1L, 2L, 10L, 127L, 128L, 129L, 863L, 864L, 865L, 5000L}) {
        const pugi::xml_node element = cut(fade("FadeIn", 800), {48000, length, 500, RegionEdge::Old, RegionEdge::New});
        const long in =
            std::string(element.attribute("fade-in-active").value()) == "0" ? 0 : lengthOf(element, "FadeIn");
        const bool isShort = element.child("FadeOut");
        const long out = std::string(element.attribute("fade-out-active").value()) == "0" ? 0
                         : isShort                                                        ? lengthOf(element, "FadeOut")
                                                                                          : 64;
        EXPECT_LE(in + out, length) << length;
        if (length >= 864) {
            EXPECT_EQ(in, 800);
            EXPECT_EQ(out, 64);
        }
    }
}

TEST_F(CutRegion, CutsItsGainEnvelopeAndCountsItFromItsOwnStart)
{
    const std::string envelope = "<Envelope><AutomationList id=\"8\" interpolation-style=\"Linear\"><events>"
                                 "a0 1\na29400000 0.5\na58800000 1\n</events></AutomationList></Envelope>";
    const pugi::xml_node element = cut(envelope, {48000, 5000, 3000, RegionEdge::New, RegionEdge::New});
    // From sample 2,500 of the region to 7,500, with the middle at 5,000.
    EXPECT_STREQ(element.child("Envelope").child("AutomationList").child("events").text().get(),
                 "a0 0.75\na14700000 0.5\na29400000 0.75\n");
}

TEST_F(CutRegion, BeginsWithTheValueAfterAStepOfItsEnvelopeAndEndsWithTheOneBefore)
{
    // A step from 0.5 to 0.25 at sample 5,000 of the region.
    const std::string envelope =
        "<Envelope><AutomationList id=\"8\" interpolation-style=\"Linear\"><events>"
        "a0 1\na29400000 0.5\na29400000 0.25\na58800000 2\n</events></AutomationList></Envelope>";
    const auto eventsOf = [](const pugi::xml_node& element) {
        return std::string(element.child("Envelope").child("AutomationList").child("events").text().get());
    };
    EXPECT_EQ(eventsOf(cut(envelope, {48000, 5000, 5500, RegionEdge::New, RegionEdge::Old})), "a0 0.25\na29400000 2\n");
    EXPECT_EQ(eventsOf(cut(envelope, {48000, 5000, 500, RegionEdge::Old, RegionEdge::New})), "a0 1\na29400000 0.5\n");
}

TEST_F(CutRegion, KeepsFadesThatOverlapWhereItIsWhole)
{
    const RegionPiece moved{48000, 10000, 500, RegionEdge::Old, RegionEdge::Old};
    const pugi::xml_node element = cut(fade("FadeIn", 7000) + fade("FadeOut", 8000), moved);
    EXPECT_EQ(lengthOf(element, "FadeIn"), 7000);
    EXPECT_EQ(lengthOf(element, "FadeOut"), 8000);
}

TEST_F(CutRegion, InterpolatesAnEnvelopeOfGainAsAFader)
{
    const std::string envelope = "<Envelope><AutomationList id=\"8\" interpolation-style=\"Exponential\"><events>"
                                 "a0 1\na58800000 0\n</events></AutomationList></Envelope>";
    const pugi::xml_node element = cut(envelope, {48000, 5000, 5500, RegionEdge::New, RegionEdge::Old});
    // Half the travel of a fader at gain 1: 198 (1/2)^(1/8) 192/198 - 192 is -15.93 by the formula, over 6.
    const std::string events = element.child("Envelope").child("AutomationList").child("events").text().get();
    EXPECT_NEAR(std::stod(events.substr(3)), std::exp2(192.0 * (std::pow(0.5, 0.125) - 1.0) / 6.0), 1e-9);
}

} // namespace

} // namespace standin::tests
