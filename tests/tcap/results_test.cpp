// Return Result (Last) and Return Error contents through the entry points:
// the result SEQUENCE in both length forms, the results that are decoded,
// the error codes with their parameters, and the key entries 22 and 23.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {

// An End carrying one component `tag` (A2 or A3) for invoke id 3 with the
// octets that follow the invoke id.
Bytes component(uint8_t tag, const std::string &after) {
    Bytes content = hexBytes("02 01 03");
    const Bytes rest = hexBytes(after);
    content.insert(content.end(), rest.begin(), rest.end());
    Bytes message = hexBytes("49 01 01");
    const Bytes portion = tlv(0x6C, tlv(tag, content));
    message.insert(message.end(), portion.begin(), portion.end());
    return tlv(0x64, message);
}


struct Case {
    const char *name;
    uint8_t component;
    std::string after;
    Texts texts;
    uint32_t flags;
};

void check(const Case &c) {
    SCOPED_TRACE(c.name);
    const auto d = decode(component(c.component, c.after));
    EXPECT_EQ(camel::test::textsAfter(d, 3705), c.texts);
    EXPECT_EQ(d.md.errorFlags, c.flags);
    EXPECT_EQ(d.md.remainingBits, 0u);
}

TEST(Results, ResultSequence) {
    const Case cases[] = {
        {"invoke id only", 0xA2, "", {}, 0},
        {"operation without a decoded result", 0xA2, "30 03 02 01 37",
         {"Sequence Tag=30", "LENGTH=3 Octet(s)", "Operation Code Tag=Local Operation Code",
          "  Length=1 octet(s)", "Operation ID(RetRes)=Activity Test"},
         0},
        // The indefinite form: an end-of-contents check before the group; the
        // EOC after it is left to the component's window.
        {"indefinite", 0xA2, "30 80 02 01 46 00 00",
         {"Sequence Tag=30", "LENGTH=Indefinite Length", "Operation Code Tag=Local Operation Code",
          "  Length=1 octet(s)", "Operation ID(RetRes)=GPRS Activity Test"},
         DPX_ERR_LEFTOVER},
        {"unknown operation: rest skipped", 0xA2, "30 05 02 01 14 04 00",
         {"Sequence Tag=30", "LENGTH=5 Octet(s)", "Operation Code Tag=Local Operation Code",
          "  Length=1 octet(s)", "Operation ID(RetRes)="},
         DPX_ERR_LEFTOVER},
        // The digits response: type of digits (nothing consumed), then the
        // encoding scheme of the same octet and IA5 characters.
        {"Prompt And Collect, IA5 digits", 0xA2, "30 0A 02 01 30 80 05 41 31 32 7E 07",
         {"Sequence Tag=30", "LENGTH=10 Octet(s)", "Operation Code Tag=Local Operation Code",
          "  Length=1 octet(s)", "Operation ID(RetRes)=Prompt And Collect User Info.",
          "  Choice=Digits Response Tag", "LENGTH=5 octet(s)", "  Type Of Digits=Res Authorisation Code",
          "  Encoding Scheme=Ia5character", "IA5 Characters=12~."},
         0},
        {"Prompt And Collect, another alternative", 0xA2, "30 07 02 01 30 81 02 01 02",
         {"Sequence Tag=30", "LENGTH=7 Octet(s)", "Operation Code Tag=Local Operation Code",
          "  Length=1 octet(s)", "Operation ID(RetRes)=Prompt And Collect User Info.", "  Choice="},
         DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases)
        check(c);
}

TEST(Results, ErrorsAndTheirParameters) {
    const Case cases[] = {
        {"no parameter", 0xA3, "02 01 11",
         {"Error Code Tag=Local Error Code", "  Length=1 octet(s)", "Error Code=Unknown Leg Id"}, 0},
        {"cancel failed without its problem", 0xA3, "02 01 01 30 03 81 01 05",
         {"Error Code Tag=Local Error Code", "  Length=1 octet(s)", "Error Code=Cancel Failed",
          "  Sequence Tag=30", "  LENGTH=3 octet(s)", "  Operation Tag=81", "  LENGTH=1 octet(s)",
          "  Invoke Id=5"},
         DPX_ERR_MANDATORY_MISSING},
        {"system failure", 0xA3, "02 01 0B 0A 01 03",
         {"Error Code Tag=Local Error Code", "  Length=1 octet(s)", "Error Code=Systemfailure",
          "  Parameter Tag=a", "  LENGTH=1 octet(s)", "  Unavailable Network Resource=Resource Status Failure"},
         0},
        // A parameter that is not the expected ENUMERATED: flagged, and its
        // octets left over in the component.
        {"system failure, wrong parameter", 0xA3, "02 01 0B 30 01 02",
         {"Error Code Tag=Local Error Code", "  Length=1 octet(s)", "Error Code=Systemfailure"},
         DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        {"unknown code", 0xA3, "02 01 09 0A 01 02",
         {"Error Code Tag=Local Error Code", "  Length=1 octet(s)", "Error Code="}, DPX_ERR_LEFTOVER},
        {"global code: only its first octet", 0xA3, "06 02 01 05",
         {"Error Code Tag=Global Error Code", "  Length=2 octet(s)", "Error Code=Cancel Failed"},
         DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        {"code cut short", 0xA3, "02 01", {"Error Code Tag=Local Error Code", "  Length=1 octet(s)"}, 0},
    };
    for (const auto &c : cases)
        check(c);
}

TEST(Results, KeyEntriesOfResultAndErrorCodes) {
    using Keys = std::vector<std::pair<uint32_t, Bytes>>;
    const auto keysOf = [](const Bytes &message) {
        Keys keys;
        for (const auto &k : decode(message).keyEntries)
            keys.push_back({k.index, k.value});
        return keys;
    };
    EXPECT_EQ(keysOf(component(0xA2, "30 03 02 01 37")),
              (Keys{{0, {0x64}}, {4, {0x03}}, {22, {0x37}}, {27, {0xA2}}, {29, {0x01}}}));
    EXPECT_EQ(keysOf(component(0xA3, "02 01 0C 0A 01 02")),
              (Keys{{0, {0x64}}, {4, {0x03}}, {23, {0x0C}}, {28, {0xA3}}, {29, {0x01}}}));
}

} // namespace
