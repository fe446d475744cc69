// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"

#include <cstddef>
#include <stdexcept>
#include <type_traits>

namespace Velmark {

/// The name of an interface or of a class: 16 raw bytes, in the order of their hexadecimal text. Across the border to the
/// host it is always passed by address.
struct Identifier {
    static constexpr std::size_t Size = 16;

    constexpr Identifier() = default;
    /// From 32 hexadecimal digits, for constants: a mistake in their text doesn't compile.
    explicit constexpr Identifier(const char (&digits)[2 * Size + 1])
    {
        for (std::size_t index = 0; index < Size; ++index) {
            const int high = digitValue(digits[2 * index]);
            const int low = digitValue(digits[2 * index + 1]);
            if (high < 0 || low < 0)
                throw std::invalid_argument("not a hexadecimal digit");
            bytes[index] = static_cast<uint8>(16 * high + low);
        }
    }

    /// -1 for what is no hexadecimal digit.
    static constexpr int digitValue(char character)
    {
        if (character >= '0' && character <= '9')
            return character - '0';
        if (character >= 'a' && character <= 'f')
            return character - 'a' + 10;
        if (character >= 'A' && character <= 'F')
            return character - 'A' + 10;
        return -1;
    }

    friend constexpr bool operator==(const Identifier&, const Identifier&) = default;

    uint8 bytes[Size] = {};
};

static_assert(sizeof(Identifier) == Identifier::Size && alignof(Identifier) == 1);

/// The identifier of one interface. Its type names the interface, so that a class that derives from an interface isn't
/// mistaken for it.
template <class Interface>
struct InterfaceId : Identifier {
    explicit constexpr InterfaceId(const char (&digits)[2 * Size + 1]) : Identifier(digits) {}
};

/// An interface with an identifier of its own, which `queryInterface` can be asked for. The few others are only ever
/// handed over directly.
template <class Interface>
concept Identified = std::is_same_v<decltype(Interface::iid), const InterfaceId<Interface>>;

} // namespace Velmark
