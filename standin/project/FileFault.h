// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace standin {

/// What is wrong in the content of a file: one line, of the place and the fault. It may also tell what the user can do.
class FileFault : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
    FileFault(const std::string& place, const std::string& fault)
        : std::runtime_error(place.empty() ? fault : place + ": " + fault)
    {
    }

    FileFault withRemedy(std::string remedy) const
    {
        FileFault fault = *this;
        fault.m_remedy = std::move(remedy);
        return fault;
    }
    /// Empty where it isn't known.
    const std::string& remedy() const { return m_remedy; }

private:
    std::string m_remedy;
};

/// A text as a message shows it: in quotes, on one line, and only its beginning when it is long.
std::string quoted(std::string_view text);

// The steps of a place such as tracks[3].attributes["User:STR_MAReel"], each added to those before it.

void appendMember(std::string& place, std::string_view key);
void appendElement(std::string& place, std::size_t index);

} // namespace standin
