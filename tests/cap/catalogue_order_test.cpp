// The catalogue lists fields in the order a depth-first walk of the grammar
// first meets them, and display ids follow from that order (the CTest
// catalogue_order checks the order itself with tools/catalogue/order_fields.py).
#include <gtest/gtest.h>

#include <string>

#include "fields/field_table.h"

namespace {

// The display ids that the order decides for labels shared across units.
TEST(Catalogue, SharedLabelsShowUnderTheFirstField) {
    const struct {
        const char *label;
        uint32_t displayId;
    } cases[] = {{"LENGTH", 3606}, {"  Length", 3718}, {"Sequence Tag", 1072}, {"Spare", 1821},
                 {"Filler", 3590}};
    for (const auto &c : cases) {
        SCOPED_TRACE(c.label);
        bool found = false;
        for (size_t i = 0; i < camel::kFieldCount; ++i) {
            std::string label = camel::kFields[i].label;
            const std::string want = c.label;
            if (label.find_first_not_of(' ') == std::string::npos)
                continue;
            if (label.substr(label.find_first_not_of(' ')) != want.substr(want.find_first_not_of(' ')))
                continue;
            found = true;
            EXPECT_EQ(camel::kDisplayIds.id[i], c.displayId) << camel::kFields[i].id;
        }
        EXPECT_TRUE(found);
    }
}

} // namespace
