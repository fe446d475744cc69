// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

/// 1 where the tests are built with AddressSanitizer, under either compiler.
#if defined(__SANITIZE_ADDRESS__)
#define CADREL_ADDRESS_SANITIZER 1
#elif defined(__has_feature)
#define CADREL_ADDRESS_SANITIZER __has_feature(address_sanitizer)
#else
#define CADREL_ADDRESS_SANITIZER 0
#endif
