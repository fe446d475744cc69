// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/border/HostFailure.h"

#include "tests/support/ThrownResult.h"
#include "velmark/StringObject.h"

#include <gtest/gtest.h>

#include <stdexcept>

namespace cadrel::host::tests {
namespace {

using cadrel::tests::thrownBy;
using util::Result;
using Velmark::Counted;
using Velmark::makeCounted;
using Velmark::StringObject;

} // namespace

TEST(HostFailure, LetsThroughWhatTheHostGave)
{
    const auto object = makeCounted<StringObject>(u"reel");

    EXPECT_EQ(required(object), object);
    EXPECT_EQ(required(object.get()), object.get());
    EXPECT_EQ(object->refCount(), 1) << "Nobody keeps a reference.";
}

TEST(HostFailure, ThrowsThatAnObjectIsMissingForWhatTheHostDidntGive)
{
    EXPECT_EQ(thrownBy([] { static_cast<void>(required(Counted<StringObject>())); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([] { required<StringObject>(nullptr); }), Result::HostObjectMissing);
}

TEST(HostFailure, ThrowsThatACallFailedForEveryRefusal)
{
    EXPECT_NO_THROW(requireOk(Velmark::ResultOk));
    EXPECT_EQ(thrownBy([] { requireOk(Velmark::ResultFalse); }), Result::HostCallFailed);
    EXPECT_EQ(thrownBy([] { requireOk(Velmark::ResultNoInterface); }), Result::HostCallFailed);
    EXPECT_EQ(thrownBy([] { requireOk(7); }), Result::HostCallFailed);
}

TEST(HostFailure, AnswersTheHostWithWhatAnActionThrew)
{
    EXPECT_EQ(resultOf([] {}), Result::Ok);
    EXPECT_EQ(resultOf([] { throw Result::ChecksumMismatch; }), Result::ChecksumMismatch);
    EXPECT_EQ(resultOf([] { throw std::runtime_error("something else"); }), Result::NotAvailable);
}

} // namespace cadrel::host::tests
