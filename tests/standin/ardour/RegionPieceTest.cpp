// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/RegionPiece.h"

#include "standin/ardour/FadeCurve.h"

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
    const auto edgesOf = [&](const std::vector<const ClipEvent*>& events) {
        std::vector<RegionPieces> playlist{{Whole, piecesOf(Whole, events, clock)}};
        findSeams(playlist);
        const auto& pieces = playlist.front().pieces;
        return std::vector{pieces.at(0).head, pieces.at(0).tail, pieces.at(1).head, pieces.at(1).tail};
    };
    using enum RegionEdge;
    EXPECT_EQ(edgesOf({head.get(), tail.get()}), (std::vector{Old, Seam, Seam, Old}));
    EXPECT_EQ(edgesOf({head.get(), other.get()}), (std::vector{Old, New, New, Old}));
}

/// A region at a place, with a sample from `start` on, and what it is after a run that leaves it there.
RegionPieces left(const ArdourSession::Region& region)
{
    const SessionClock clock = clockAt("48000");
    const auto event =
        eventOf(region, clock, clock.secondsOf(region.position), clock.secondsOf(region.position + region.length), 0.0);
    return {region, piecesOf(region, {event.get()}, clock)};
}

TEST(RegionPiece, HasASeamWhereAnotherRegionFollowsThatWasCutFromTheSame)
{
    constexpr CutMark Cut{RegionEdge::New, 64};
    const ArdourSession::Region first{{}, 1000, 3000, 500, 11, {}, Cut};
    const ArdourSession::Region second{{}, 4000, 7000, 3500, 11, Cut, {}};
    const auto edgesOf = [&](const ArdourSession::Region& next) {
        std::vector<RegionPieces> playlist{left(first), left(next)};
        findSeams(playlist);
        return std::pair(playlist[0].pieces.at(0).tail, playlist[1].pieces.at(0).head);
    };
    using enum RegionEdge;
    EXPECT_EQ(edgesOf(second), std::pair(Seam, Seam));
    ArdourSession::Region other = second;
    other.source = 12;
    EXPECT_EQ(edgesOf(other), std::pair(New, New));
    other = second;
    other.start = 3501;
    EXPECT_EQ(edgesOf(other), std::pair(New, New));
    other = second;
    other.position = 4001;
    EXPECT_EQ(edgesOf(other), std::pair(New, New));
    // The user himself has put them together.
    other = second;
    other.head.reset();
    EXPECT_EQ(edgesOf(other), std::pair(New, Old));
}

TEST(RegionPiece, KeepsAnEdgeThatIsAsItWasBeforeTheRun)
{
    constexpr CutMark Cut{RegionEdge::New, 64};
    const ArdourSession::Region first{{}, 1000, 3000, 500, 11, {}, Cut};
    const ArdourSession::Region second{{}, 4000, 7000, 3500, 11, Cut, {}};
    const auto isAll = [&](std::int64_t moved) {
        std::vector<RegionPieces> playlist{left(first), left(second)};
        playlist[1].pieces.at(0).position += moved;
        findSeams(playlist);
        return std::pair(playlist[0].pieces.at(0).isAll(first), playlist[1].pieces.at(0).keepsHead());
    };
    // The user himself may have put them together, with the fades that they have.
    EXPECT_EQ(isAll(0), std::pair(true, true));
    EXPECT_EQ(isAll(1), std::pair(false, false));

    // The user may have taken the other piece away.
    std::vector<RegionPieces> alone{left(second)};
    findSeams(alone);
    EXPECT_TRUE(alone[0].pieces.at(0).isAll(second));
}

TEST(RegionPiece, IsNoneWhenItPlaysNotASample)
{
    const SessionClock clock = clockAt("48000");
    const auto event = eventOf(Whole, clock, 3000.1 / 48000.0, 3000.3 / 48000.0, 1.0);
    EXPECT_TRUE(piecesOf(Whole, {event.get()}, clock).empty());
}

