// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/page/Browser.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// What the tests ask of the page.
constexpr const char* Helpers = R"(
  const all = selector => [...document.querySelectorAll(selector)];
  const marksFor = id => all(`svg [data-rows~="${id}"]`);
  const shownRows = kind => all('tr[id]').filter(row => !row.hidden && row.dataset.kinds.split(' ').includes(kind)).length;
  // Where a click meets a mark of that line in the picture; null where it is thinner than a pixel.
  function pointOf(id) {
    const box = svg.getBoundingClientRect();
    for (const mark of marksFor(id)) {
      const own = mark.getBoundingClientRect();
      const left = Math.max(own.left, box.left), right = Math.min(own.right, box.right);
      for (let line = 1; line < 12; ++line) {
        const y = own.top + own.height * line / 12;
        for (let x = Math.ceil(left); x < right; x += Math.max(1, Math.floor((right - left) / 9)))
          if (document.elementFromPoint(x, y)?.dataset?.rows?.split(' ').includes(id)) return { x, y };
      }
    }
    return null;
  }
  // Zooms in to a line's mark until a click can meet it.
  function enlarge(id) {
    scrollTo(0, 0);
    zoom(1e9);
    const box = marksFor(id)[0].getBBox();
    while (!pointOf(id) && width > whole / 1000) zoom(0.5, box.x + box.width / 2);
  }
  function luminance(rgb) {
    const [r, g, b] = rgb.map(v => v / 255).map(v => v <= 0.04045 ? v / 12.92 : ((v + 0.055) / 1.055) ** 2.4);
    return 0.2126 * r + 0.7152 * g + 0.0722 * b;
  }
  // What a colour of CSS is, whatever it is written as.
  const pixel = document.createElement('canvas').getContext('2d', { willReadFrequently: true });
  function onTop(colour, below) {
    pixel.fillStyle = `rgb(${below})`; pixel.fillRect(0, 0, 1, 1);
    pixel.fillStyle = colour; pixel.fillRect(0, 0, 1, 1);
    return [...pixel.getImageData(0, 0, 1, 1).data].slice(0, 3);
  }
  let grounds = new Map();
  function groundOf(element) {
    if (!grounds.has(element)) grounds.set(element, mixedGroundOf(element));
    return grounds.get(element);
  }
  function mixedGroundOf(element) {
    const below = element.parentElement ? groundOf(element.parentElement) : [255, 255, 255];
    return onTop(getComputedStyle(element).backgroundColor, below);
  }
  // The texts that don't stand out from their ground as WCAG 2.1 (AA) asks.
  function faintTexts() {
    grounds = new Map();
    const walker = document.createTreeWalker(document.querySelector('main'), NodeFilter.SHOW_TEXT);
    const faint = new Set();
    for (let node = walker.nextNode(); node; node = walker.nextNode()) {
      const element = node.parentElement;
      if (!node.data.trim() || element.closest('svg') || !element.checkVisibility()) continue;
      const ground = groundOf(element);
      const a = luminance(ground), b = luminance(onTop(getComputedStyle(element).color, ground));
      if ((Math.max(a, b) + 0.05) / (Math.min(a, b) + 0.05) < 4.5) faint.add(element.className + ': ' + node.data);
    }
    return [...faint];
  }
)";

/// One browser for all tests, with the notes of the example in it.
class NotesPage : public testing::Test {
protected:
    static void SetUpTestSuite()
    {
        s_folder = std::make_unique<TempFolder>();
        s_page = *s_folder / "notes.html";
        std::vector<std::string> arguments{"notes",
                                           "--old",
                                           treePath("examples/reel3/reel3_v07.edl"),
                                           "--new",
                                           treePath("examples/reel3/reel3_v12.edl"),
                                           "--vfx",
                                           "VFX_****_v,_comp",
                                           "-o"};
        arguments.push_back(s_page);
        ASSERT_EQ(runCadrel(arguments).status, 0);
        s_browser = std::make_unique<Browser>();
    }

    static void TearDownTestSuite()
    {
        s_browser.reset();
        s_folder.reset();
    }

    void SetUp() override
    {
        browser.prefer("light");
        browser.resize(1240, 900);
        show(s_page);
    }

    void show(const std::filesystem::path& page)
    {
        browser.open(page);
        browser.valueOf(Helpers);
    }

