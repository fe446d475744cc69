// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/GenerationSettings.h"

#include "core/model/DataModel.h"

#include <cstdint>
#include <string>

namespace cadrel::gui {

namespace {

/// In the property map of the model, after the keys of core::PropertyKey.
constexpr std::int32_t GeneratedWith = 10024;

/// A line for each.
std::string textOf(const core::Settings& settings)
{
    std::string text = std::to_string(settings.matchBy()) + "\n" + std::to_string(settings.healMode());
    for (const core::VfxPatternEntry& name : settings.vfxPatterns()) {
        if (name.enabled)
            text += "\n" + name.prefix + "\n" + name.postfix;
    }
    return text;
}

} // namespace

void GenerationSettings::keep(core::DataModel& model)
{
    model.setProperty(GeneratedWith, core::Variant(textOf(model.settings())));
}

bool GenerationSettings::haveChanged(const core::DataModel& model)
{
    core::Variant kept;
    if (model.changeEdl().isEmpty() || model.getProperty(GeneratedWith, kept) != util::Result::Ok)
        return false;
    return kept.toText() != textOf(model.settings());
}

} // namespace cadrel::gui