/// What is played of the region when the programme is cut at a place, in samples, and its parts move apart.
std::vector<RegionPiece> cutAt(double place, const ArdourSession::Region& region = Whole)
{
    const SessionClock clock = clockAt("48000");
    const double start = clock.secondsOf(region.position);
    const double end = clock.secondsOf(region.position + region.length);
    const auto head = eventOf(region, clock, start, place / 48000.0, 1.0);
    const auto tail = eventOf(region, clock, place / 48000.0, end, 5.0);
    return piecesOf(region, {head.get(), tail.get()}, clock);
}

TEST(RegionPiece, IsAllOfARegionThatIsCutLessThanTwoSamplesFromItsEdge)
{
    for (const double place : {1000.2, 1000.8, 1001.9}) {
        const auto pieces = cutAt(place);
        ASSERT_EQ(pieces.size(), 1U) << place;
        EXPECT_EQ(pieces[0].position, 1000 + 240000);
        EXPECT_EQ(pieces[0].length, 10000);
        EXPECT_EQ(pieces[0].head, RegionEdge::Old);
    }
    for (const double place : {10998.1, 10999.2, 10999.8}) {
        const auto pieces = cutAt(place);
        ASSERT_EQ(pieces.size(), 1U) << place;
        EXPECT_EQ(pieces[0].position, 1000 + 48000);
        EXPECT_EQ(pieces[0].length, 10000);
        EXPECT_EQ(pieces[0].tail, RegionEdge::Old);
    }
    for (const double place : {1002.0, 1002.1, 10997.9, 10998.0})
        EXPECT_EQ(cutAt(place).size(), 2U) << place;
}

TEST(RegionPiece, IsPlayedOnceHoweverShortItsRegionIs)
{
    for (const std::int64_t length : {1, 2, 3, 4, 5}) {
        const ArdourSession::Region region{{}, 1000, length, 500};
        for (int tenth = 0; tenth <= 10 * length; ++tenth) {
            std::int64_t played = 0;
            for (const RegionPiece& piece : cutAt(1000.0 + tenth / 10.0, region))
                played += piece.length;
            EXPECT_EQ(played, length) << tenth;
        }
    }
}

TEST(RegionPiece, IsCutAtTheSameSampleOnBothSides)
{
    const SessionClock clock = clockAt("48000");
    // 3,200.6 samples lie nearer to 3,201; so does 800.8 by which the second part has moved, to 801.
    const auto head = eventOf(Whole, clock, 1000 / 48000.0, 3200.6 / 48000.0, 0.0);
    const auto tail = eventOf(Whole, clock, 3200.6 / 48000.0, 11000 / 48000.0, 800.8 / 48000.0);
    const auto pieces = piecesOf(Whole, {head.get(), tail.get()}, clock);
    ASSERT_EQ(pieces.size(), 2U);
    EXPECT_EQ(pieces[0].start + pieces[0].length, 500 + 2201);
    EXPECT_EQ(pieces[1].start, 500 + 2201);
    EXPECT_EQ(pieces[1].position, 3201 + 801);
}

TEST(RegionPiece, MovesByTheSameSamplesThereAndBack)
{
    const SessionClock clock = clockAt("48000");
    const auto there = eventOf(Whole, clock, 1000 / 48000.0, 11000 / 48000.0, 800.5 / 48000.0);
    EXPECT_EQ(piecesOf(Whole, {there.get()}, clock).at(0).position, 1801);
    const ArdourSession::Region moved{{}, 1801, 10000, 500};
    const auto back = eventOf(moved, clock, 1801 / 48000.0, 11801 / 48000.0, -800.5 / 48000.0);
    EXPECT_EQ(piecesOf(moved, {back.get()}, clock).at(0).position, 1000);
}

TEST(RegionPiece, BeginsNotBeforeTheSession)
{
    const SessionClock clock = clockAt("48000");
    const auto event = eventOf(Whole, clock, 1001.4 / 48000.0, 11000 / 48000.0, -1001.4 / 48000.0);
    const auto pieces = piecesOf(Whole, {event.get()}, clock);
    ASSERT_EQ(pieces.size(), 1U);
    EXPECT_EQ(pieces[0].position, 0);
    EXPECT_EQ(pieces[0].start, 501);
    EXPECT_EQ(pieces[0].length, 9999);
}