    /// The page of two cuts of a film, which are given as the lines of their EDLs.
    static std::filesystem::path pageOf(const std::string& oldCut, const std::string& newCut)
    {
        const std::string page = *s_folder / "other.html";
        const Outcome outcome =
            runCadrel({"notes", "--old", s_folder->write("old.edl", oldCut), "--new",
                       s_folder->write("new.edl", newCut), "--rate", "24 fps", "-o", page, "--overwrite"});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return page;
    }

    /// The notes of the example with what became of its sound.
    static std::filesystem::path pageWithSound()
    {
        const std::string page = *s_folder / "sound.html";
        const Outcome outcome =
            runCadrel({"apply", treePath("examples/reel3/reel3.stage"), "--old",
                       treePath("examples/reel3/reel3_v07.edl"), "--new", treePath("examples/reel3/reel3_v12.edl"),
                       "--vfx", "VFX_****_v,_comp", "--notes", page, "--overwrite", "--summary"});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return page;
    }

    void TearDown() override
    {
        EXPECT_EQ(browser.errors(), std::vector<std::string>());
        EXPECT_EQ(browser.requests(), std::vector<std::string>());
    }

    /// The line that is marked; empty for none.
    std::string markedLine() { return browser.valueOf("document.querySelector('tr.on')?.id ?? ''"); }
    double shownWidth() { return browser.valueOf("svg.viewBox.baseVal.width"); }
    double shownLeft() { return browser.valueOf("svg.viewBox.baseVal.x"); }
    double wholeWidth() { return browser.valueOf("whole"); }
    int count(const std::string& expression) { return browser.valueOf(expression); }
    bool isInView(const std::string& id)
    {
        return browser.valueOf("(box => box.top >= 0 && box.bottom <= innerHeight)(document.getElementById('" + id +
                               "').getBoundingClientRect())");
    }
    /// Goes on with the Tab key until that has the focus. Throws when nothing has it after all.
    void tabTo(const std::string& selector)
    {
        for (int tab = 0; tab < 40; ++tab) {
            browser.press("Tab");
            if (browser.valueOf("document.activeElement.matches(`" + selector + "`)") == true)
                return;
        }
        throw std::runtime_error("the Tab key doesn't reach " + selector);
    }
    /// Clicks on a mark of a line until the line is marked; a mark of several lines leads to one after the other.
    bool clickOn(const std::string& id)
    {
        for (int click = 0; click < MostLinesOfAMark; ++click) {
            browser.valueOf("scrollTo(0, 0)");
            const json point = browser.valueOf("pointOf('" + id + "')");
            if (point.is_null())
                return false;
            browser.click(point.at("x"), point.at("y"));
            if (markedLine() == id)
                break;
        }
        return true;
    }
    static constexpr int MostLinesOfAMark = 3;

    static std::unique_ptr<TempFolder> s_folder;
    static std::filesystem::path s_page;
    static std::unique_ptr<Browser> s_browser;
    Browser& browser = *s_browser;
};

std::unique_ptr<TempFolder> NotesPage::s_folder;
std::filesystem::path NotesPage::s_page;
std::unique_ptr<Browser> NotesPage::s_browser;

TEST_F(NotesPage, OpensWithoutAskingForAnythingAndWithoutErrors)
{
    EXPECT_EQ(browser.valueOf("document.querySelector('h1').textContent"), "Change notes");
    EXPECT_EQ(browser.valueOf("performance.getEntriesByType('resource').length"), 0);
}

TEST_F(NotesPage, TheBrowserTellsOfErrorsAndRequests)
{
    const std::filesystem::path wrong = s_folder->write(
        "wrong.html", "<!DOCTYPE html><title>wrong</title><img src=\"gone.png\"><script>undefinedName()</script>");

    browser.open(wrong);

    ASSERT_EQ(browser.requests().size(), 1U);
    EXPECT_TRUE(browser.requests()[0].ends_with("/gone.png"));
    EXPECT_GE(browser.errors().size(), 1U);
    browser.open(s_page);
}

TEST_F(NotesPage, IsLightOrDarkAsTheUserHasIt)
{
    const std::string ground = "grounds.clear(), luminance(groundOf(document.body))";
    const std::string faint = "faintTexts()";
    // A line that is chosen has a ground of its own.
    browser.press("n");

    EXPECT_GT(browser.valueOf(ground), 0.8);
    EXPECT_EQ(browser.valueOf(faint), json::array());

    browser.prefer("dark");
    EXPECT_LT(browser.valueOf(ground), 0.05);
    EXPECT_EQ(browser.valueOf(faint), json::array());

    // Paper is white, whatever the screen is.
    browser.prefer("dark", "print");
    EXPECT_GT(browser.valueOf(ground), 0.8);
    EXPECT_EQ(browser.valueOf(faint), json::array());
}

