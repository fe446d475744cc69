// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/NumberList.h"

#include "core/serialize/ByteArchive.h"
#include "host/border/HostFailure.h"
#include "velmark/Attributes.h"
#include "velmark/Context.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>

using namespace Velmark;
using cadrel::core::serialize::ByteArchive;
using cadrel::util::Result;

namespace cadrel::host {

std::optional<std::vector<double>> readNumbers(IProjectNode& node, const char* key)
{
    FVariant value;
    if (node.getAttribute(key, value) != ResultOk)
        return std::nullopt;
    const auto list = query<IAttributeData>(value.asObject());
    const int32 size = list ? list->getBinarySize(AttributeKey::Numbers) : -1;
    if (size < 0 || static_cast<std::size_t>(size) % sizeof(double) != 0)
        return std::nullopt;
    std::vector<std::uint8_t> bytes(static_cast<std::size_t>(size));
    if (list->getBinary(AttributeKey::Numbers, bytes.data(), size) != ResultOk)
        return std::nullopt;
    ByteArchive block;
    block.assign(bytes.data(), bytes.size());
    std::vector<double> numbers(bytes.size() / sizeof(double));
    for (double& number : numbers)
        block >> number;
    if (!std::ranges::all_of(numbers, [](double number) { return std::isfinite(number); }))
        return std::nullopt;
    return numbers;
}

void writeNumbers(IHostContext* context, IProjectNode& node, const char* key, const std::vector<double>& numbers)
{
    ByteArchive block;
    for (const double number : numbers)
        block << number;
    if (block.size() > static_cast<std::size_t>(std::numeric_limits<int32>::max()))
        throw Result::OutOfRange;
    const auto list = required(create<IAttributeData>(context));
    requireOk(list->setBinary(AttributeKey::Numbers, block.data(), static_cast<int32>(block.size()), true));
    requireOk(node.setAttribute(key, FVariant::object(list.get()), true));
}

void removeNumbers(IProjectNode& node, const char* key)
{
    if (node.hasAttribute(key) == ResultOk)
        requireOk(node.removeAttribute(key));
}

} // namespace cadrel::host
