// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/ProgramRun.h"
#include "tests/app/page/Browser.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// What the tests ask of the page.
constexpr const char* Helpers = R"(
  const all = selector => [...document.querySelectorAll(selector)];
  const shownRows = kind => all('tr[id]').filter(row => !row.hidden && row.dataset.kinds.split(' ').includes(kind)).length;
  // Where a click meets a mark of that line in the picture; null where it is thinner than a pixel.
  function pointOf(id) {
    const box = svg.getBoundingClientRect();
    for (const mark of all(`svg [data-step="${id}"]`)) {
      const own = mark.getBoundingClientRect();
      const left = Math.max(own.left, box.left), right = Math.min(own.right, box.right);
      for (let line = 1; line < 12; ++line) {
        const y = own.top + own.height * line / 12;
        for (let x = Math.ceil(left); x < right; x += Math.max(1, Math.floor((right - left) / 9)))
          if (document.elementFromPoint(x, y)?.dataset?.step === id) return { x, y };
      }
    }
    return null;
  }
  // Zooms in to a line's mark until a click can meet it.
  function enlarge(id) {
    scrollTo(0, 0);
    zoom(1e9);
    const box = document.querySelector(`svg [data-step="${id}"]`).getBBox();
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
        browser.open(s_page);
        browser.valueOf(Helpers);
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
    bool clickOn(const std::string& id)
    {
        browser.valueOf("scrollTo(0, 0)");
        const json point = browser.valueOf("pointOf('" + id + "')");
        if (point.is_null())
            return false;
        browser.click(point.at("x"), point.at("y"));
        return true;
    }

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
    for (const std::string id : browser.valueOf("[...new Set(all('svg [data-step]').map(e => e.dataset.step))]")) {
        if (!clickOn(id))
            continue;
        ++clicked;
        EXPECT_EQ(markedLine(), id);
        EXPECT_TRUE(isInView(id)) << id;
        EXPECT_GE(count("all('svg [data-step=\"" + id + "\"].on').length"), 1) << id;
    }
    EXPECT_GT(clicked, 60);
}

TEST_F(NotesPage, EveryStepHasAMarkThatCanBeClickedOnceItIsLargeEnough)
{
    for (const std::string id :
         browser.valueOf("rows.filter(row => !row.classList.contains('k')).map(row => row.id)")) {
        browser.valueOf("enlarge('" + id + "')");
        ASSERT_TRUE(clickOn(id)) << id;
        EXPECT_EQ(markedLine(), id);
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

    browser.turnWheel(600, 350, -100, true);
    EXPECT_NEAR(shownWidth(), whole * 0.8, 1e-6 * whole);
    browser.turnWheel(600, 350, 100, false);
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
    const std::string bands = "all('svg .moved[data-step]').filter(e => getComputedStyle(e).display !== 'none').length";
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

TEST_F(NotesPage, SaysOnPaperWhatIsLeftOut)
{
    browser.valueOf("boxes.forEach(box => { box.checked = box.value === 'moved'; });"
                    "boxes[0].dispatchEvent(new Event('change'))");

    const std::string paper = textOnPaper(browser, *s_folder);

    EXPECT_NE(paper.find("Left out: kept, trimmed, "), std::string::npos) << paper;
    EXPECT_NE(paper.find("2 of 62 steps are shown."), std::string::npos) << paper;
}

} // namespace
