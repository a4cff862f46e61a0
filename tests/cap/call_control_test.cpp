// Call-control types through the real entry points: each case is one
// operation argument in an Invoke, checked from the operation's name on.
// Units of other areas (cause, party numbers) are not looked into here.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/harness.h"

using camel::test::Bytes;
using camel::test::decode;
using camel::test::hexBytes;
using Texts = std::vector<std::string>;

namespace {

Bytes tlv(uint8_t tag, const Bytes &content) {
    Bytes out{tag, static_cast<uint8_t>(content.size())};
    out.insert(out.end(), content.begin(), content.end());
    return out;
}

// A Begin carrying one Invoke (id 1) of operation `op` with argument `arg`.
Bytes invoke(uint8_t op, const std::string &arg) {
    Bytes component = hexBytes("02 01 01 02 01");
    component.push_back(op);
    const Bytes a = hexBytes(arg);
    component.insert(component.end(), a.begin(), a.end());
    Bytes content = hexBytes("48 01 01");
    const Bytes portion = tlv(0x6C, tlv(0xA1, component));
    content.insert(content.end(), portion.begin(), portion.end());
    return tlv(0x62, content);
}

// Index of the first field after the operation's name.
size_t argumentStart(const camel::test::Decoded &d) {
    for (size_t i = 0; i < d.fields.size(); ++i)
        if (d.fields[i].id == 1066)
            return i + 1;
    return d.fields.size();
}

Texts argumentTexts(const camel::test::Decoded &d) {
    const Texts all = d.texts();
    return Texts(all.begin() + long(argumentStart(d)), all.end());
}

// The display text shown for the first field with id `id`.
std::string shown(const camel::test::Decoded &d, uint32_t id) {
    for (size_t i = 0; i < d.fields.size() && i < d.shown.size(); ++i)
        if (d.fields[i].id == id)
            return d.shown[i].text;
    return "?";
}

struct Case {
    const char *name;
    uint8_t op;
    std::string arg;
    Texts texts; // from the argument's outer tag on
    uint32_t flags = 0;
};

void check(const Case &c) {
    SCOPED_TRACE(c.name);
    const auto d = decode(invoke(c.op, c.arg));
    EXPECT_EQ(argumentTexts(d), c.texts);
    EXPECT_EQ(d.md.errorFlags, c.flags);
}

} // namespace

TEST(CallControl, Probe) {
    check({"probe", 0, "30 00", {}});
    EXPECT_EQ(shown(decode(invoke(0, "30 00")), 1159), "30");
}
