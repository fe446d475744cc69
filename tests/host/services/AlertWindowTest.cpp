// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/AlertWindow.h"

#include "standin/Application.h"
#include "standin/services/Translations.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AlteredContext.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

#include <optional>
#include <sstream>
#include <string>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::TempFolder;
using cadrel::tests::thrownBy;
using gui::AlertWindowBase;
using util::Result;

/// Alerts whose user presses what the test wants.
class PressedAlerts : public Implements<PressedAlerts, FObject, IAlertService> {
public:
    static constexpr const char* ClassName = "PressedAlerts";

    explicit PressedAlerts(int32 button) : m_button(button) {}

    int32 show(const char16_t* message, const char16_t* button1, const char16_t* button2,
               const char16_t* button3) override
    {
        texts.clear();
        for (const char16_t* const text : {message, button1, button2, button3})
            texts.push_back(text ? std::optional<std::u16string>(text) : std::nullopt);
        return m_button;
    }

    /// Of the last alert: the message and the three labels.
    std::vector<std::optional<std::u16string>> texts;

private:
    int32 m_button;
};

class AlertWindowTest : public testing::Test {
protected:
    ~AlertWindowTest() override { AlertWindow::uninstall(); }

    std::ostringstream screen;
    standin::Application application{standin::Terminal(screen, false)};
    AlteredContext context{application.context()};
    AlertWindow alerts{&context};
};

} // namespace

TEST_F(AlertWindowTest, ShowsTheHostsAlert)
{
    EXPECT_EQ(alerts.show(L"No tracks selected.", L"Continue", L"Abort", L""), 1);

    EXPECT_EQ(screen.str(), "No tracks selected. [Continue]\n");
}

TEST_F(AlertWindowTest, AnswersTheButtonThatWasPressed)
{
    const auto pressed = makeCounted<PressedAlerts>(2);
    context.replace(IAlertService::iid, pressed);

    EXPECT_EQ(alerts.show(L"Frame rate mismatch", L"Continue", L"Abort", L"Help"), 2);

    const std::vector<std::optional<std::u16string>> expected{u"Frame rate mismatch", u"Continue", u"Abort", u"Help"};
    EXPECT_EQ(pressed->texts, expected);
}

TEST_F(AlertWindowTest, LeavesTheButtonToTheHostWhereTheTextIsEmpty)
{
    const auto pressed = makeCounted<PressedAlerts>(1);
    context.replace(IAlertService::iid, pressed);

    alerts.show(L"", L"", L"Abort", L"");

    const std::vector<std::optional<std::u16string>> expected{u"", std::nullopt, u"Abort", std::nullopt};
    EXPECT_EQ(pressed->texts, expected) << "An empty message is a message all the same.";
}

TEST_F(AlertWindowTest, SpeaksTheLanguageOfTheHostsUser)
{
    const TempFolder folder;
    std::string bundle = folder.path().string();
    folder.write("translation.xml", R"(<translations>
    <language name="de">
        <text source="Continue?">Weiter?</text><text source="Yes">Ja</text><text source="No">Nein</text>
        <text source="Help">Hilfe</text>
    </language>
</translations>)");
    application.translations().addTable(bundle.data(), "translation.xml", "Cadrel");
    application.translations().setLanguage("de");
    const auto pressed = makeCounted<PressedAlerts>(3);
    context.replace(IAlertService::iid, pressed);

    EXPECT_EQ(alerts.show(L"Continue?", L"Yes", L"No", L"Help"), 3);

    const std::vector<std::optional<std::u16string>> expected{u"Weiter?", u"Ja", u"Nein", u"Hilfe"};
    EXPECT_EQ(pressed->texts, expected);
}

TEST_F(AlertWindowTest, ShowsTheTextItselfWithoutATranslationService)
{
    context.hide(ITranslationService::iid);

    EXPECT_EQ(alerts.show(L"No events in Change EDL.", L"", L"", L""), 1);

    EXPECT_EQ(screen.str(), "No events in Change EDL.\n");
}

TEST_F(AlertWindowTest, IsSilentWithoutTheHostsAlerts)
{
    context.hide(IAlertService::iid);

    EXPECT_EQ(alerts.show(L"No events in Change EDL.", L"", L"", L""), 0);

    EXPECT_EQ(screen.str(), "");
}

TEST_F(AlertWindowTest, IsReachedByTheWholeProcessWhileItIsInstalled)
{
    EXPECT_EQ(thrownBy([] { AlertWindowBase::instance(); }), Result::NotAvailable);

    AlertWindow::install(&context);
    AlertWindowBase::instance().show(L"Here", L"", L"", L"");
    AlertWindow::uninstall();

    EXPECT_EQ(screen.str(), "Here\n");
    EXPECT_EQ(thrownBy([] { AlertWindowBase::instance(); }), Result::NotAvailable);
}

TEST_F(AlertWindowTest, IsInstalledOnceAtATime)
{
    AlteredContext silent(application.context());
    silent.hide(IAlertService::iid);
    AlertWindow::install(&context);

    EXPECT_EQ(thrownBy([&] { AlertWindow::install(&silent); }), Result::NotAvailable);

    EXPECT_EQ(AlertWindowBase::instance().show(L"Here", L"", L"", L""), 1) << "The first one stays.";
    AlertWindow::uninstall();
    AlertWindow::install(&silent);
    EXPECT_EQ(AlertWindowBase::instance().show(L"Here", L"", L"", L""), 0);
}

} // namespace cadrel::host::tests
