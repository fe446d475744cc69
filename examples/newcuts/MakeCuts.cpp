// SPDX-License-Identifier: GPL-3.0-or-later

// Makes new cuts to take notes of: make_cuts speed_effects.edl FOLDER

#include "examples/newcuts/Film.h"
#include "examples/newcuts/RealReel.h"

#include <exception>
#include <iostream>

int main(int count, char** arguments)
{
    if (count != 3) {
        std::cerr << "usage: make_cuts speed_effects.edl FOLDER\n";
        return 2;
    }
    try {
        const std::filesystem::path folder = arguments[2];
        std::filesystem::create_directories(folder);
        cadrel::examples::makeRealReel(arguments[1], folder / "speed_effects_v2.edl");
        cadrel::examples::makeFilm(folder);
    } catch (const std::exception& failure) {
        std::cerr << "make_cuts: " << failure.what() << '\n';
        return 1;
    }
    return 0;
}
