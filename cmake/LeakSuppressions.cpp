// SPDX-License-Identifier: GPL-3.0-or-later

// For the builds with AddressSanitizer: the font library that cairo uses never frees what it has matched.
extern "C" const char* __lsan_default_suppressions();

extern "C" const char* __lsan_default_suppressions()
{
    return "leak:libfontconfig\n";
}