TEST_F(NotesPage, AClickOnABandLeadsToItsLine)
{
    int clicked = 0;
    for (const std::string id : browser.valueOf("rows.map(row => row.id)")) {
        if (!clickOn(id))
            continue;
        ++clicked;
        EXPECT_EQ(markedLine(), id);
        EXPECT_TRUE(isInView(id)) << id;
        EXPECT_GE(count("marksFor('" + id + "').filter(mark => mark.classList.contains('on')).length"), 1) << id;
    }
    EXPECT_GT(clicked, 60);
}

TEST_F(NotesPage, EveryLineLeadsToItsMarksAndBack)
{
    for (const std::string id : browser.valueOf("rows.map(row => row.id)")) {
        browser.valueOf("document.getElementById('" + id + "').click()");
        EXPECT_EQ(markedLine(), id);
        const json marked = browser.valueOf("all('svg .on').map(mark => mark.dataset.rows.split(' '))");
        EXPECT_GE(marked.size(), 1U) << id;
        for (const json& lines : marked)
            EXPECT_NE(std::find(lines.begin(), lines.end(), id), lines.end()) << id;

        browser.valueOf("choose('')");
        browser.valueOf("enlarge('" + id + "')");
        ASSERT_TRUE(clickOn(id)) << id;
        EXPECT_EQ(markedLine(), id);
        EXPECT_TRUE(isInView(id)) << id;
    }
}

/// Two reels; with `isMoved` the second shot of the first has gone to the end of the second.
std::string twoReels(bool isMoved)
{
    const std::string moved =
        cut("002", "MOVED", "10:00:00:00 10:00:10:00", isMoved ? "02:00:20:00 02:00:30:00" : "01:00:20:00 01:00:30:00");
    return cut("001", "ONE", "10:00:00:00 10:00:20:00", "01:00:00:00 01:00:20:00") + (isMoved ? "" : moved) +
           cut("003", "TWO", "10:00:00:00 10:00:20:00", "02:00:00:00 02:00:20:00") + (isMoved ? moved : "");
}

TEST_F(NotesPage, AMoveBetweenReelsIsToldInBothOfThem)
{
    show(pageOf(twoReels(false), twoReels(true)));

    EXPECT_EQ(browser.valueOf("document.getElementById('m2-1').innerText.replace(/\\s+/g, ' ').trim()"),
              "02:00:20:00 moved 00:00:10:00 from reel 1, step 1 MOVED +00:00:10:00");
    EXPECT_EQ(browser.valueOf("marksFor('m2-1').every(mark => mark.dataset.rows === 's1 m2-1 k2-2')"), true);
    for (const std::string id : {"s1", "m2-1", "k2-2", "k1-1", "k2-1"}) {
        EXPECT_TRUE(clickOn(id)) << id;
        EXPECT_EQ(markedLine(), id);
    }

    browser.valueOf("document.querySelector('#m2-1 a').click()");
    EXPECT_EQ(markedLine(), "s1");
    // It is no step of its own.
    browser.press("n");
    EXPECT_EQ(markedLine(), "s1");
    EXPECT_EQ(count("shownRows('moved')"), 2);
}

TEST_F(NotesPage, OnlyAReelWhereNothingHasChangedIsGrey)
{
    const std::string grey = "all('.overview tbody tr').map(row => row.classList.contains('k'))";

    show(pageOf(twoReels(false), twoReels(true)));
    EXPECT_EQ(browser.valueOf(grey), json({false, false}));
    show(pageOf(twoReels(true), twoReels(true)));
    EXPECT_EQ(browser.valueOf(grey), json({true, true}));
}

