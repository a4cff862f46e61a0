// Operation arguments through the real entry points: the argument skeleton
// (outer element, element loop, left-over bits), the walker's element
// shapes (one- and two-octet identifiers, inline values, repetition,
// choices, an identifier read without a check) and the operations that
// share a layout.  The type units have suites of their own.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {

TEST(Arguments, ElementLoopTakesMembersInAnyOrderAndAgain) {
    // Initial DP: Gsm Forwarding Pending, Call Reference Number, Gsm
    // Forwarding Pending again; two-octet identifiers throughout.
    const auto d = invoke(0x00, "30 0B 9F 3A 00 9F 36 02 1A 2B 9F 3A 00");
    const auto r = decode(d);
    EXPECT_EQ(argumentTexts(r),
              (Texts{"Sequence Tag=30", "  LENGTH=11 octet(s)", "Gsm Forwarding Pending Tag=3a9f",
                     "  LENGTH=0 octet(s)", "Call Reference Number Tag=369f", "  LENGTH=2 octet(s)",
                     "  Call Reference Number Value=1a2b", "Gsm Forwarding Pending Tag=3a9f",
                     "  LENGTH=0 octet(s)"}));
    EXPECT_EQ(r.md.errorFlags, 0u);
    EXPECT_EQ(r.md.remainingBits, 0u);
    // The two-octet tag is one 16-bit span, first octet low; the value's
    // half-octets are spans of their own, high half first.
    const auto *tag = r.find(2133);
    ASSERT_NE(tag, nullptr);
    EXPECT_EQ(tag->spans.size(), 1u);
    EXPECT_EQ(tag->spans[0].value, 0x369Fu);
    EXPECT_EQ(tag->spans[0].last - tag->spans[0].first, 15u);
    const auto *value = r.find(2135);
    ASSERT_NE(value, nullptr);
    EXPECT_EQ(value->selector, 1u);
    ASSERT_EQ(value->spans.size(), 4u);
    EXPECT_EQ(value->spans[0].value, 0x1u);
    EXPECT_EQ(value->spans[1].value, 0xAu);
    EXPECT_EQ(value->spans[1].first + 4, value->spans[0].first);
    // Display: "LENGTH" under one id whatever the field; values alone.
    for (size_t i = 0; i < r.fields.size(); ++i) {
        if (r.fields[i].label == "LENGTH") {
            EXPECT_EQ(r.shown[i].displayId, 3606u);
        }
    }
}

