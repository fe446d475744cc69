// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/HandlerList.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"
#include "velmark/UserInterface.h"

#include <vector>

namespace standin {

/// The windows that modules can open.
class WindowFactoryRegistry
    : public Velmark::Implements<WindowFactoryRegistry, Velmark::FObject, Velmark::IWindowFactoryRegistry> {
public:
    static constexpr const char* ClassName = "WindowFactoryRegistry";

    /// Refuses null, and a factory that is there already.
    Velmark::int32 addFactory(Velmark::IPlugWindowFactory* factory) override { return m_factories.add(factory); }
    /// Refuses a factory that isn't there.
    Velmark::int32 removeFactory(Velmark::IPlugWindowFactory* factory) override { return m_factories.remove(factory); }

    /// In the order in which they came.
    const std::vector<Velmark::IPlugWindowFactory*>& factories() const { return m_factories.all(); }

private:
    HandlerList<Velmark::IPlugWindowFactory> m_factories;
};

} // namespace standin