TEST_F(NotesPage, AMarkOfOneFrameInALongFilmIsAPixelWide)
{
    // A frame of two hours is a 150th of a pixel.
    const std::string start = cut("001", "ONE", "10:00:00:00 11:00:00:00", "01:00:00:00 02:00:00:00");
    show(pageOf(start + cut("002", "ONE", "11:00:00:00 12:00:00:00", "02:00:00:00 03:00:00:00"),
                start + cut("002", "NEW", "10:00:00:00 10:00:00:01", "02:00:00:00 02:00:00:01") +
                    cut("003", "ONE", "11:00:00:01 12:00:00:00", "02:00:00:01 03:00:00:00")));

    ASSERT_EQ(count("marksFor('s1').length"), 2);
    for (int mark = 0; mark < 2; ++mark) {
        const std::string self = "marksFor('s1')[" + std::to_string(mark) + "]";
        const std::string box = self + ".getBoundingClientRect()";
        const std::string middle = "(b => [b.left + b.width / 2, b.top + b.height / 2])(" + box + ")";
        EXPECT_LT(browser.valueOf(box + ".width"), 0.1);
        for (const std::string aside : {"-0.4", "0", "0.4"})
            EXPECT_EQ(browser.valueOf("(([x, y]) => document.elementFromPoint(x + " + aside + ", y) === " + self +
                                      ")(" + middle + ")"),
                      true)
                << aside;
        EXPECT_EQ(browser.valueOf("getComputedStyle(" + self + ").stroke"),
                  browser.valueOf("getComputedStyle(" + self + ").fill"));
    }
}

TEST_F(NotesPage, ABandThatGoesFarIsAPixelWideInItsMiddle)
{
    // The weir stands once more near the end of the reel. Its band is four pixels wide at its ends, and much less between.
    EXPECT_GE(count("all('path.doubled').length"), 1);
    EXPECT_EQ(browser.valueOf("all('path.doubled, path.moved').filter(band => getComputedStyle(band).stroke !== "
                              "getComputedStyle(band).fill || getComputedStyle(band).strokeWidth !== '1px' || "
                              "getComputedStyle(band).vectorEffect !== 'non-scaling-stroke').length"),
              0);
    // A point on each of 50 upright lines between both ends.
    EXPECT_EQ(browser.valueOf(R"((() => {
        const band = document.querySelector('path.doubled'), box = band.getBoundingClientRect();
        let missed = 0;
        for (let line = 1; line < 50; ++line) {
            const x = box.left + box.width * line / 50;
            let meets = false;
            for (let y = box.top; y <= box.bottom; y += 0.25)
                meets ||= document.elementsFromPoint(x, y).includes(band);
            missed += meets ? 0 : 1;
        }
        return missed;
    })())"),
              0);
}

TEST_F(NotesPage, TheBoxesHaveTheHuesOfThePicture)
{
    for (const char* const scheme : {"light", "dark"}) {
        browser.prefer(scheme);
        const json kinds = browser.valueOf("boxes.map(box => box.value)");
        EXPECT_EQ(browser.valueOf("boxes.filter(box => !marks.some(mark => mark.classList.contains(box.value)))"
                                  ".map(box => box.value)"),
                  json::array());
        std::set<std::string> hues;
        for (const std::string kind : kinds) {
            const std::string hue =
                browser.valueOf("getComputedStyle(document.querySelector('.tools ." + kind + "')).backgroundColor");
            EXPECT_EQ(
                browser.valueOf("[...new Set(all('svg ." + kind + "').map(mark => getComputedStyle(mark).fill))]"),
                json({hue}))
                << kind;
            hues.insert(hue);
        }
        EXPECT_EQ(hues.size(), kinds.size());
    }
}

