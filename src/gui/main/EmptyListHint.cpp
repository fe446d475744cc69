// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/EmptyListHint.h"

#include "core/model/DataModel.h"
#include "gui/look/ShownText.h"

namespace cadrel::gui {

using core::ListKind;

namespace {

const wchar_t* changeHint(const core::DataModel& model)
{
    if (!model.changeEdl().isEmpty())
        return L"";
    if (model.oldEdl().isEmpty() || model.newEdl().isEmpty())
        return L"Add the EDLs of both cuts and press Generate, or add a Change EDL here.";
    return L"Press Generate to find out what has changed.";
}

const wchar_t* hint(const core::DataModel* model, std::int32_t listKind)
{
    if (!model)
        return listKind == ListKind::Change ? L"No project is open." : L"";
    switch (listKind) {
    case ListKind::Old:
        return model->oldEdl().isEmpty() ? L"Add the EDL of the old cut, or drop it here." : L"";
    case ListKind::New:
        return model->newEdl().isEmpty() ? L"Add the EDL of the new cut, or drop it here." : L"";
    default:
        return changeHint(*model);
    }
}

} // namespace

std::wstring emptyListHint(const core::DataModel* model, std::int32_t listKind)
{
    const std::wstring text = hint(model, listKind);
    return text.empty() ? text : translated(text);
}

} // namespace cadrel::gui
