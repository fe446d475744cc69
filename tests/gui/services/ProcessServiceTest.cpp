// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/services/ProcessService.h"

#include "gui/services/AlertWindowBase.h"
#include "gui/services/FileBrowserDialogBase.h"

#include <gtest/gtest.h>

using cadrel::gui::AlertWindowBase;
using cadrel::gui::FileBrowserDialogBase;
using cadrel::util::Result;

namespace {

/// Answers the second button, and tells of its end.
class SecondButton : public AlertWindowBase {
public:
    explicit SecondButton(bool& isAlive) : m_isAlive(isAlive) { m_isAlive = true; }
    ~SecondButton() override { m_isAlive = false; }

    std::int32_t show(const std::wstring&, const std::wstring&, const std::wstring&, const std::wstring&) override
    {
        return 2;
    }

private:
    bool& m_isAlive;
};

class OneFile : public FileBrowserDialogBase {
public:
    void browse(const std::wstring&, const std::wstring&, const std::wstring&, const std::wstring&, bool,
                std::vector<std::string>& results) override
    {
        results.push_back("/reel/r3.edl");
    }
};

Result::Type resultOf(auto&& operation)
{
    try {
        operation();
    } catch (Result::Type result) {
        return result;
    }
    return Result::Ok;
}

TEST(ProcessService, IsNotAvailableBeforeOneIsInstalled)
{
    EXPECT_EQ(resultOf([] { AlertWindowBase::instance(); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([] { FileBrowserDialogBase::instance(); }), Result::NotAvailable);
}

TEST(ProcessService, IsReachedWhileItIsInstalledAndDestroyedAtTheEnd)
{
    bool isAlive = false;
    AlertWindowBase::install(std::make_unique<SecondButton>(isAlive));

    EXPECT_EQ(AlertWindowBase::instance().show(L"Frame rate mismatch", L"Continue", L"Abort", L""), 2);
    EXPECT_TRUE(isAlive);

    AlertWindowBase::uninstall();

    EXPECT_FALSE(isAlive);
    EXPECT_EQ(resultOf([] { AlertWindowBase::instance(); }), Result::NotAvailable);
}

TEST(ProcessService, IsInstalledOnlyOnce)
{
    bool isFirstAlive = false;
    bool isSecondAlive = false;
    AlertWindowBase::install(std::make_unique<SecondButton>(isFirstAlive));

    const auto installSecond = [&] { AlertWindowBase::install(std::make_unique<SecondButton>(isSecondAlive)); };

    EXPECT_EQ(resultOf(installSecond), Result::NotAvailable);
    EXPECT_TRUE(isFirstAlive);
    EXPECT_FALSE(isSecondAlive);

    AlertWindowBase::uninstall();
}

TEST(ProcessService, IsTakenAwayWhereThereIsNoneWithoutHarm)
{
    AlertWindowBase::uninstall();
    AlertWindowBase::uninstall();

    EXPECT_EQ(resultOf([] { AlertWindowBase::instance(); }), Result::NotAvailable);
}

TEST(ProcessService, IsOneOfEachKind)
{
    FileBrowserDialogBase::install(std::make_unique<OneFile>());

    std::vector<std::string> results = {"/reel/r2.edl"};
    FileBrowserDialogBase::instance().browse(L"Add EDL", L"/reel", L"edl", L"Edit Decision List", false, results);

    EXPECT_EQ(results, (std::vector<std::string>{"/reel/r2.edl", "/reel/r3.edl"}));
    EXPECT_EQ(resultOf([] { AlertWindowBase::instance(); }), Result::NotAvailable);

    FileBrowserDialogBase::uninstall();
}

} // namespace
