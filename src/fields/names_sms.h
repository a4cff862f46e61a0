// Value names of the SMS operations' parameters: SMS event types and
// causes, the event-specific information, and the TP fields of the short
// message that SMS Initial DP carries.
#pragma once

#include <cstddef>

#include "fields/field_def.h"

namespace camel::names::sms {

inline constexpr ValueName kEventTypeSms[] = {
    {1, "SMS Collected Info"}, {2, "O. SMS Failure"},         {3, "O. SMS Submitted"},
    {11, "SMS Delivery Requested"}, {12, "T. SMS Failure"}, {13, "T. SMS Delivery"},
};

// Event Specific Info SMS: the alternative's identifier.
inline constexpr ValueName kEventSpecificInfoChoice[] = {
    {0xA0, "O. SMS Failure Specific Info Tag"},
    {0xA1, "O. SMS Submitted Specific Info Tag"},
    {0xA2, "T. SMS Failure Specific Info Tag"},
    {0xA3, "T. SMS Delivery Specific Info Tag"},
};
inline constexpr ValueName kEventSpecificInfoChoiceShown[] = {
    {0xA0, "O. SMS Failure Specific Info."},
    {0xA1, "O. SMS Submitted Specific Info."},
    {0xA2, "T. SMS Failure Specific Info."},
    {0xA3, "T. SMS Delivery Specific Info."},
};

// The cause of a failed mobile-originated short message.
inline constexpr ValueName kMoSmsCause[] = {
    {0, "System Failure"},         {1, "Unexpected Data Value"},    {2, "Facility Not Supported"},
    {3, "sM-Deliveryfailure"},     {4, "Release From Radio Interface"},
};

// RP causes (the argument of SMS Release, and the cause of a failed
// mobile-terminated short message, which carries an RP cause).
inline constexpr ValueName kRpCause[] = {
    {1, "Unassigned(unallocated)number"},
    {8, "Operator Determinedbarring"},
    {10, "Reserved"},
    {16, "Call Bareed"},
    {21, "Short Message Transfer Rejected"},
    {22, "Memory Capacity Exceeded"},
    {27, "Destination Out Of Order"},
    {28, "Unidentified Subscirber"},
    {29, "Facility Rejected"},
    {30, "Unknown Subsciber"},
    {38, "Network Out Of Order"},
    {41, "Temporaryfailure"},
    {42, "Congestion"},
    {47, "Resources Unavail,unspecified"},
    {50, "Req Facility Not Ssubscirbed"},
    {69, "Req Facility Not Implemented"},
    {81, "Invalid Sm Transfer Ref Value"},
    {95, "Semantically Incorrectmessage"},
    {96, "Invalid Mandatory Information"},
    {97, "Mt Non-exist Or Not Implemented"},
    {98, "Mess Not Comp With Sm Prot State"},
    {99, "Ie Non-existen Or Nnot Implem"},
    {111, "Protocol Error,unspecified"},
    {127, "Interworking,unspecified"},
};

// ---- TP Short Message Submission Info: the first octet of the TPDU ----------------

inline constexpr ValueName kReplyPath[] = {{0, "TP Reply Path Not In SMS-submit"},
                                           {1, "TP Reply Path Set In SMS-submit"}};
inline constexpr ValueName kUserDataHeader[] = {{0, "TP-ud Contains Only Short Mess"},
                                                {1, "TP-ud Contains A Header"}};
inline constexpr ValueName kStatusReportRequest[] = {{0, "A Status Report Is Not Requested"},
                                                     {1, "A Status Report Is Requested"}};
inline constexpr ValueName kValidityPeriodFormat[] = {{0, "TP-vp Notpresent"},
                                                      {1, "TP-vp present(enhanced FORMAT)"},
                                                      {2, "TP-vp ppresent(relative FORMAT)"},
                                                      {3, "TP-vp present(absolute FORMAT)"}};
inline constexpr ValueName kRejectDuplicates[] = {{0, "Accept An SMS-submit"},
                                                  {1, "Reject An SMS-submit"}};
inline constexpr ValueName kMessageTypeIndicator[] = {{0, "SMS-deliver/SMS-deliver Report"},
                                                      {1, "SMS-submit/SMS-submit-report"},
                                                      {2, "SMS-status-report/SMS-command"},
                                                      {3, "Reserved"}};

// ---- TP Protocol Identifier ---------------------------------------------------------

inline constexpr ValueName kProtocolIdentifierUse[] = {{0, "Bit 7=0,bit 8=0"},
                                                       {1, "Bit 7=1,bit 8=0"},
                                                       {2, "Reserved"},
                                                       {3, "Set Bits 0-5 For Sc Specificuse"}};
inline constexpr ValueName kTelematicDevice[] = {
    {0, "Implicit"},
    {1, "Telex"},
    {2, "Group 3telefax"},
    {3, "Group 4telefax"},
    {4, "Voice Telephone"},
    {5, "European Radio Messaging System"},
    {6, "National Paging System"},
    {7, "Videotex (t.100/t.101)"},
    {8, "Teletex, Carrier Unspecified"},
    {9, "Teletex, In Pspdn"},
    {10, "Teletex, In Cspdn"},
    {11, "Teletex, In Analog Pstn"},
    {12, "Teletex, In Digital ISDN"},
    {13, "Uci, Etsi De/ps 3 01-3"},
    {17, "A Message Handling Facility"},
    {18, "Pub X.400-based Mess Hand Sys"},
    {19, "Internet Electronic Mail"},
    {20, "Specific TO Each Sc(14)"},
    {21, "Specific TO Each Sc(15)"},
    {22, "Specific TO Each Sc(16)"},
    {23, "Specific TO Each Sc(17)"},
    {24, "Specific TO Each Sc(18)"},
    {31, "A Gsm/umts Mobilestation"},
};
inline constexpr ValueName kTelematicInterworking[] = {{0, "No Interwork, Smetosmeprotcol"},
                                                       {1, "Telematic Interworking"}};
inline constexpr ValueName kShortMessageType[] = {
    {0, "Short Message Type 0"},
    {1, "Replace Short Message Type 1"},
    {2, "Replace Short Message Type 2"},
    {3, "Replace Short Message Type 3"},
    {4, "Replace Short Message Type 4"},
    {5, "Replace Short Message Type 5"},
    {6, "Replace Short Message Type 6"},
    {7, "Replace Short Message Type 7"},
    {30, "Enhanced Messageservice"},
    {31, "Return Callmessage"},
    {60, "AnsiOTHERWISE36 R-data"},
    {61, "Me Data Download"},
    {62, "Me De-personal Shortmessage"},
    {63, "(u)sim Data Download"},
};

// ---- TP Data Coding Scheme ------------------------------------------------------------

inline constexpr ValueName kCodingGroup[] = {
    {0, "General Data Coding Indication(0)"},
    {1, "General Data Coding Indication(1)"},
    {2, "General Data Coding Indication(2)"},
    {3, "General Data Coding Indication(3)"},
    {12, "Discardmessage"},
    {13, "Store Message(13)"},
    {14, "Store Message(14)"},
    {15, "Data Coding/message Class"},
};
inline constexpr ValueName kCompressed[] = {{0, "The Ttext Is Uncompressed"},
                                            {1, "Text Is Compressed"}};
inline constexpr ValueName kClassMeaning[] = {{0, "Bits 2,1 No Msg Class Mean"},
                                              {1, "Bits 2,1 Have Msg Class Mean"}};
inline constexpr ValueName kAlphabet[] = {{0, "Gsm 7 Bit Default Alphabet"},
                                          {1, "8 Bit Data"},
                                          {2, "Ucs2(16bit)"},
                                          {3, "Reserved"}};
inline constexpr ValueName kMessageClass[] = {{0, "Class 0"},
                                              {1, "Class 1 Default = Me-specific."},
                                              {2, "Class 2 (u)sim Specificmessage"},
                                              {3, "Class 3 Default = Te Specific"}};
inline constexpr ValueName kIndicationSense[] = {{0, "Voicemail Messagewaiting"},
                                                 {1, "Set Indication Active"}};
inline constexpr ValueName kIndicationType[] = {{0, "Set Indication Inactive"},
                                                {1, "Fax Messagewaiting"},
                                                {2, "Electronic Mail Messagewaiting"},
                                                {3, "Other Message Waiting"}};
inline constexpr ValueName kMessageCoding[] = {{0, "Gsm 7 Bit Default Alphabet"},
                                               {1, "8-bit Data"}};
inline constexpr ValueName kDataClass[] = {{0, "Class 0"},
                                           {1, "Class 1 Default= Me-specific."},
                                           {2, "Class 2 (u)sim-specific Message."},
                                           {3, "Class 3 Default= Te Sspecific"}};

// ---- TP Validity Period, relative format --------------------------------------------------

// The relative validity period of every octet value, written out as text:
// 0-143 five-minute steps, 144-167 half hours after 12 hours, 168-196 days,
// 197-255 weeks ("5minutes", "750minutes", "2 Days", "5 Weeks").
struct RelativeValidityTexts {
    char text[256][12];
};
constexpr RelativeValidityTexts relativeValidityTexts() {
    RelativeValidityTexts out{};
    for (unsigned v = 0; v < 256; ++v) {
        unsigned amount = 0;
        const char *unit = "";
        if (v <= 143) {
            amount = (v + 1) * 5;
            unit = "minutes";
        } else if (v <= 167) {
            amount = 720 + (v - 143) * 30;
            unit = "minutes";
        } else if (v <= 196) {
            amount = v - 166;
            unit = " Days";
        } else {
            amount = v - 192;
            unit = " Weeks";
        }
        char digits[8] = {};
        size_t n = 0;
        do {
            digits[n++] = static_cast<char>('0' + amount % 10);
            amount /= 10;
        } while (amount != 0);
        size_t at = 0;
        while (n != 0)
            out.text[v][at++] = digits[--n];
        for (const char *u = unit; *u != '\0'; ++u)
            out.text[v][at++] = *u;
    }
    return out;
}
inline constexpr RelativeValidityTexts kRelativeValidityTexts = relativeValidityTexts();

struct RelativeValidityNames {
    ValueName name[256];
};
constexpr RelativeValidityNames relativeValidityNames() {
    RelativeValidityNames out{};
    for (unsigned v = 0; v < 256; ++v)
        out.name[v] = ValueName{v, kRelativeValidityTexts.text[v]};
    return out;
}
inline constexpr RelativeValidityNames kRelativeValidityNames = relativeValidityNames();
inline constexpr const ValueName (&kRelativeValidity)[256] = kRelativeValidityNames.name;

} // namespace camel::names::sms