TEST(RegionPiece, StaysWithoutASampleWhereItsRegionHasNone)
{
    const ArdourSession::Region none{{}, 1000, 0, 500};
    const SessionClock clock = clockAt("48000");
    const auto left = eventOf(none, clock, 1000 / 48000.0, 1000 / 48000.0, 0.0);
    const auto pieces = piecesOf(none, {left.get()}, clock);
    ASSERT_EQ(pieces.size(), 1U);
    EXPECT_TRUE(pieces[0].isAll(none));
    const auto moved = eventOf(none, clock, 1000 / 48000.0, 1000 / 48000.0, 1.0);
    EXPECT_TRUE(piecesOf(none, {moved.get()}, clock).empty());
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

    ArdourSession::Region region = Whole;

    pugi::xml_node cut(const std::string& content, const RegionPiece& piece, const std::string& attributes = "")
    {
        m_document.load_string(("<Region start=\"a2940000\" length=\"a58800000@a5880000\" sync-position=\"a2940000\" "
                                "sync-marked=\"0\" default-fade-in=\"0\" default-fade-out=\"0\" fade-in-active=\"1\" "
                                "fade-out-active=\"1\" whole-file=\"1\" " +
                                attributes + ">" + content + "</Region>")
                                   .c_str());
        pugi::xml_node element = m_document.document_element();
        cutRegion(element, region, piece, clockAt("48000"), edgeFade, [this] { return m_nextId++; });
        return element;
    }
    /// A fade that an element has.
    static FadeCurve curveOf(const pugi::xml_node& element, const char* name)
    {
        return {element.child(name).child("AutomationList"), clockAt("48000")};
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
        cut(fade("FadeIn", 800), {48000, 5000, 1300, RegionEdge::New, RegionEdge::New}, "id=\"51\"");
    EXPECT_EQ(lengthOf(element, "FadeIn"), 480);
    EXPECT_EQ(lengthOf(element, "FadeOut"), 480);
    EXPECT_EQ(lengthOf(element, "InverseFadeOut"), 480);
    EXPECT_STREQ(element.attribute("default-fade-in").value(), "0");
    EXPECT_STREQ(element.child("FadeOut").child("AutomationList").attribute("automation-id").value(), "fadeout");
}

TEST_F(CutRegion, HasNoFadeAtANewEdgeWhenTheUserWantsNone)
{
    edgeFade = 0;
    const pugi::xml_node element = cut(fade("FadeIn", 800), {48000, 5000, 1300, RegionEdge::New, RegionEdge::New});
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "0");
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "0");
}

TEST_F(CutRegion, HasNoFadeAtASeam)
{
    const pugi::xml_node element = cut(fade("FadeIn", 800), {48000, 5000, 1300, RegionEdge::Seam, RegionEdge::Seam});
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "0");
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "0");
}

TEST_F(CutRegion, GoesOnWithTheRestOfAFadeThatWasCut)
{
    // 100 samples into a fade of 800.
    const pugi::xml_node element = cut(fade("FadeIn", 800) + fade("InverseFadeIn", 800, "1 0"),
                                       {48000, 5000, 600, RegionEdge::New, RegionEdge::New});
    const FadeCurve in = curveOf(element, "FadeIn");
    EXPECT_EQ(lengthOf(element, "FadeIn"), 700);
    EXPECT_EQ(in.at(0.0), 0.0);
    // Half of the short fade over the cut, over 132 of 800 samples.
    EXPECT_NEAR(in.at(32.0), 0.70711 * 132 / 800, 1e-5);
    EXPECT_NEAR(in.at(64.0), 164.0 / 800, 1e-9);
    EXPECT_NEAR(in.at(350.0), 450.0 / 800, 1e-6);
    EXPECT_NEAR(in.at(700.0), 1.0, 1e-9);
    const FadeCurve below = curveOf(element, "InverseFadeIn");
    EXPECT_NEAR(below.at(0.0), 1.0, 1e-9);
    EXPECT_NEAR(below.at(350.0), 350.0 / 800, 1e-6);
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "1");
    EXPECT_STREQ(element.attribute("default-fade-in").value(), "0");
    EXPECT_STREQ(element.child("FadeIn").child("AutomationList").attribute("interpolation-style").value(), "Linear");
}

