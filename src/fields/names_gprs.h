// Value names of the GPRS types: charging choices, event types, quality of
// service, GSN and LSA identities.  The long runs of the QoS tables (bit
// rates, SDU sizes, transfer delays) are generated at compile time from
// their steps.
#pragma once

#include <cstdint>

#include "fields/field_def.h"

namespace camel::names::gprs {

// ---- Charging ---------------------------------------------------------------------

inline constexpr ValueName kChargingCharacteristics[] = {
    {0x80, "Max Transferred Volume Tag"}, {0x81, "Max Elapsed Time Tag"}};
inline constexpr ValueName kChargingCharacteristicsShown[] = {
    {0x80, "Max Transferred Volume"}, {0x81, "Max Elapsed Time"}};
inline constexpr ValueName kChargingResult[] = {{0xA0, "Transferred Volume Tag"},
                                                {0xA1, "Elapsed Time Tag"}};
inline constexpr ValueName kChargingResultShown[] = {{0xA0, "Transferred Volume"},
                                                     {0xA1, "Elapsed Time"}};
inline constexpr ValueName kTransferredVolume[] = {{0x80, "Volume If No Tariff Switch"},
                                                   {0xA1, "Volume If Tariff Switch"}};
inline constexpr ValueName kElapsedTime[] = {{0x80, "Time GPRS If No Tariff Switch"},
                                             {0xA1, "Time GPRS If Tariff Switch"}};
inline constexpr ValueName kChargingRollOver[] = {{0xA0, "Transferred Volume Roll Over"},
                                                  {0xA1, "Elapsed Time Roll Over"}};
inline constexpr ValueName kVolumeRollOver[] = {{0x80, "RO-volume If No Tariff Switch"},
                                                {0xA1, "RO-volume If Tariff Switch"}};
inline constexpr ValueName kTimeRollOver[] = {{0x80, "RO-time GPRS If No Tariff Switch"},
                                              {0xA1, "RO-time GPRS If Tariff Switch"}};

// ---- Events ---------------------------------------------------------------------------

inline constexpr ValueName kEventTypeGprs[] = {
    {1, "Attach"},
    {2, "Attach Change Of Position"},
    {3, "Detached"},
    {11, "PDP Context Establishment"},
    {12, "PDP Context Estab Ack"},
    {13, "Disconnect"},
    {14, "PDP Context Change Of Position"},
};
inline constexpr ValueName kEventSpecificInfo[] = {
    {0xA0, "Attach Change Of Pos Specific Info Tag"},
    {0xA1, "PDP Context Change Of Posi Spec Info Tag"},
    {0xA2, "Detach Specific Info Tag"},
    {0xA3, "Disconnect Specific Info Tag"},
    {0xA4, "PDP Context Establishment Specific Info Tag"},
    {0xA5, "PDP Context Establishment Acknowledgement Specific InfoTAG"},
};
inline constexpr ValueName kEventSpecificInfoShown[] = {
    {0xA0, "Attach Change Of Pos Spec Info"},  {0xA1, "PDP Cont Cha Of Posi Spec Info"},
    {0xA2, "Detach Specific Info."},           {0xA3, "Disconnect Specific Info."},
    {0xA4, "PDP Con Est Specific Info."},      {0xA5, "PDP Con Est Ack Specific Info."},
};
inline constexpr ValueName kInitiatingEntity[] = {
    {0, "Mobilestation"}, {1, "Sgsn"}, {2, "Hlr"}, {3, "Ggsn"}};
inline constexpr ValueName kPdpInitiationType[] = {{0, "MS Initiated"},
                                                   {1, "Network Initiated"}};
inline constexpr ValueName kAocSupport[] = {{0, "Not Supported"}, {1, "Supported"}};

// ---- Addresses and location -------------------------------------------------------------

inline constexpr ValueName kGsnAddressType[] = {{0, "IPv4address"}, {1, "IPv6 Address"}};
inline constexpr ValueName kGsnAddressTypeShown[] = {{1, "IPv6address"}};
inline constexpr ValueName kLsaIdentityType[] = {{0, "Plmn Significant Number"},
                                                 {1, "Universallsa"}};
inline constexpr ValueName kLsaIdentityTypeShown[] = {{1, "Universal LSA"}};

// ---- Quality of service: the choice and the short format ------------------------------

inline constexpr ValueName kQosFormat[] = {{0x80, "Short QoS format Tag"},
                                           {0x81, "Long QoS format Tag"}};
inline constexpr ValueName kQosFormatShown[] = {{0x80, "Short qos format"},
                                                {0x81, "Long qos format"}};

inline constexpr ValueName kReliabilityClass[] = {
    {0, "Subscibed Reliability Class"},
    {1, "Acknowledged GTP,LLC,and Rlc,protected Data"},
    {2, "Unacknowledged GTP,acknowledged Llc Rlc,protected Data"},
    {3, "Unacknowledged GTP And Llc,acknowledged Rlc,protected Data"},
    {4, "Unacknowledged GTP,LLC And Rlc,protected Data"},
    {5, "Unacknowledged GTP,LLC And Rlc,unprotected Data"},
};
inline constexpr ValueName kDelayClass[] = {
    {0, "Subscibed Delay Class"}, {1, "Delayclass 1"}, {2, "Delayclass 2"}, {3, "Delay Class 3"}};
inline constexpr ValueName kDelayClassShown[] = {{3, "Delayclass 3"}};
inline constexpr ValueName kPrecedenceClass[] = {
    {0, "Subscibed Precedence"}, {1, "High Priority"}, {2, "Normal Priority"}, {3, "Low Priotity"}};

// Peak throughput 1 to 9 after the value 0's name.
#define CAMEL_PEAK_THROUGHPUT_                                                               \
    {1, "Up to 1000 octet/s"}, {2, "Up to 2000 octet/s"}, {3, "Up to 4000 octet/s"},          \
        {4, "Up to 8000 octet/s"}, {5, "Up to 16000 octet/s"}, {6, "Up to 32000 octet/s"},    \
        {7, "Up to 64000 octet/s"}, {8, "Up to 128000 octet/s"}, {9, "Up to 256000 octet/s"}
// Mean throughput 1 to 18.
#define CAMEL_MEAN_THROUGHPUT_                                                               \
    {1, "100 octet/h"}, {2, "200 octet/h"}, {3, "500 octet/h"}, {4, "1000 octet/h"},          \
        {5, "2000 octet/h"}, {6, "5000 octet/h"}, {7, "10000 octet/h"}, {8, "20000 octet/h"}, \
        {9, "50000 octet/h"}, {10, "100000 octet/h"}, {11, "200000 octet/h"},                 \
        {12, "500000 octet/h"}, {13, "1000000 octet/h"}, {14, "2000000 octet/h"},             \
        {15, "5000000 octet/h"}, {16, "10000000 octet/h"}, {17, "20000000 octet/h"},          \
        {18, "50000000 octet/h"}

inline constexpr ValueName kPeakThroughput[] = {{0, "Subscibed Peak Throughput"},
                                                CAMEL_PEAK_THROUGHPUT_};
inline constexpr ValueName kMeanThroughput[] = {
    {0, "Subscibed Mean Throughput"}, CAMEL_MEAN_THROUGHPUT_, {31, "Best Effort"}};

// ---- The long format: the same classes with their reserved values ------------------------

inline constexpr ValueName kLongReliabilityClass[] = {
    {0, "Sub Reliability Class/res"},
    {1, "Ack GTP,LLC,RLC,protected Data"},
    {2, "Unack GTP,ack LLC RLC,protected Data"},
    {3, "Unack GTP ,LLC,ack RLC,protected Data"},
    {4, "Unack GTP,LLC,RLC,protected Data"},
    {5, "Unack GTP,LLC,RLC,Unprotected Data"},
    {7, "Reserved"},
};
inline constexpr ValueName kLongDelayClass[] = {
    {0, "Subscibed Delay Class/reserved"}, {1, "Delayclass 1"}, {2, "Delayclass 2"},
    {3, "Delayclass 3"}, {4, "Delay Class 4(besteffort)"}, {7, "Reserved"}};
inline constexpr ValueName kLongPrecedenceClass[] = {
    {0, "Subscibed Precedence/reserved"}, {1, "High Priority"}, {2, "Normal Priority"},
    {3, "Low Priotity"}, {7, "Reserved"}};
inline constexpr ValueName kLongPeakThroughput[] = {
    {0, "Sub Peak Throughput/res"}, CAMEL_PEAK_THROUGHPUT_, {15, "Reserved"}};
inline constexpr ValueName kLongMeanThroughput[] = {{0, "Sub Mean Throughput/res"},
                                                    CAMEL_MEAN_THROUGHPUT_,
                                                    {19, "Reserved"},
                                                    {31, "Best Effort"}};
#undef CAMEL_PEAK_THROUGHPUT_
#undef CAMEL_MEAN_THROUGHPUT_

inline constexpr ValueName kErroneousSdus[] = {{0, "Sub Delivery Of Err SDUs/res"},
                                               {1, "No Detect('-')"},
                                               {2, "Err SDUs Delivered('yes')"},
                                               {3, "Err SDUs Not Delivered('no')"}};
inline constexpr ValueName kDeliveryOrder[] = {{1, "With Delivery Order('yes')"},
                                               {2, "Without Delivery Order('no')"}};
inline constexpr ValueName kTrafficClass[] = {
    {0, "Subscibed Traffic Class/reserved"}, {1, "Conversational Class"}, {2, "Streaming Class"},
    {3, "Interactive Class"}, {4, "Backgound Class"}};
inline constexpr ValueName kSduErrorRatio[] = {
    {0, "Sub SDU Error Ration/res"}, {1, "1e-2"}, {2, "7e-3"}, {3, "1e-3"},
    {4, "1e-4"}, {5, "1e-5"}, {6, "1e-6"}, {7, "1eOTHERWISE"}};
inline constexpr ValueName kResidualBer[] = {
    {0, "Sub Residual Ber/reserved"}, {1, "5e-2"}, {2, "1e-2"}, {3, "5e-3"}, {4, "4e-3"},
    {5, "1e-3"}, {6, "1e-4"}, {7, "1e-5"}, {8, "1e-6"}, {9, "6e-8"}};
inline constexpr ValueName kTrafficHandlingPriority[] = {{0, "Sub Traffic Handling Prio/res"},
                                                         {1, "Priority Level 1"},
                                                         {2, "Priority Level 2"},
                                                         {3, "Priority Level 3"}};

// ---- Generated tables ---------------------------------------------------------------------

// A run of names "<prefix><first + step * k><suffix>" for the codes
// from..to, generated once into static storage.
struct Step {
    uint32_t from, to;  // codes
    uint32_t first;     // the number shown for `from`
    uint32_t step;      // added per code
};
inline constexpr uint32_t kNameSize = 24;

template <uint32_t N>
struct NameTexts {
    char text[N][kNameSize] = {};
};

template <uint32_t N, uint32_t S>
consteval NameTexts<N> makeTexts(const Step (&steps)[S], const char *suffix) {
    NameTexts<N> out{};
    uint32_t row = 0;
    for (const Step &s : steps)
        for (uint32_t code = s.from; code <= s.to; ++code, ++row) {
            uint32_t v = s.first + s.step * (code - s.from);
            char digits[12] = {};
            uint32_t n = 0;
            do {
                digits[n++] = static_cast<char>('0' + v % 10);
                v /= 10;
            } while (v != 0);
            uint32_t at = 0;
            while (n > 0)
                out.text[row][at++] = digits[--n];
            for (const char *p = suffix; *p != '\0'; ++p)
                out.text[row][at++] = *p;
        }
    return out;
}

// The value table: the value 0's own name first, then the generated run,
// then the fixed names that follow it.
template <uint32_t N>
struct GeneratedNames {
    ValueName v[N];
};
template <uint32_t N, uint32_t S, uint32_t F = 0>
consteval GeneratedNames<1 + N + F> makeNames(const char *zero, const NameTexts<N> &texts,
                                              const Step (&steps)[S],
                                              const ValueName *fixed = nullptr) {
    GeneratedNames<1 + N + F> out{};
    out.v[0] = {0, zero};
    uint32_t row = 0;
    for (const Step &s : steps)
        for (uint32_t code = s.from; code <= s.to; ++code, ++row)
            out.v[1 + row] = {code, texts.text[row]};
    for (uint32_t i = 0; i < F; ++i)
        out.v[1 + N + i] = fixed[i];
    return out;
}

// Bit rates: 1 to 63 kbps in steps of 1, 64 to 568 kbps in steps of 8,
// 576 kbps; 255 is "0kbps", 129 to 254 reserved.
inline constexpr Step kBitRateSteps[] = {{1, 63, 1, 1}, {64, 128, 64, 8}};
inline constexpr NameTexts<128> kBitRateTexts = makeTexts<128>(kBitRateSteps, "kbps");
inline constexpr ValueName kBitRateFixed[] = {{255, "0kbps"}};
inline constexpr auto kMaxBitRateUplink =
    makeNames<128, 2, 1>("Sub Max Bit Rate(uplink/res)", kBitRateTexts, kBitRateSteps, kBitRateFixed);
inline constexpr auto kMaxBitRateDownlink =
    makeNames<128, 2, 1>("Sub Max Bit Rate(downlink/res)", kBitRateTexts, kBitRateSteps, kBitRateFixed);
inline constexpr auto kGuaranteedBitRateUplink =
    makeNames<128, 2, 1>("Sub Guarant Bit Rat(uplink/res)", kBitRateTexts, kBitRateSteps, kBitRateFixed);
inline constexpr auto kGuaranteedBitRateDownlink =
    makeNames<128, 2, 1>("Sub Guarant Bit Rat(downlink/res)", kBitRateTexts, kBitRateSteps, kBitRateFixed);

// Maximum SDU size: ten octets a step up to 1500, then 1502, 1510, 1520.
inline constexpr Step kSduSizeSteps[] = {{1, 150, 10, 10}};
inline constexpr NameTexts<150> kSduSizeTexts = makeTexts<150>(kSduSizeSteps, " Octets");
inline constexpr ValueName kSduSizeFixed[] = {
    {151, "1502 Octets"}, {152, "1510 Octets"}, {153, "1520 Octets"}};
inline constexpr auto kMaxSduSize =
    makeNames<150, 1, 3>("Sub Max SDU size/res(net->ms)", kSduSizeTexts, kSduSizeSteps,
                         kSduSizeFixed);

// Transfer delay: 10 to 150 ms by 10, 200 to 950 ms by 50, 1000 to 4000 ms
// by 100.
inline constexpr Step kTransferDelaySteps[] = {
    {1, 15, 10, 10}, {16, 31, 200, 50}, {32, 62, 1000, 100}};
inline constexpr NameTexts<62> kTransferDelayTexts = makeTexts<62>(kTransferDelaySteps, " ms");
inline constexpr auto kTransferDelay =
    makeNames("Sub Transfer Delay/reserved", kTransferDelayTexts, kTransferDelaySteps);

} // namespace camel::names::gprs
