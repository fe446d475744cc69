// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Attributes.h"
#include "velmark/Counted.h"

#include <map>
#include <string>
#include <variant>

namespace standin {

/// The value of an attribute as the project keeps it. An object is an AttributeList, or any other for an attribute that
/// isn't persistent.
struct Attribute {
    using Value = std::variant<Velmark::int64, std::string, Velmark::Counted<Velmark::FUnknown>>;

    Value value;
    bool isPersistent = false;

    /// Attribute lists are equal when their content is.
    friend bool operator==(const Attribute& a, const Attribute& b);
};

using Attributes = std::map<std::string, Attribute>;

} // namespace standin