TEST_F(CutRegion, GoesOnWithAFadeAtASeamAsIfItWereWhole)
{
    const std::string fades = fade("FadeIn", 800) + fade("FadeOut", 1000, "1 0");
    const pugi::xml_node first = cut(fades, {48000, 100, 500, RegionEdge::Old, RegionEdge::Seam});
    EXPECT_EQ(lengthOf(first, "FadeIn"), 100);
    EXPECT_NEAR(curveOf(first, "FadeIn").at(100.0), 100.0 / 800, 1e-9);
    EXPECT_STREQ(first.attribute("fade-out-active").value(), "0");
    const pugi::xml_node second = cut(fades, {48100, 9400, 600, RegionEdge::Seam, RegionEdge::Seam});
    EXPECT_NEAR(curveOf(second, "FadeIn").at(0.0), 100.0 / 800, 1e-9);
    EXPECT_EQ(lengthOf(second, "FadeIn"), 700);
    EXPECT_EQ(lengthOf(second, "FadeOut"), 500);
    EXPECT_NEAR(curveOf(second, "FadeOut").at(500.0), 0.5, 1e-9);
    const pugi::xml_node third = cut(fades, {57500, 500, 10000, RegionEdge::Seam, RegionEdge::Old});
    EXPECT_NEAR(curveOf(third, "FadeOut").at(0.0), 0.5, 1e-9);
    EXPECT_EQ(lengthOf(third, "FadeOut"), 500);
    EXPECT_STREQ(third.attribute("fade-in-active").value(), "0");
}

TEST_F(CutRegion, EndsWithAShortFadeWithinALongOne)
{
    const pugi::xml_node element = cut(fade("FadeIn", 800), {48000, 400, 500, RegionEdge::Old, RegionEdge::New});
    EXPECT_EQ(lengthOf(element, "FadeIn"), 336);
    EXPECT_NEAR(curveOf(element, "FadeIn").at(336.0), 336.0 / 800, 1e-9);
    EXPECT_EQ(lengthOf(element, "FadeOut"), 64);
    const FadeCurve out = curveOf(element, "FadeOut");
    EXPECT_NEAR(out.at(0.0), 336.0 / 800, 1e-9);
    EXPECT_NEAR(out.at(32.0), 0.70711 * 368 / 800, 1e-5);
    EXPECT_EQ(out.at(64.0), 0.0);
}

TEST_F(CutRegion, HasNoFadesThatOverlapWhereThoseOfItsRegionDid)
{
    // Of two fades that overlap Ardour adds what each lets through, the first under the inverse of the second.
    const std::string fades = fade("FadeIn", 8000) + fade("FadeOut", 8000, "1 0") + fade("InverseFadeOut", 8000, "0 1");
    const pugi::xml_node element = cut(fades, {48000, 6000, 500, RegionEdge::Old, RegionEdge::Seam});
    EXPECT_LE(lengthOf(element, "FadeIn") + (element.child("FadeOut") ? lengthOf(element, "FadeOut") : 0), 6000);
    // At sample 4,000: half of the first fade, of which the inverse lets a quarter through, and three quarters.
    EXPECT_NEAR(curveOf(element, "FadeIn").at(4000.0), 0.5 * 0.25 + 0.75, 1e-6);
    EXPECT_NEAR(curveOf(element, "FadeIn").at(1000.0), 0.125, 1e-6);
}

