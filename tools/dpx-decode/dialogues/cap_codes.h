// CAMEL operation and error codes under their ASN.1 names (the names other
// analyzers use: initialDP, releaseCall, ...), for filters given by name and
// for the counts of the statistics.
#pragma once

#include <cstdint>
#include <string>

namespace dpxdecode::dialogues {

struct CodeName {
    int32_t code;
    const char *name;
};

inline constexpr CodeName kOperations[] = {
    {0, "initialDP"},
    {16, "assistRequestInstructions"},
    {17, "establishTemporaryConnection"},
    {18, "disconnectForwardConnection"},
    {19, "connectToResource"},
    {20, "connect"},
    {22, "releaseCall"},
    {23, "requestReportBCSMEvent"},
    {24, "eventReportBCSM"},
    {27, "collectInformation"},
    {31, "continue"},
    {32, "initiateCallAttempt"},
    {33, "resetTimer"},
    {34, "furnishChargingInformation"},
    {35, "applyCharging"},
    {36, "applyChargingReport"},
    {41, "callGap"},
    {44, "callInformationReport"},
    {45, "callInformationRequest"},
    {46, "sendChargingInformation"},
    {47, "playAnnouncement"},
    {48, "promptAndCollectUserInformation"},
    {49, "specializedResourceReport"},
    {53, "cancel"},
    {55, "activityTest"},
    {56, "continueWithArgument"},
    {60, "initialDPSMS"},
    {61, "furnishChargingInformationSMS"},
    {62, "connectSMS"},
    {63, "requestReportSMSEvent"},
    {64, "eventReportSMS"},
    {65, "continueSMS"},
    {66, "releaseSMS"},
    {67, "resetTimerSMS"},
    {70, "activityTestGPRS"},
    {71, "applyChargingGPRS"},
    {72, "applyChargingReportGPRS"},
    {73, "cancelGPRS"},
    {74, "connectGPRS"},
    {75, "continueGPRS"},
    {76, "entityReleasedGPRS"},
    {77, "furnishChargingInformationGPRS"},
    {78, "initialDPGPRS"},
    {79, "releaseGPRS"},
    {80, "eventReportGPRS"},
    {81, "requestReportGPRSEvent"},
    {82, "resetTimerGPRS"},
    {83, "sendChargingInformationGPRS"},
    {86, "dFCWithArgument"},
    {88, "continueWithArgument"},
    {90, "disconnectLeg"},
    {93, "moveLeg"},
    {95, "splitLeg"},
    {96, "entityReleased"},
    {97, "playTone"},
};

inline constexpr CodeName kErrors[] = {
    {0, "canceled"},
    {1, "cancelFailed"},
    {3, "eTCFailed"},
    {4, "improperCallerResponse"},
    {6, "missingCustomerRecord"},
    {7, "missingParameter"},
    {8, "parameterOutOfRange"},
    {10, "requestedInfoError"},
    {11, "systemFailure"},
    {12, "taskRefused"},
    {13, "unavailableResource"},
    {14, "unexpectedComponentSequence"},
    {15, "unexpectedDataValue"},
    {16, "unexpectedParameter"},
    {17, "unknownLegID"},
    {50, "unknownPDPID"},
    {51, "unknownCSID"},
};

// The name of `code` in `table`, or the code in decimal.
template <size_t N>
std::string codeName(const CodeName (&table)[N], int32_t code) {
    for (const CodeName &c : table)
        if (c.code == code)
            return c.name;
    return std::to_string(code);
}

} // namespace dpxdecode::dialogues