TEST_F(NotesPage, TheMarksOfAStepTellOfItsChangesInTheirHues)
{
    // ONE loses its tail, TWO is replaced by a longer one, and THREE is replaced by one of its length.
    show(pageOf(cut("001", "ONE", "10:00:00:00 10:00:20:00", "01:00:00:00 01:00:20:00") +
                    cut("002", "TWO", "10:00:00:00 10:00:10:00", "01:00:20:00 01:00:30:00") +
                    cut("003", "FOUR", "10:00:00:00 10:00:10:00", "01:00:30:00 01:00:40:00") +
                    cut("004", "THREE", "10:00:00:00 10:00:05:00", "01:00:40:00 01:00:45:00"),
                cut("001", "ONE", "10:00:00:00 10:00:15:00", "01:00:00:00 01:00:15:00") +
                    cut("002", "NEW", "10:00:00:00 10:00:11:00", "01:00:15:00 01:00:26:00") +
                    cut("003", "FOUR", "10:00:00:00 10:00:10:00", "01:00:26:00 01:00:36:00") +
                    cut("004", "OTHER", "10:00:00:00 10:00:05:00", "01:00:36:00 01:00:41:00")));

    // The kind that is on top at a place of a strip, in seconds.
    const auto kindAt = [&](double second, bool isOld) -> std::string {
        return browser.valueOf("(box => document.elementFromPoint(box.left + box.width * " + std::to_string(second) +
                               " / 45, box." + (isOld ? "top + 5" : "bottom - 5") +
                               ").classList[0] ?? 'nothing')(svg.getBoundingClientRect())");
    };
    EXPECT_EQ(kindAt(10, true), "kept");
    EXPECT_EQ(kindAt(17, true), "trimmed");
    EXPECT_EQ(kindAt(25, true), "lifted");
    EXPECT_EQ(kindAt(42, true), "replaced");
    EXPECT_EQ(kindAt(20, false), "inserted");
    EXPECT_EQ(kindAt(38, false), "replaced");
    EXPECT_EQ(kindAt(43, false), "nothing");
}

TEST_F(NotesPage, OneButtonUnfoldsAllSoundAndFoldsItAgain)
{
    show(pageWithSound());
    const std::string open = "sounds.filter(sound => sound.open).length";
    const int all = count("sounds.length");
    ASSERT_GT(all, 20);
    EXPECT_EQ(count(open), 0);

    tabTo("[data-sound]");
    browser.press("Enter");
    EXPECT_EQ(count(open), all);
    EXPECT_TRUE(browser.valueOf("sounds.every(sound => sound.querySelector('li').checkVisibility())"));
    // Where one is folded, it unfolds all.
    browser.valueOf("sounds[3].open = false");
    browser.press("Enter");
    EXPECT_EQ(count(open), all);
    browser.press("Space");
    EXPECT_EQ(count(open), 0);
}

TEST_F(NotesPage, PaperShowsAllSoundAndTheScreenIsAsItWasAfterwards)
{
    show(pageWithSound());
    browser.valueOf("sounds[1].open = true");
    browser.valueOf("window.seen = []; addEventListener('beforeprint', () => seen.push(sounds.every(s => s.open)));");

    browser.printed();

    EXPECT_EQ(browser.valueOf("seen"), json({true}));
    EXPECT_EQ(browser.valueOf("sounds.map((s, i) => s.open ? i : -1).filter(i => i >= 0)"), json({1}));

    // The preview may begin anew before it ends.
    browser.valueOf("for (const name of ['beforeprint', 'beforeprint', 'afterprint']) dispatchEvent(new Event(name))");
    EXPECT_EQ(browser.valueOf("sounds.map((s, i) => s.open ? i : -1).filter(i => i >= 0)"), json({1}));
}

TEST_F(NotesPage, ThePageWithSoundIsAsEasyToRead)
{
    show(pageWithSound());
    browser.valueOf("unfold(true)");

    for (const char* const scheme : {"light", "dark"}) {
        browser.prefer(scheme);
        EXPECT_EQ(browser.valueOf("faintTexts()"), json::array());
    }
}

TEST_F(NotesPage, ZoomsByKeysAndByButtons)
{
    const double whole = wholeWidth();
    EXPECT_EQ(shownWidth(), whole);

    browser.press("+");
    EXPECT_NEAR(shownWidth(), whole * 0.6, 1e-6 * whole);
    browser.press("+");
    browser.press("-");
    EXPECT_NEAR(shownWidth(), whole * 0.6 * 0.6 * 1.7, 1e-6 * whole);
    browser.press("0");
    EXPECT_EQ(shownWidth(), whole);
    EXPECT_EQ(shownLeft(), 0);

    tabTo("[data-zoom=\"0.6\"]");
    browser.press("Enter");
    EXPECT_NEAR(shownWidth(), whole * 0.6, 1e-6 * whole);
    tabTo("[data-zoom=\"1e9\"]");
    browser.press("Space");
    EXPECT_EQ(shownWidth(), whole);
}

TEST_F(NotesPage, TheWheelZoomsWithControlAlone)
{
    const double whole = wholeWidth();

    const int middle = browser.valueOf("Math.round((b => b.top + b.height / 2)(svg.getBoundingClientRect()))");
    browser.turnWheel(600, middle, -100, true);
    EXPECT_NEAR(shownWidth(), whole * 0.8, 1e-6 * whole);
    browser.turnWheel(600, middle, 100, false);
    EXPECT_NEAR(shownWidth(), whole * 0.8, 1e-6 * whole);
}

