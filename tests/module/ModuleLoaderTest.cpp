// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/module/ModuleLoader.h"

#include "standin/Application.h"
#include "standin/edit/ActionManager.h"
#include "standin/project/Project.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"
#include "velmark/UserInterface.h"

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>

using standin::Application;
using standin::ModuleError;
using standin::ModuleLoader;

namespace {

/// A step of whoever else works on the project.
class Step : public Velmark::Implements<Step, Velmark::FObject, Velmark::IEditStep> {
public:
    static constexpr const char* ClassName = "Step";

    Velmark::int32 execute() override { return Velmark::ResultOk; }
    Velmark::int32 undo() override { return Velmark::ResultOk; }
    Velmark::int32 redo() override { return Velmark::ResultOk; }
    const char16_t* getDescription() override { return nullptr; }
};

class ModuleLoaderTest : public testing::Test {
protected:
    ModuleLoaderTest() { setenv("FAKE_MODULE_CALLS", m_calls.c_str(), 1); }
    ~ModuleLoaderTest() override { unsetenv("FAKE_MODULE_CALLS"); }

    static std::string fake(const std::string& name)
    {
        return std::filesystem::path(cadrel::tests::programPath("../lib/" + name + ".so")).lexically_normal();
    }
    /// Why it can't be loaded; empty when it can.
    std::string refusal(const std::string& module)
    {
        try {
            const ModuleLoader loader(m_application, module, "/some/resources");
            return "";
        } catch (const ModuleError& error) {
            return error.what();
        }
    }
    std::string calls() { return std::filesystem::exists(m_calls) ? cadrel::tests::contentOf(m_calls) : ""; }

    cadrel::tests::TempFolder m_folder;
    std::filesystem::path m_calls = m_folder.path() / "calls";
    Application m_application;
};

} // namespace

TEST_F(ModuleLoaderTest, GoesAllTheWayInAndBackInTheRightOrder)
{
    EXPECT_EQ(refusal(fake("FakeModule")), "");

    EXPECT_EQ(calls(), "/some/resources\ninitialize\nterminate\nobject released\nexit\n");
}

TEST_F(ModuleLoaderTest, TakesBackWhatItHasDoneUpToTheStepThatFails)
{
    EXPECT_EQ(refusal(fake("RefusesEntry")), fake("RefusesEntry") + ": the module refuses to be loaded");
    EXPECT_EQ(calls(), "/some/resources\n");
    std::filesystem::remove(m_calls);

    EXPECT_EQ(refusal(fake("HasNoFactory")), fake("HasNoFactory") + ": the module has no factory");
    EXPECT_EQ(calls(), "/some/resources\nexit\n");
    std::filesystem::remove(m_calls);

    EXPECT_EQ(refusal(fake("HasNoService")),
              fake("HasNoService") + ": the module has no class of the kind \"Service\"");
    EXPECT_EQ(calls(), "/some/resources\nexit\n");
    std::filesystem::remove(m_calls);

    EXPECT_EQ(refusal(fake("MakesNoObject")), fake("MakesNoObject") + ": the module can't make its object");
    EXPECT_EQ(calls(), "/some/resources\nexit\n");
    std::filesystem::remove(m_calls);

    EXPECT_EQ(refusal(fake("RefusesHost")), fake("RefusesHost") + ": the module doesn't work in this host");
    EXPECT_EQ(calls(), "/some/resources\ninitialize\nobject released\nexit\n");
}

TEST_F(ModuleLoaderTest, LeavesTheUndoListsAloneWhenNothingWasLoaded)
{
    auto& project = m_application.createProject();
    m_application.activateProject(&project);
    const auto edits = Velmark::service<Velmark::IEditService>(m_application.context());
    const auto transaction = Velmark::query<Velmark::IEditTransaction>(edits);
    ASSERT_EQ(transaction->begin(true), Velmark::ResultOk);
    ASSERT_EQ(transaction->addStep(Velmark::makeCounted<Step>().get()), Velmark::ResultOk);
    ASSERT_EQ(transaction->commit(&project, u"Step"), Velmark::ResultOk);
    const auto undo = [this] {
        return m_application.actions().invoke(Velmark::IActionManager::EditCategory, Velmark::IActionManager::Undo, 0);
    };
    EXPECT_NE(refusal(fake("RefusesHost")), "");
    EXPECT_EQ(undo(), Velmark::ResultOk);
}

TEST_F(ModuleLoaderTest, NamesAFileThatIsNoModule)
{
    EXPECT_TRUE(refusal("/nowhere/Module.so").starts_with("/nowhere/Module.so: "));
    const auto text = m_folder.path() / "Text.so";
    cadrel::tests::writeFile(text, "no shared object");
    EXPECT_TRUE(refusal(text).starts_with(text.string() + ": "));
    // A shared object, but not a module.
    EXPECT_EQ(refusal(fake("NoModule")), fake("NoModule") + ": the module lacks bundleEntry");
    EXPECT_EQ(calls(), "");
}
