// Prints, per operation of the argument tables, the field ids the tables'
// rows show in the order a depth-first walk first meets them, one line per
// operation: "CODE ID ID ...".  order_fields.py merges these with the
// fields the decoder reports for generated messages.
#include <cstdio>
#include <set>

#include "cap/arguments.h"

namespace {

void walk(const camel::MemberTable &t, std::set<const camel::MemberTable *> &seen,
          std::set<camel::FieldIndex> &met) {
    if (!seen.insert(&t).second)
        return;
    const auto meet = [&](camel::FieldIndex f) {
        if (f != camel::kNoField && met.insert(f).second)
            std::printf(" %u", camel::kFields[f].id);
    };
    meet(t.choiceField);
    for (uint32_t i = 0; i < t.count; ++i) {
        const camel::Member &m = t.rows[i];
        meet(m.tagField);
        meet(m.lengthField);
        meet(m.value.field);
        if (m.value.bits != nullptr)
            for (uint32_t b = 0; b < m.value.bits->count; ++b)
                meet(m.value.bits->rows[b].field);
        if (m.value.table != nullptr)
            walk(*m.value.table, seen, met);
    }
}

} // namespace

int main() {
    for (uint32_t i = 0; i < camel::kArgumentCount; ++i) {
        if (camel::kArguments[i].table == nullptr)
            continue;
        std::set<const camel::MemberTable *> seen;
        std::set<camel::FieldIndex> met;
        std::printf("%u", camel::kArguments[i].code);
        walk(*camel::kArguments[i].table, seen, met);
        std::printf("\n");
    }
}
