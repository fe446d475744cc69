# SPDX-License-Identifier: GPL-3.0-or-later

# Writes a file as a C++ source with its bytes; see cadrel_embed.
file(READ ${FILE} bytes HEX)
string(REGEX REPLACE "(..)" "0x\\1," bytes "${bytes}")
string(REGEX REPLACE "(................................................................................)" "\\1\n" bytes "${bytes}")
file(WRITE ${SOURCE} "#include <span>

namespace cadrel::embedded {

namespace {

constexpr unsigned char Bytes[] = {
${bytes}
};

} // namespace

extern const std::span<const unsigned char> ${VARIABLE};
constinit const std::span<const unsigned char> ${VARIABLE}(Bytes);

} // namespace cadrel::embedded
")
