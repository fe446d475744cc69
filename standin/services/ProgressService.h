// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/services/Terminal.h"
#include "standin/services/UserBoxes.h"
#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

#include <optional>
#include <string>

namespace standin {

/// The progress of one operation at a time, as a box or, without boxes, as a line on the terminal:
///
///     Cadrel:  45% (123 of 270) Processing Project - Generate Markers
///
/// How many stages there will be isn't known, so that each takes what the former ones have left of the hundred.
///
/// The user cancels in the box, or by interrupting the program: whatever the operation tells of its progress asks for that. All
/// but `begin` is refused while no operation has begun.
class ProgressService : public Velmark::Implements<ProgressService, Velmark::FObject, Velmark::IProgressService> {
public:
    static constexpr const char* ClassName = "ProgressService";

    explicit ProgressService(Terminal& terminal) : m_terminal(terminal) {}
    ~ProgressService() override;

    /// Not owned; null for none.
    void setBoxes(UserBoxes* boxes) { m_boxes = boxes; }

    /// Refuses a second operation, and every mode but Modal.
    Velmark::int32 begin(Velmark::int32 mode, const char16_t* title, bool* cancelled) override;
    Velmark::int32 setStatus(const char16_t* text) override;
    Velmark::int32 setRange(Velmark::uint64 total) override;
    /// Beyond the end of the stage is its end, here and for `tick`.
    Velmark::int32 setPosition(Velmark::uint64 value) override;
    Velmark::int32 setText(const char16_t* text) override;
    Velmark::int32 tick(Velmark::uint64 steps) override;
    Velmark::int32 show() override;
    Velmark::int32 end() override;

private:
    struct Operation {
        Operation(const char16_t* operationTitle, bool* operationCancelled);

        void beginStage(Velmark::uint64 steps);
        int percentage() const;
        std::u16string line() const;
        UserBoxes::Progress progress() const;

        std::u16string title;
        std::u16string text;
        std::u16string status;
        Velmark::uint64 total = 0; ///< 0 before a stage has begun
        Velmark::uint64 position = 0;
        int stageStart = 0; ///< the percentage at which the stage began
        bool* cancelled = nullptr;
        bool isVisible = false;
    };

    /// Takes the user's cancel over and draws the line anew.
    void report(bool looksDifferent = true);

    Terminal& m_terminal;
    UserBoxes* m_boxes = nullptr;
    std::optional<Operation> m_operation;
};

} // namespace standin