TEST_F(CutRegion, HasOneFadeWhereThatOfItsHeadReachesToItsEnd)
{
    const std::string fades = fade("FadeIn", 10000) + fade("FadeOut", 5000, "1 0");
    const pugi::xml_node element = cut(fades, {48000, 8000, 2500, RegionEdge::New, RegionEdge::Old});
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "1");
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "0");
    EXPECT_EQ(lengthOf(element, "FadeIn"), 8000);
    // At sample 7,500 of the region: three quarters of the first fade, and half of the second.
    EXPECT_NEAR(curveOf(element, "FadeIn").at(5500.0), 0.75 + 0.5, 1e-6);
    EXPECT_NEAR(curveOf(element, "FadeIn").at(1000.0), 0.3, 1e-6);
}

TEST_F(CutRegion, LosesTheShortFadesOfACutWhereItsPiecesMeetAgain)
{
    const pugi::xml_node cutOnce = cut("", {48000, 5000, 2500, RegionEdge::New, RegionEdge::New});
    EXPECT_STREQ(cutOnce.attribute("fade-in-active").value(), "1");
    region = {
        {}, 48000, 5000, 2500, 11, CutMark::read(cutOnce, "head", 2500, 64), CutMark::read(cutOnce, "tail", 7500, 64)};
    ASSERT_TRUE(region.head && region.tail);
    pugi::xml_document document;
    pugi::xml_node element = document.append_copy(cutOnce);
    cutRegion(element, region, {3000, 5000, 2500, RegionEdge::Seam, RegionEdge::New, false, true}, clockAt("48000"),
              480, [] { return 1; });
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "0");
    // The other end is as the first run left it.
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "1");
    EXPECT_STREQ(element.attribute("default-fade-out").value(), "1");
    EXPECT_EQ(CutMark::read(element, "head", 2500, 0)->edge, RegionEdge::Seam);
    EXPECT_EQ(CutMark::read(element, "tail", 7500, 64)->fade, 64);
}

TEST_F(CutRegion, HasTheRestOfAFadeWithoutTheShortOneWhereItsPiecesMeetAgain)
{
    const pugi::xml_node cutOnce = cut(fade("FadeIn", 800) + fade("InverseFadeIn", 800, "1 0"),
                                       {48000, 5000, 600, RegionEdge::New, RegionEdge::New});
    region = {
        {}, 48000, 5000, 600, 11, CutMark::read(cutOnce, "head", 600, 700), CutMark::read(cutOnce, "tail", 5600, 64)};
    ASSERT_TRUE(region.head && region.tail);
    pugi::xml_document document;
    pugi::xml_node element = document.append_copy(cutOnce);
    cutRegion(element, region, {3000, 5000, 600, RegionEdge::Seam, RegionEdge::Seam}, clockAt("48000"), 64,
              [] { return 1; });
    const FadeCurve in = curveOf(element, "FadeIn");
    EXPECT_EQ(lengthOf(element, "FadeIn"), 700);
    for (const int sample : {0, 1, 32, 63, 64, 65, 350, 700})
        EXPECT_NEAR(in.at(sample), (100.0 + sample) / 800, sample < 64 ? 2e-3 : 1e-6) << sample;
    EXPECT_NEAR(curveOf(element, "InverseFadeIn").at(32.0), 668.0 / 800, 5e-3);
    EXPECT_STREQ(element.attribute("fade-out-active").value(), "0");
}

TEST_F(CutRegion, GetsAShortFadeWhereASeamIsPulledApart)
{
    const pugi::xml_node cutOnce = cut("", {48000, 5000, 2500, RegionEdge::Seam, RegionEdge::Seam});
    region = {
        {}, 48000, 5000, 2500, 11, CutMark::read(cutOnce, "head", 2500, 0), CutMark::read(cutOnce, "tail", 7500, 0)};
    ASSERT_TRUE(region.head && region.tail);
    pugi::xml_document document;
    pugi::xml_node element = document.append_copy(cutOnce);
    cutRegion(element, region, {3000, 5000, 2500, RegionEdge::New, RegionEdge::Seam, false, true}, clockAt("48000"), 64,
              [] { return 1; });
    EXPECT_STREQ(element.attribute("fade-in-active").value(), "1");
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
