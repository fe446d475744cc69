// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/WindowFactoryRegistry.h"

#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

class Factory : public Implements<Factory, FObject, IPlugWindowFactory> {
public:
    static constexpr const char* ClassName = "Factory";

    const char* getWindowName() override { return "CadrelWindow"; }
    bool hasWindow(IHostWindow*) override { return false; }
    IHostWindow* getWindow() override { return nullptr; }
};

} // namespace

TEST(WindowFactoryRegistry, KeepsTheFactoriesInTheirOrderWithoutCountingThem)
{
    const auto registry = makeCounted<WindowFactoryRegistry>();
    const Counted<IWindowFactoryRegistry> windows = registry;
    const auto first = makeCounted<Factory>();
    const auto second = makeCounted<Factory>();

    EXPECT_EQ(windows->addFactory(first.get()), ResultOk);
    EXPECT_EQ(windows->addFactory(second.get()), ResultOk);
    EXPECT_EQ(registry->factories(), (std::vector<IPlugWindowFactory*>{first.get(), second.get()}));
    EXPECT_EQ(first->refCount(), 1);

    EXPECT_EQ(windows->removeFactory(first.get()), ResultOk);
    EXPECT_EQ(registry->factories(), std::vector<IPlugWindowFactory*>{second.get()});
}

TEST(WindowFactoryRegistry, RefusesNullAndWhatItHasOrHasntAlready)
{
    const auto registry = makeCounted<WindowFactoryRegistry>();
    const Counted<IWindowFactoryRegistry> windows = registry;
    const auto factory = makeCounted<Factory>();

    EXPECT_NE(windows->addFactory(nullptr), ResultOk);
    EXPECT_NE(windows->removeFactory(nullptr), ResultOk);
    EXPECT_NE(windows->removeFactory(factory.get()), ResultOk);
    EXPECT_EQ(windows->addFactory(factory.get()), ResultOk);
    EXPECT_NE(windows->addFactory(factory.get()), ResultOk);

    EXPECT_EQ(registry->factories().size(), 1U);
}

} // namespace standin::tests
