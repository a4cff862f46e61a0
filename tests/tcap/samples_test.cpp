// Every bundled sample through the four passes: the cross-pass invariant
// (checked by the harness) and a pu_Realloc failure at every growth point.
#include <gtest/gtest.h>

#include "support/harness.h"

namespace {

TEST(Samples, FourPassesAgreeAndSurviveEveryReallocFailure) {
    const auto samples = camel::test::sampleMessages();
    ASSERT_GE(samples.size(), 50u);
    uint32_t points = 0;
    for (size_t i = 0; i < samples.size(); ++i) {
        SCOPED_TRACE(i);
        const auto d = camel::test::decode(samples[i]);
        EXPECT_FALSE(d.fields.empty());
        points += camel::test::checkReallocFailures(samples[i]);
        if (HasFailure())
            break;
    }
    EXPECT_GT(points, 20 * samples.size());
}

} // namespace
