// GPRS arguments through the real entry points: the hand-written and bit
// layout units (routing area and LSA identities, GSN address, QoS formats
// with their generated value tables, PDP ID, GPRS cause, event type), the
// access point name and its host rendering, the key entries of the routing
// area and the access point name.  The values tshark also shows are
// compared over generated messages by the reference comparison.
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "support/harness.h"

using namespace camel::test;
using Texts = std::vector<std::string>;

namespace {

// An argument of `op`: the SEQUENCE around `members`, lengths below 128.
Bytes argument(uint8_t op, const std::string &members) {
    const Bytes m = camel::test::hexBytes(members);
    std::string hex = "30 ";
    char len[4];
    std::snprintf(len, sizeof len, "%02X ", static_cast<unsigned>(m.size()));
    return invoke(op, hex + len + members);
}

constexpr uint8_t kInitialDp = 78, kEventReport = 80, kContinue = 75,
                  kApplyCharging = 71, kApplyChargingReport = 72, kConnect = 74;

TEST(Gprs, ParametersFieldByField) {
    const struct {
        const char *name;
        uint8_t op;
        std::string members;
        uint32_t from; // the first field id shown
        Texts texts;
        uint32_t flags;
    } cases[] = {
        {"routing area identity, two-digit MNC: bits 8-5 of the MNC octet first", kInitialDp,
         "89 06 32 F4 51 12 34 56", 2440,
         {"  Routing Area Identity=89", "  LENGTH=6 octet(s)", "  MCC=234", "NAS Filler Don't Show=f",
          "  Filler=f", "  MNC=51", "Location Area Code=4660", "RAC=86"},
         0},
        {"routing area identity cut short", kInitialDp, "89 05 32 F4 51 12 34", 2450,
         {"Location Area Code=4660"}, 0},
        {"event type GPRS 4 has no name", kEventReport, "80 01 04", 2431,
         {"  Event Type GPRS Tag=80", "  LENGTH=1 octet(s)", "  Event Type Value="}, 0},
        {"GSN address, IPv4 body cut short", kInitialDp, "8F 04 10 0A 00 00", 2593, {"IPv4 Address LENGTH=4"},
         DPX_ERR_LEFTOVER},
        {"LSA identity: type bit, five half-octets from bit 2, three bits", kInitialDp, "AC 05 84 03 A5 3C 96",
         2595,
         {"LSA Identity=84", "  LENGTH=3 octet(s)", "  LSA Identity Type=Universallsa",
          "  LSA Identity(First part)=25e1b", "  LSA Identity(Cont.)=4"},
         0},
        {"cell global id as octets in the GPRS location information", kInitialDp,
         "AC 09 80 07 32 F4 51 12 34 AB CD", 2070,
         {"Cell Id Or Sai Or LAI Tag=80", "  LENGTH=7 octet(s)", "  MCC=234", "NAS Filler Don't Show=f",
          "  Filler=f", "  MNC=51", "  Location Area Code=4660", "  Cell Identity=abcd"},
         0},
        // The long format: the three short-format octets, then octets 4 to 11.
        {"QoS long format, asymmetric octets", kApplyChargingReport,
         "A0 05 A1 03 80 01 00 A1 0F A0 0D 81 0B 23 72 1F 73 96 48 80 45 4A 40 FF", 2385,
         {"  LENGTH=11 octet(s)", "Reliability Class=Unack GTP ,LLC,ack RLC,protected Data",
          "  Coding Standard=Delay Class 4(besteffort)", "  Precedence Class=Normal Priority",
          "Peak Throughput=Up to 64000 octet/s", "Mean Throughput=Best Effort",
          "Delivery Of Erroneous SDUs=Err SDUs Not Delivered('no')", "  Delivery Order=Without Delivery Order('no')",
          "  Traffic Class=Interactive Class", "  Maximum SDU Size=1500 Octets",
          "  Maximum Bit Rate For Uplink=128kbps", "  Maximum Bit Rate For Downlink=576kbps",
          "  SDU Error Ration=1e-5", "  Residual Bit Error Rate(ber)=4e-3",
          "Traffic Handling Priority=Priority Level 2", "  Transfer Delay=300 ms",
          "  Guaranteed Bit Rate For Uplink=64kbps", "  Guaranteed Bit Rate For Downlink=0kbps"},
         0},
        {"QoS long format, reserved and subscribed values", kApplyChargingReport,
         "A0 05 A1 03 80 01 00 A1 0F A2 0D 81 0B 06 00 00 00 9A 81 00 00 FF 00 3F", 2385,
         {"  LENGTH=11 octet(s)", "Reliability Class=Unack GTP;ack LLC,RLC,protected Data",
          "  Coding Standard=Subscibed Delay Class/reserved", "  Precedence Class=Subscibed Precedence/reserved",
          "Peak Throughput=Sub Peak Throughput/res", "Mean Throughput=Sub Mean Throughput/res",
          "Delivery Of Erroneous SDUs=Sub Delivery Of Err SDUs/res", "  Delivery Order=Reserved",
          "  Traffic Class=Subscibed Traffic Class/reserved", "  Maximum SDU Size=Reserved",
          "  Maximum Bit Rate For Uplink=Reserved", "  Maximum Bit Rate For Downlink=Sub Max Bit Rate(downlink/res)",
          "  SDU Error Ration=Sub SDU Error Ration/res", "  Residual Bit Error Rate(ber)=Sub Residual Ber/reserved",
          "Traffic Handling Priority=Priority Level 3", "  Transfer Delay=", "  Guaranteed Bit Rate For Uplink=Sub Guarant Bit Rat(uplink/res)",
          "  Guaranteed Bit Rate For Downlink=63kbps"},
         0},
        {"QoS long format of four octets: the fields end with the element", kApplyChargingReport,
         "A0 05 A1 03 80 01 00 A1 08 A1 06 81 04 23 72 1F 73", 2391,
         {"Delivery Of Erroneous SDUs=Err SDUs Not Delivered('no')", "  Delivery Order=Without Delivery Order('no')",
          "  Traffic Class=Interactive Class"},
         0},
        // Volumes and times are unsigned 32-bit: 2^32 - 1 takes five octets.
        {"volume of five octets", kApplyCharging, "A0 07 80 05 00 FF FF FF FF", 2317,
         {"  Max Transferred Volume(byte)=4294967295"}, 0},
        {"access point name longer than the argument", kConnect, "80 05 08 69 6E", 2410,
         {"  Access Point Name Tag=80"}, DPX_ERR_LENGTH_BEYOND | DPX_ERR_LEFTOVER},
    };
    for (const auto &c : cases) {
        SCOPED_TRACE(c.name);
        const auto d = decode(argument(c.op, c.members));
        EXPECT_EQ(textsFrom(d, c.from), c.texts);
        EXPECT_EQ(d.md.errorFlags, c.flags);
    }
}

TEST(Gprs, BitLayoutSpansAndDisplayNames) {
    // LSA identity A5 3C 96 at octet 26 (bits 201-224): the first part is
    // five half-octets from bit 2, its continuation the top three bits.
    const auto lsa = decode(argument(kInitialDp, "AC 05 84 03 A5 3C 96"));
    const auto *first = lsa.find(2598);
    ASSERT_NE(first, nullptr);
    const uint32_t base = first->spans.at(0).first - 1;
    EXPECT_EQ(first->spans, (std::vector<Span>{{base + 1, base + 4, 2},
                                               {base + 5, base + 8, 5},
                                               {base + 9, base + 12, 14},
                                               {base + 13, base + 16, 1},
                                               {base + 17, base + 20, 11}}));
    EXPECT_EQ(lsa.find(2599)->spans, (std::vector<Span>{{base + 21, base + 23, 4}}));
    EXPECT_EQ(shownOf(lsa, 2597), "Universal LSA");

    // QoS octet 4 (0x73) shown as three fields over its bits; only the last
    // consumes it.
    const auto qos = decode(argument(kApplyChargingReport, "A0 05 A1 03 80 01 00 A1 08 A1 06 81 04 23 72 1F 73"));
    const uint32_t o4 = qos.find(2391)->spans.at(0).first;
    EXPECT_EQ(qos.find(2392)->spans, (std::vector<Span>{{o4 + 3, o4 + 4, 2}}));
    EXPECT_EQ(qos.find(2393)->spans, (std::vector<Span>{{o4 + 5, o4 + 7, 3}}));
    EXPECT_EQ(shownOf(qos, 2377), "Long qos format");

    const auto gsn = decode(argument(kInitialDp, "8F 11 41 20 01 0D B8 00 00 00 00 00 00 00 00 00 00 00 01"));
    EXPECT_EQ(shownOf(gsn, 2586), "IPv6address");
    const auto pdp = decode(argument(kContinue, "80 01 05"));
    EXPECT_EQ(shownOf(pdp, 1270), "5") << "the h follows the value in the decoded-field text only";

    // Display ids: MCC and time-zone tag under the ids the display groups
    // them with, the routing area code under its own.
    const auto rai = decode(argument(kInitialDp, "84 08 02 62 21 70 00 51 00 00 89 06 32 F4 51 12 34 56"));
    for (size_t i = 0; i < rai.fields.size(); ++i) {
        const uint32_t id = rai.fields[i].id;
        const uint32_t expected = id == 2442 ? 2079u : id == 2231 ? 2230u : id;
        if (id == 2442 || id == 2451 || id == 2231) {
            EXPECT_EQ(rai.shown.at(i).displayId, expected) << id;
        }
    }
}

// Key entries 18 (MCC), 20 (MNC) and 21 (access point name octets).
TEST(Gprs, RoutingAreaAndAccessPointNameKeys) {
    const auto two = decode(argument(kInitialDp, "88 09 08 69 6E 74 65 72 6E 65 74 89 06 32 F4 51 12 34 56"));
    ASSERT_NE(two.key(18), nullptr);
    EXPECT_EQ(two.key(18)->value, (Bytes{0x34, 0x02})) << "MCC 234 as 0x0234, little-endian";
    ASSERT_NE(two.key(20), nullptr);
    EXPECT_EQ(two.key(20)->value.at(0), 0x51) << "the MNC octet as received";
    ASSERT_NE(two.key(21), nullptr);
    EXPECT_EQ(two.key(21)->bits, 72u);
    EXPECT_EQ(two.key(21)->value, camel::test::hexBytes("08 69 6E 74 65 72 6E 65 74"));

    const auto three = decode(argument(kInitialDp, "89 06 32 14 51 12 34 56"));
    ASSERT_NE(three.key(20), nullptr);
    EXPECT_EQ(three.key(20)->value, (Bytes{0x11, 0x05})) << "MNC 511 as 0x0511";
    EXPECT_EQ(three.key(21), nullptr);
}

TEST(Gprs, AccessPointNameRenderingFailureEndsTheTextPasses) {
    for (const auto &message : {argument(kConnect, "80 09 08 69 6E 74 65 72 6E 65 74"),
                                argument(kEventReport, "80 01 0B A2 0D A4 0B 80 09 08 69 6E 74 65 72 6E 65 74")}) {
        EXPECT_EQ(camel::test::checkAccessPointNameFailure(message), 2u);
        // Once the host renders again, so does the module.
        EXPECT_EQ(decode(message).md.result, 1);
    }
}

} // namespace
