// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/RunNoteStep.h"

#include "core/model/DataModel.h"
#include "host/border/HostFailure.h"

#include <utility>

namespace cadrel::host {

using core::DataModel;
using core::PropertyKey;
using core::Variant;
using util::Result;

namespace {

std::optional<Variant> propertyOf(const DataModel& model, PropertyKey::Type key)
{
    Variant value;
    return model.getProperty(key, value) == Result::Ok ? std::optional(value) : std::nullopt;
}

void setProperty(DataModel& model, PropertyKey::Type key, const std::optional<Variant>& value)
{
    if (value)
        model.setProperty(key, *value);
    else
        model.removeProperty(key);
}

} // namespace

RunNoteStep::RunNoteStep(const std::shared_ptr<DataModel>& model) : m_model(model), m_other(noteIn(*model)) {}

RunNoteStep::Note RunNoteStep::noteIn(const DataModel& model)
{
    return {propertyOf(model, PropertyKey::DoneRuns), propertyOf(model, PropertyKey::EarlierRuns)};
}

Velmark::int32 RunNoteStep::swap()
{
    return resultOf([this] {
        const auto model = m_model.lock();
        if (!model)
            throw Result::NotAvailable;
        const Note note = std::exchange(m_other, noteIn(*model));
        setProperty(*model, PropertyKey::DoneRuns, note.doneRuns);
        setProperty(*model, PropertyKey::EarlierRuns, note.earlierRuns);
    });
}

} // namespace cadrel::host
