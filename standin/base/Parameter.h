// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Transport.h"

namespace standin {

/// A time that the user sees and can change. It isn't part of the undo list.
class Parameter : public Velmark::Implements<Parameter, Velmark::FObject, Velmark::IParameter> {
public:
    static constexpr const char* ClassName = "Parameter";

    /// Refuses what isn't finite, and what lies beyond all time.
    Velmark::int32 setValue(Velmark::int32 flags, double value) override;
    double getValue() override { return m_value; }

private:
    double m_value = 0.0;
};

} // namespace standin
