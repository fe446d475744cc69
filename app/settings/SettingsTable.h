// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/Settings.h"

#include <cstdint>
#include <functional>
#include <span>
#include <string>
#include <variant>
#include <vector>

namespace cadrel::app {

/// On or off: `--name` and `--no-name`.
struct SwitchSetting {
    core::Option<bool> core::Settings::*option;
};

/// One of some words, which stand for the numbers from 0: `--name WORD`.
struct ChoiceSetting {
    core::Option<std::int32_t> core::Settings::*option;
    std::span<const char* const> words;
    const char* wordName; ///< in the help
};

/// A number of frames: `--name FRAMES`.
struct FramesSetting {
    core::Option<std::int32_t> core::Settings::*option;
};

/// A bound that may be off: `--name NUMBER` and `--no-name`.
template <typename Number>
struct BoundSetting {
    core::Option<bool> core::Settings::*isOn;
    core::Option<Number> core::Settings::*bound;
    Number least;
    Number greatest;
    const char* numberName; ///< in the help
    const char* offHelp;    ///< for `--no-name`
};

/// The stretch that a run may change: `--name BEFORE AFTER` and `--no-name`.
struct RangeSetting {
    const char* offHelp; ///< for `--no-name`
};

/// The names of VFX shots: `--name PREFIX,POSTFIX`.
struct VfxSetting {};

/// A setting as the program's options, its help and its reports call it.
struct SettingEntry {
    /// What it is for: for every run, for generating a change EDL too, or for that alone.
    enum class Use { Run, RunAndGeneration, Generation };

    const char* name; ///< of its option, without the dashes
    Use use;
    std::variant<SwitchSetting, ChoiceSetting, FramesSetting, BoundSetting<std::int32_t>, BoundSetting<double>,
                 RangeSetting, VfxSetting>
        kind;
    const char* help;
};

/// Every setting that the program offers, in the order of its help and its reports.
std::span<const SettingEntry> settingsTable();

/// What clears the names of VFX shots.
constexpr const char* NoVfxPatterns = "none";

/// What the user wants otherwise than the settings have it.
struct GivenSettings {
    struct Change {
        const SettingEntry* entry;
        std::function<void(core::Settings&)> apply;
    };

    std::vector<Change> changes;          ///< in the order in which they were given
    std::vector<std::string> vfxPatterns; ///< "PREFIX,POSTFIX", or NoVfxPatterns alone; none: those of the settings
    std::vector<std::string> preserve;    ///< two timecodes of the project's clock; none: what the settings say

    /// Whether the user gave it.
    bool has(const SettingEntry& entry) const;
};

} // namespace cadrel::app
