// The catalogue lists fields in the order a depth-first walk of the grammar
// first meets them, and display ids follow from that order.  The member
// tables are data, so the walk over them can be checked: taken in the
// dispatcher's order, every field a row shows must come later in the
// catalogue than every field met before it.
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

#include "cap/arguments.h"
#include "fields/field_table.h"

namespace {

using camel::FieldIndex;
using camel::Member;
using camel::MemberTable;

struct Walker {
    std::set<const MemberTable *> seen;
    std::set<FieldIndex> met;
    FieldIndex highest = 0;
    std::vector<std::string> outOfOrder;

    void meet(FieldIndex f, const char *where) {
        if (f == camel::kNoField || !met.insert(f).second)
            return;
        if (f < highest)
            outOfOrder.push_back(std::to_string(camel::kFields[f].id) + " (" + where + ") before " +
                                 std::to_string(camel::kFields[highest].id));
        else
            highest = f;
    }
    void walk(const MemberTable &t) {
        if (!seen.insert(&t).second)
            return;
        meet(t.choiceField, "choice");
        for (uint32_t i = 0; i < t.count; ++i) {
            const Member &m = t.rows[i];
            meet(m.tagField, m.name);
            meet(m.lengthField, m.name);
            meet(m.value.field, m.name);
            if (m.value.table != nullptr)
                walk(*m.value.table);
        }
    }
};

TEST(Catalogue, ArgumentTablesFollowTheCatalogueOrder) {
    Walker w;
    for (uint32_t i = 0; i < camel::kArgumentCount; ++i)
        if (camel::kArguments[i].table != nullptr)
            w.walk(*camel::kArguments[i].table);
    EXPECT_GT(w.met.size(), 100u);
    EXPECT_TRUE(w.outOfOrder.empty()) << [&] {
        std::string all;
        for (const auto &s : w.outOfOrder)
            all += s + "\n";
        return all;
    }();
}

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