TEST_F(NotesPage, TheArrowsGoAlongThePictureThatHasTheFocus)
{
    tabTo("svg");
    browser.press("+");
    const double left = shownLeft();
    const double width = shownWidth();

    browser.press("ArrowRight");
    EXPECT_NEAR(shownLeft(), left + 0.2 * width, 1e-6 * width);
    browser.press("ArrowLeft");
    browser.press("ArrowLeft");
    browser.press("ArrowLeft");
    // No further than to the start.
    EXPECT_EQ(shownLeft(), 0);
}

TEST_F(NotesPage, NAndPGoFromStepToStep)
{
    const int steps = count("all('tr[id]:not(.k)').length");

    browser.press("n");
    EXPECT_EQ(markedLine(), "s1");
    browser.press("n");
    EXPECT_EQ(markedLine(), "s2");
    EXPECT_TRUE(isInView("s2"));
    browser.press("p");
    EXPECT_EQ(markedLine(), "s1");
    browser.press("p");
    EXPECT_EQ(markedLine(), "s1");
    for (int step = 0; step < steps + 5; ++step)
        browser.press("n");
    EXPECT_EQ(markedLine(), std::string("s").append(std::to_string(steps)));
}

TEST_F(NotesPage, EnterOnALineShowsItsPlaceInThePicture)
{
    for (int zoom = 0; zoom < 6; ++zoom)
        browser.press("+");
    browser.valueOf("document.getElementById('s62').focus()");

    browser.press("Enter");

    EXPECT_EQ(markedLine(), "s62");
    const double middle = browser.valueOf("(b => b.x + b.width / 2)(document.querySelector('svg .on').getBBox())");
    EXPECT_GE(middle, shownLeft());
    EXPECT_LE(middle, shownLeft() + shownWidth());
}

TEST_F(NotesPage, TheFilterShowsTheChosenKindsInTheTableAndInThePicture)
{
    const int moves = count("shownRows('moved')");
    ASSERT_EQ(moves, 2);
    const std::string bands = "all('svg .moved').filter(e => getComputedStyle(e).display !== 'none').length";
    ASSERT_GT(count(bands), 0);

    tabTo(".tools input[value=\"moved\"]");
    browser.press("Space");
    EXPECT_EQ(count("shownRows('moved')"), 0);
    EXPECT_EQ(count(bands), 0);
    EXPECT_GT(count("shownRows('trimmed')"), 0);

    browser.press("Space");
    EXPECT_EQ(count("shownRows('moved')"), moves);
    EXPECT_GT(count(bands), 0);

    // A step of several kinds stays as long as one of them is chosen.
    const int several = count("all('tr[id]').filter(row => row.dataset.kinds.includes(' ')).length");
    ASSERT_GT(several, 0);
    browser.valueOf("boxes.forEach(box => { box.checked = false; box.dispatchEvent(new Event('change')); })");
    EXPECT_EQ(count("all('tr[id]').filter(row => !row.hidden).length"), 0);
    tabTo(".tools input[value=\"lifted\"]");
    browser.press("Space");
    EXPECT_EQ(count("all('tr[id]').filter(row => !row.hidden).length"), count("shownRows('lifted')"));
    browser.press("n");
    EXPECT_EQ(browser.valueOf("document.querySelector('tr.on').dataset.kinds.split(' ').includes('lifted')"), true);
}

TEST_F(NotesPage, TheMarksOfAKindThatIsLeftOutAreGoneWhereTheirLineStays)
{
    const std::string shownMarks = "all('svg .lifted').filter(e => getComputedStyle(e).display !== 'none').length";
    ASSERT_EQ(count(shownMarks), 10);

    tabTo(".tools input[value=\"lifted\"]");
    browser.press("Space");

    // Steps that are of another kind, too, keep their lines.
    EXPECT_EQ(count(shownMarks), 0);
    const int ofSeveralKinds = count("all('tr[id]').map(row => row.dataset.kinds.split(' '))"
                                     ".filter(kinds => kinds.includes('lifted') && new Set(kinds).size > 1).length");
    EXPECT_GT(ofSeveralKinds, 0);
    EXPECT_EQ(count("shownRows('lifted')"), ofSeveralKinds);
    EXPECT_EQ(browser.valueOf("document.querySelector('.left').textContent"),
              "Left out: lines that are only lifted, and that colour in the picture. 58 of 62 steps are shown.");
}

