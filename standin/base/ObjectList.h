// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Implements.h"

#include <vector>

namespace standin {

/// A list of any objects.
class ObjectList : public Velmark::Implements<ObjectList, Velmark::FObject, Velmark::IObjectList> {
public:
    static constexpr const char* ClassName = "ObjectList";

    /// Refuses null.
    Velmark::int32 add(Velmark::FUnknown* object, Velmark::int32 reserved) override;
    Velmark::int32 count() override;
    Velmark::FUnknown* at(Velmark::int32 index) override;

private:
    std::vector<Velmark::Counted<Velmark::FUnknown>> m_objects;
};

} // namespace standin