// What ends an argument early, and what is flagged.
TEST(Arguments, SkeletonFaults) {
    const struct {
        const char *name;
        uint8_t opcode;
        std::string argument;
        Texts texts;
        uint32_t flags;
    } cases[] = {
        {"outer tag not a SEQUENCE", 0x00, "31 03 9F 3A 00", {}, DPX_ERR_MANDATORY_MISSING | DPX_ERR_LEFTOVER},
        // 9F 3B is no member of Initial DP, though 9F 3A and BF 3B are.
        {"second identifier octet compared", 0x00, "30 03 9F 3B 00", {"Sequence Tag=30", "  LENGTH=3 octet(s)"},
         DPX_ERR_LEFTOVER},
        // A member longer than the argument: flagged, shown against what is
        // there, the later members skipped.
        {"member beyond the window", 0x00, "30 08 9F 36 09 01 02 9F 3A 00",
         {"Sequence Tag=30", "  LENGTH=8 octet(s)", "Call Reference Number Tag=369f", "  LENGTH=9 octet(s)",
          "  Call Reference Number Value=01029f3a00"},
         DPX_ERR_LENGTH_BEYOND},
        {"argument beyond the Invoke", 0x00, "30 09 9F 3A 00", {"Sequence Tag=30", "  LENGTH=9 octet(s)",
                                                               "Gsm Forwarding Pending Tag=3a9f",
                                                               "  LENGTH=0 octet(s)"},
         DPX_ERR_LENGTH_BEYOND},
        {"no argument octets", 0x00, "", {}, DPX_ERR_MANDATORY_MISSING},
        {"operation without argument", 0x1F, "30 00", {}, DPX_ERR_LEFTOVER},
        {"unknown operation", 0x63, "30 00", {}, DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const auto r = decode(invoke(c.opcode, c.argument));
        EXPECT_EQ(argumentTexts(r), c.texts);
        EXPECT_EQ(r.md.errorFlags, c.flags);
        EXPECT_EQ(r.status, c.flags != 0 ? DPX_STATUS_INVALID : 0);
    }
}

// An element no member names is stepped over by its own length and
// flagged, and the loop goes on to the members after it; a malformed or
// overrunning one ends the loop, and the window's rest is skipped.
TEST(Arguments, UnknownMembers) {
    const struct {
        const char *name;
        uint8_t opcode;
        std::string argument;
        Texts after; // texts after the argument's tag and length
    } cases[] = {
        // CAP v4 members the tables do not list: Connect's legToBeConnected
        // [21] and Establish Temporary Connection's callSegmentID [7].
        {"Connect: legToBeConnected before CUG Interlock", 20,
         "30 0C B5 03 80 01 02 9F 1F 04 01 02 03 04",
         {"CUG Interlock Tag=1f9f", "  LENGTH=4 octet(s)", "  CUG Interlock=1020304"}},
        {"Establish Temporary Connection: callSegmentID before NA Oli Info", 17,
         "30 07 87 01 01 9F 32 01 3D", {"NA Oli Info Tag=329f", "  LENGTH=1 octet(s)", "  NA Oli Info Value=3d"}},
        {"two in a row, one of a three-octet identifier", 33, "30 09 9F 3A 00 BF 81 00 00 80 00",
         {"  Timer Id Tag=80", "  LENGTH=0 octet(s)"}},
        {"past the window", 33, "30 06 9F 3A 05 00 80 01", {}},
        {"indefinite length", 33, "30 06 BF 3B 80 80 01 05", {}},
        {"end-of-contents", 33, "30 05 00 00 80 01 05", {}},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const auto r = decode(invoke(c.opcode, c.argument));
        Texts texts = argumentTexts(r);
        ASSERT_GE(texts.size(), 2u);
        EXPECT_EQ(Texts(texts.begin() + 2, texts.end()), c.after);
        EXPECT_EQ(r.md.errorFlags, DPX_ERR_LEFTOVER);
        EXPECT_EQ(r.md.remainingBits, 0u);
    }
}

// Choices without an outer SEQUENCE: the choice field names the next
// identifier and the alternative follows from its length field.
TEST(Arguments, Choices) {
    const struct {
        const char *name;
        uint8_t opcode;
        std::string argument;
        Texts texts;
        std::vector<std::string> shown; // display texts of the choice fields
        uint32_t flags;
    } cases[] = {
        {"Cancel an invoke", 0x35, "80 01 05", {"Choice=Invoke Tag", "  LENGTH=1 octet(s)", "  Invoke Id=5"},
         {"Invoke Id"}, 0},
        {"Cancel all", 0x35, "81 00", {"Choice=All RequestsTAG", "  LENGTH=0 octet(s)"}, {"All Requests"}, 0},
        {"Cancel a call segment", 0x35, "A2 03 80 01 07",
         {"Choice=Call Segment To Cancel", "  LENGTH=3 octet(s)", "Invoke Id Tag=80", "  LENGTH=1 octet(s)",
          "  Invoke Id=7"},
         {"Call Segment To Cancel"}, 0},
        // An identifier the choice does not name: shown with no name, its
        // octets left over.
        {"Cancel, unknown alternative", 0x35, "83 00", {"Choice="}, {""}, DPX_ERR_LEFTOVER},
        {"Connect to Resource, no resource", 0x13, "30 06 9F 3A 00 9F 3A 00",
         {"Sequence Tag=30", "  LENGTH=6 octet(s)"}, {}, DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const auto r = decode(invoke(c.opcode, c.argument));
        EXPECT_EQ(argumentTexts(r), c.texts);
        EXPECT_EQ(r.md.errorFlags, c.flags);
        std::vector<std::string> shown;
        for (size_t i = 0; i < r.fields.size(); ++i)
            if (r.fields[i].id == 1103 || r.fields[i].id == 1532)
                shown.push_back(r.shown[i].text);
        EXPECT_EQ(shown, c.shown);
    }
}

// Continue With Argument has one layout under two codes; Initiate Call
// Attempt's inline NULL and octet string.
TEST(Arguments, SharedLayoutsAndInlineValues) {
    const std::string cwa = "30 05 9F 3A 00 92 00";
    const auto a = decode(invoke(56, cwa));
    const auto b = decode(invoke(88, cwa));
    EXPECT_EQ(argumentTexts(a), argumentTexts(b));
    EXPECT_EQ(argumentTexts(a)[2], "suppress_O_CSI Tag=3a9f");
    EXPECT_EQ(a.md.errorFlags, 0u);

    const auto ica = decode(invoke(32, "30 09 9F 35 00 9F 33 03 01 23 45"));
    EXPECT_EQ(argumentTexts(ica),
              (Texts{"InitiateCallAttemptArg Tag=30", "  LENGTH=9 octet(s)", "suppress_T_CSI Tag=359f",
                     "  LENGTH=0 octet(s)", "CallReferenceNumber Tag=339f", "  LENGTH=3 octet(s)",
                     "  Call Reference Number Value=012345"}));
    EXPECT_EQ(ica.md.errorFlags, 0u);
}

} // namespace