TEST_F(NotesPage, ALineOfTheLargestChangesLeadsToItsStep)
{
    tabTo("ol.largest a");
    const std::string id = browser.valueOf("document.activeElement.hash.slice(1)");

    browser.press("Enter");

    EXPECT_EQ(markedLine(), id);
    EXPECT_TRUE(isInView(id));
}

TEST_F(NotesPage, FitsANarrowWindow)
{
    browser.resize(420, 800);

    EXPECT_LE(count("document.documentElement.scrollWidth"), 420);
}

TEST_F(NotesPage, TheChangesHaveRoomInAWindowOfAnyWidth)
{
    for (const int width : {420, 600, 601, 768, 900, 901, 1040, 1041, 1240}) {
        browser.resize(width, 800);

        EXPECT_LE(count("document.documentElement.scrollWidth"), width);
        EXPECT_LE(count("all('.wide').filter(e => e.scrollWidth > e.clientWidth).length"), 0) << width;
        EXPECT_GE(count("document.querySelector('#s17 td:nth-child(4)').offsetWidth"), 250) << width;
    }
}

TEST_F(NotesPage, TheNumbersOfALineHaveNamesWhereTheTableHasNoHead)
{
    const auto nameOf = [this](const std::string& row, int column) {
        return browser
            .valueOf("getComputedStyle(document.querySelector('#" + row + " td:nth-child(" + std::to_string(column) +
                     ")'), '::before').content")
            .get<std::string>();
    };
    for (const int width : {420, 600, 900}) {
        browser.resize(width, 800);

        EXPECT_EQ(nameOf("s1", 5), "\"length \"") << width;
        EXPECT_EQ(nameOf("s1", 6), "\"offset \"") << width;
        EXPECT_EQ(nameOf("k1-1", 5), "none") << width;
        EXPECT_EQ(nameOf("s1", 1), "none") << width;
    }
    browser.resize(901, 800);
    EXPECT_EQ(nameOf("s1", 5), "none");
}

TEST_F(NotesPage, NoneOfTheLargestChangesIsTornOverTwoColumns)
{
    show(pageWithSound());
    for (int width = 761; width <= 1240; width += 13) {
        browser.resize(width, 900);

        EXPECT_EQ(count("all('ol.largest li').filter(line => line.getClientRects().length > 1).length"), 0) << width;
    }
}

TEST_F(NotesPage, ALongWordOfWhatToDoStaysInItsColumn)
{
    browser.valueOf("document.querySelector('#s1 td:nth-child(3)').textContent = "
                    "'moved 00:00:21:07 from reel 12, step 1175'");
    for (const int width : {901, 1041, 1240}) {
        browser.resize(width, 800);

        EXPECT_EQ(count("all('.steps td').filter(cell => cell.scrollWidth > cell.clientWidth).length"), 0) << width;
    }
}

TEST_F(NotesPage, NoNumberOfAReelLiesOnAnother)
{
    // Reels of 20 s and of 40 s in turn.
    std::string film;
    for (int reel = 1; reel <= 9; ++reel) {
        const std::string number = std::to_string(reel);
        const std::string hour = std::string("0").append(number).append(":00:");
        const std::string end = reel % 2 == 0 ? "40:00" : "00:12";
        film += cut(std::string("00").append(number), std::string("R").append(number),
                    std::string("10:00:00:00 10:00:").append(end),
                    std::string(hour).append("00:00 ").append(hour).append(end));
    }
    show(pageOf(film, film));
    const std::string shown = "all('.reels')[0].querySelectorAll('b:not([hidden])').length";
    const std::string lying =
        "all('.reels').flatMap(strip => [...strip.querySelectorAll('b:not([hidden])')].filter((b, i, "
        "all) => i > 0 && all[i - 1].getBoundingClientRect().right > "
        "b.getBoundingClientRect().left + 0.5)).length";

    EXPECT_EQ(count(shown), 4);
    EXPECT_EQ(count(lying), 0);
    browser.resize(420, 800);
    browser.valueOf("new Promise(done => requestAnimationFrame(() => done(0)))");
    EXPECT_EQ(count(lying), 0);
}

