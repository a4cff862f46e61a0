// The catalogue lists fields in the order a depth-first walk of the grammar
// first meets them, and display ids follow from that order (the CTest
// catalogue_order checks the order itself with tools/catalogue/order_fields.py).
#include <gtest/gtest.h>

#include "fields/field_table.h"

namespace {

// Every display id that is stated outright, by field id.  Each is evidence
// of the catalogue order: the display id is the first field with the label.
// Fields not declared yet are counted and must all exist once the catalogue
// is complete.  (The time and timezone tag 2231 is also said to be shown
// under 2230, whose label differs: no catalogue order gives that.)
TEST(Catalogue, StatedDisplayIdsHold) {
    const struct {
        uint32_t field, displayId;
    } cases[] = {
        // message level
        {3604, 3604}, {3606, 3606}, {3608, 3606}, {3611, 3606}, {3612, 3606}, {3613, 3606},
        {3615, 3615}, {3616, 3606}, {3651, 3651}, {3652, 3606}, {3653, 3653}, {3654, 3654},
        {3655, 3606}, {3656, 3656}, {3657, 3657}, {3658, 3718}, {3659, 3659}, {1065, 1065},
        // shared labels: "  Length"/"Length", problem codes, invoke ids, spare, filler
        {3718, 3718}, {3704, 3718}, {3701, 3701}, {3710, 3701}, {3712, 3701}, {3714, 3701},
        {3716, 3701}, {3705, 3705}, {1531, 3705}, {1927, 3705}, {1821, 1821}, {3590, 3590},
        {2085, 3590}, {1072, 1072},
        // MCC-MNC blocks: every "MNC" under 2083, the first in the catalogue
        {2079, 2079}, {2080, 2080}, {2083, 2083}, {2086, 2083}, {2087, 2087},
        // SMS and GPRS parameters
        {2576, 1072}, {2154, 2159}, {2151, 2159}, {2442, 2079}, {2443, 2080}, {2448, 3590},
        {2449, 2083}, {2446, 2083}, {2450, 2087}, {2451, 2451}, {2377, 1551}, {2381, 1477},
        {2412, 3718}, {2463, 2461}, {2472, 2470}, {2475, 2473}, {2478, 2476},
        {2484, 2169}, {2433, 2169},
    };
    size_t undeclared = 0;
    for (const auto &c : cases) {
        const size_t at = camel::fieldIndex(c.field);
        if (at == camel::kFieldCount) {
            ++undeclared;
            continue;
        }
        EXPECT_EQ(camel::kDisplayIds.id[at], c.displayId) << "field " << c.field;
    }
    if (camel::kFieldCount >= 1492) {
        EXPECT_EQ(undeclared, 0u);
    }
}

// Lookup by id finds every declared field and nothing else.
TEST(Catalogue, FieldIndexFindsEachIdOnce) {
    for (size_t i = 0; i < camel::kFieldCount; ++i)
        EXPECT_EQ(camel::fieldIndex(camel::kFields[i].id), i);
    size_t found = 0;
    for (uint32_t id = 0; id < camel::kIdLimit + 10; ++id)
        found += camel::fieldIndex(id) != camel::kFieldCount;
    EXPECT_EQ(found, camel::kFieldCount);
}

} // namespace
