#include "field_kinds.h"

#include <array>

#include "fields/field_table.h"

namespace dpxdecode {
namespace {

struct Info {
    FieldKind kind = FieldKind::Value;
    bool named = false;
    int8_t key = -1;
};

constexpr uint32_t maxId() {
    uint32_t m = 0;
    for (const camel::FieldDef &f : camel::kFields)
        m = f.id > m ? f.id : m;
    return m;
}
constexpr uint32_t kMaxId = maxId();

constexpr FieldKind kindOf(const camel::FieldDef &f) {
    if (f.id == camel::fid::kEndOfContents)
        return FieldKind::EndOfContents;
    switch (f.render) {
    case camel::Render::Tag:
        return FieldKind::Tag;
    case camel::Render::LenHeader:
    case camel::Render::LenBlock:
        return FieldKind::Length;
    default:
        return FieldKind::Value;
    }
}

// Indexed by field id: a few kilobytes, built at compile time.
constexpr std::array<Info, kMaxId + 1> kInfo = [] {
    std::array<Info, kMaxId + 1> a{};
    for (const camel::FieldDef &f : camel::kFields)
        a[f.id] = Info{kindOf(f), f.render == camel::Render::Enum, f.keyEntry};
    return a;
}();

const Info &info(uint32_t id) {
    static constexpr Info none{};
    return id <= kMaxId ? kInfo[id] : none;
}

} // namespace

FieldKind fieldKind(uint32_t id) { return info(id).kind; }
bool fieldShowsName(uint32_t id) { return info(id).named; }
int fieldKeyEntry(uint32_t id) { return info(id).key; }

} // namespace dpxdecode