TEST_F(NotesPage, NamesStandApartFromTheFiguresBesideThem)
{
    EXPECT_EQ(count("all('.change .tag').filter(tag => tag.nextElementSibling?.tagName !== 'BDI').length"), 0);
    EXPECT_EQ(count("all('ol.largest li').filter(line => !line.querySelector('bdi')).length"), 0);
}

/// The texts of the page on paper.
std::string textOnPaper(Browser& browser, const TempFolder& folder)
{
    const Outcome text = runProgram("pdftotext", {"-layout", folder.write("notes.pdf", browser.printed()), "-"});
    EXPECT_EQ(text.status, 0) << text.err;
    return text.out;
}

TEST_F(NotesPage, PrintsEveryStep)
{
    const std::string paper = textOnPaper(browser, *s_folder);

    EXPECT_NE(paper.find("Change notes"), std::string::npos);
    const int steps = count("all('tr[id]:not(.k)').length");
    for (int step = 1; step <= steps; ++step) {
        const std::string place =
            browser.valueOf("document.getElementById('s" + std::to_string(step) + "').cells[1].textContent");
        EXPECT_NE(paper.find(place), std::string::npos) << step;
    }
    EXPECT_EQ(paper.find("zoom in"), std::string::npos);
    EXPECT_EQ(paper.find("Left out"), std::string::npos);
}

TEST_F(NotesPage, AStepWithMuchSoundGoesOnOverThePageOnPaper)
{
    show(pageWithSound());
    const std::string file = s_folder->write("sound.pdf", browser.printed());

    // Lines of 9 points on A4: a page that isn't the last one is filled down to its last third.
    const Outcome boxes = runProgram("pdftotext", {"-bbox", file, "-"});
    const std::regex word("<word [^>]*yMax=\"([0-9.]+)\"");
    std::vector<double> bottoms;
    std::istringstream lines(boxes.out);
    for (std::string line; std::getline(lines, line);) {
        std::smatch match;
        if (line.find("<page ") != std::string::npos)
            bottoms.push_back(0);
        else if (std::regex_search(line, match, word))
            bottoms.back() = std::max(bottoms.back(), std::stod(match[1]));
    }
    ASSERT_GT(bottoms.size(), 5U);
    bottoms.pop_back();
    EXPECT_GT(*std::min_element(bottoms.begin(), bottoms.end()), 560) << boxes.out.substr(0, 500);
}

TEST_F(NotesPage, TheColoursAreExplainedOnPaper)
{
    const std::string paper = unbroken(textOnPaper(browser, *s_folder));

    EXPECT_NE(paper.find("kept trimmed lifted inserted replaced moved doubled VFX version transitions"),
              std::string::npos)
        << paper;
    EXPECT_EQ(paper.find("next and previous step"), std::string::npos);
    EXPECT_NE(paper.find("step at what to do"), std::string::npos) << paper;
}

TEST_F(NotesPage, TheLastOfTheKindsThatAreLeftOutHasAnOr)
{
    const std::string leaveOut = "boxes.forEach(box => { box.checked = !kinds.includes(box.value); });"
                                 "boxes[0].dispatchEvent(new Event('change'));";
    const std::string note = "document.querySelector('.left').textContent";
    const auto noteFor = [&](const std::string& kinds) {
        return browser.valueOf("(kinds => { " + leaveOut + " return " + note + "; })(" + kinds + ")")
            .get<std::string>();
    };

    EXPECT_EQ(noteFor("['kept']").find("Left out: lines that are only kept, and that colour"), 0U);
    EXPECT_EQ(noteFor("['kept', 'lifted']").find("Left out: lines that are only kept or lifted, and those colours"),
              0U);
    EXPECT_EQ(noteFor("['kept', 'lifted', 'moved']").find("Left out: lines that are only kept, lifted or moved, and"),
              0U);
}

TEST_F(NotesPage, SaysOnPaperWhatIsLeftOut)
{
    browser.valueOf("boxes.forEach(box => { box.checked = box.value === 'moved'; });"
                    "boxes[0].dispatchEvent(new Event('change'))");

    const std::string paper = unbroken(textOnPaper(browser, *s_folder));

    EXPECT_NE(paper.find("Left out: lines that are only kept, trimmed, "), std::string::npos) << paper;
    EXPECT_NE(paper.find("and those colours in the picture. 2 of 62 steps are shown."), std::string::npos) << paper;
}

} // namespace
