// Value names of the TCAP-level fields: message types, P-Abort causes,
// dialogue PDUs and their members, components and problems.
#pragma once

#include "fields/field_def.h"

namespace camel::names {

inline constexpr ValueName kMessageType[] = {
    {0x61, "Unidirectional"}, {0x62, "Begin"}, {0x64, "End"}, {0x65, "Continue"}, {0x67, "Abort"},
};

inline constexpr ValueName kPAbortCause[] = {
    {0, "Unrecognized Message Type"}, {1, "Unrecognized Transaction ID"},
    {2, "Badly Formatted Trans Part"}, {3, "Incorrect Transaction Part"},
    {4, "Resource Limitation"},
};

inline constexpr ValueName kDialoguePdu[] = {
    {0x60, "DialogueRequest"}, {0x61, "Dialogue Response"}, {0x64, "Dialogue Abort"},
};

inline constexpr ValueName kResult[] = {{0, "Accepted"}, {1, "Reject-permanent"}};

inline constexpr ValueName kServiceUser[] = {
    {0, "Null"}, {1, "No Reason Given"}, {2, "Applic Cont Name Not Supp"},
};

inline constexpr ValueName kServiceProvider[] = {
    {0, "Null"}, {1, "No Reason Given"}, {2, "No Common Dialogue Portion"},
};

inline constexpr ValueName kAbortSource[] = {
    {0, "Dialogue Service User"}, {1, "Dialogue Service Provider"},
};

inline constexpr ValueName kAcCap[] = {{0, "ac_id"}, {0x14, "cap3"}, {0x15, "cap3OE"}};

inline constexpr ValueName kAcDialoguePdu[] = {
    {0x32, "cap gsmssf to gsmscf"},
    {0x33, "cap assist handoff gsmssf to gsmscf"},
    {0x34, "cap gsmSRF to gsmscf"},
};

inline constexpr ValueName kAcVersion[] = {{0, "1"}, {1, "2"}};

inline constexpr ValueName kCap3Context[] = {{0x0E, "gsmSRF gsmSCF"}};

inline constexpr ValueName kCap3OeContext[] = {
    {4, "CAP gsmSSF scfGenericAC"},     {6, "CAP gsmSSF scfAssistHandoffAC"},
    {0x32, "CAP gprsSSF gsmSCF AC"},    {0x33, "CAP gsmSCF gprsSSF AC"},
    {0x3D, "Cap3 SMS AC"},
};

inline constexpr ValueName kCapDatatypes[] = {
    {5, "CAP-GPRS-Reference Number"}, {0x34, "Cap-datatypes"},
};

inline constexpr ValueName kAsn1TagClass[] = {
    {0, "Universal"}, {1, "Application Wide"}, {2, "Context Specific"}, {3, "Privateuse"},
};

inline constexpr ValueName kAsn1TagForm[] = {{0, "Primitive"}, {1, "Constructed"}};

// Every 5-bit tag number has a name; the unnamed ones are "Reserved".
inline constexpr ValueName kAsn1TagNumber[] = {
    {0, "Reserved"},          {1, "Boolean"},
    {2, "Integer"},           {3, "Bit String"},
    {4, "Octet String"},      {5, "NULL"},
    {6, "Object Identifier"}, {7, "Object Descriptor"},
    {8, "External"},          {9, "Real"},
    {10, "Enumerated"},       {11, "Reserved"},
    {12, "Reserved"},         {13, "Reserved"},
    {14, "Reserved"},         {15, "Reserved"},
    {16, "Sequence(OF)"},     {17, "SET(OF)"},
    {18, "NumberlcStrinig"},  {19, "PrintableStrinig"},
    {20, "TeletexStrinig(T61String)"}, {21, "VideotexStrinig"},
    {22, "IA5Strinig"},       {23, "UTCTime"},
    {24, "GeneralizedTime"},  {25, "GraphicString"},
    {26, "VisibleStrinig(ISO646String)"}, {27, "GeneralStrinig"},
    {28, "Reserved"},         {29, "Reserved"},
    {30, "Reserved"},         {31, "Reserved"},
};

inline constexpr ValueName kOperationCodeTag[] = {
    {0x02, "Local Operation Code"}, {0x06, "Global Operation Code"},
};

inline constexpr ValueName kProblemType[] = {
    {0x80, "General Problem"}, {0x81, "Invoke"}, {0x82, "Return Result"}, {0x83, "Return Error"},
};

inline constexpr ValueName kGeneralProblem[] = {
    {0, "UnrecognizedComponent"}, {1, "MistypedComponent"}, {2, "Badly StructuredComponent"},
};

inline constexpr ValueName kInvokeProblem[] = {
    {0, "DuplicateInvoke ID"},        {1, "UnrecognizedOperation"},
    {2, "MistypedParameter"},         {3, "Resource Limitation"},
    {4, "Initiating Release"},        {5, "UnrecognizedLinked ID"},
    {6, "Linked Response Unexpected"}, {7, "Unexpected LinkedOperation"},
};

inline constexpr ValueName kReturnResultProblem[] = {
    {0, "UnrecognizedInvoke Id"}, {1, "Return Result Unexpected"}, {2, "MistypedParameter"},
};

inline constexpr ValueName kReturnErrorProblem[] = {
    {0, "UnrecognizedInvoke ID"}, {1, "Return Error Unexpected"}, {2, "Unrecognized Error"},
    {3, "Unexpected Error"},      {4, "MistypedParameter"},
};

} // namespace camel::names
