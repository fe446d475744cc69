// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

namespace standin {

/// This host has no windows, so it refuses every skin and every name of a window.
class ViewManager : public Velmark::Implements<ViewManager, Velmark::FObject, Velmark::IViewManager> {
public:
    static constexpr const char* ClassName = "ViewManager";

    Velmark::int32 loadSkin(Velmark::BundleHandle bundle, const char* file) override;
    Velmark::int32 openWindow(const char* name, Velmark::IViewBuilder* builder, Velmark::IHostWindow** window) override;
};

} // namespace standin
