// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace cadrel::tests {

/// Where the controls of Cadrel's window stand in its smallest size, as its own code has laid them out.
class WindowPlaces {
public:
    struct Place {
        int x;
        int y;
        int width;
        int height;

        Place movedBy(int right, int down) const { return {x + right, y + down, width, height}; }
    };

    /// Asks the program `window_places`. Throws std::runtime_error when it fails.
    WindowPlaces();

    /// A control of a sheet or, with an empty name, of the window itself: by its name, and by the text by which the user knows it
    /// where that isn't empty. Throws std::runtime_error unless there is exactly one.
    Place at(const std::string& sheet, const std::string& name, const std::string& text = "") const;
    /// Of all controls.
    std::vector<Place> all() const;

private:
    struct Control {
        std::string sheet;
        std::string name;
        std::string text;
        Place place;
    };

    std::vector<Control> m_controls;
};

} // namespace cadrel::tests
