// Every field the grammar reports, declared once, in catalogue order: the
// order in which a depth-first walk of the grammar first meets each field
// (message types 0x61, 0x62, 0x64, 0x65, 0x67; each unit's fields and child
// units in decoding order).  Display ids are derived from this order, so a
// new unit's fields go where the walk first meets them, not at the end.
#pragma once

#include <cstddef>
#include <cstdint>

#include "fields/field_def.h"
#include "fields/names_cap.h"
#include "fields/names_tcap.h"

namespace camel {

namespace fid {
// Field ids the engine itself reports.
inline constexpr uint32_t kEndOfContents = 1065;
} // namespace fid

inline constexpr FieldDef kFields[] = {
    // ---- Message level: message type, then the Unidirectional message ----
    enumField(3604, "MT", names::kMessageType).key(0, KeyForm::Octet),
    headerLength(3606),
    // Unidirectional dialogue portion, decoded inline by the message
    tagField(3615, "Dialogue Portion Tag"),
    blockLength(3616),
    hexField(fid::kEndOfContents, "End of contents", 16),
    // Unidirectional External
    tagField(3622, "External Tag"),
    blockLength(3623),
    tagField(3717, "Object Identifier Tag"),
    octetLength(3718),
    hexField(3719, "  Dialogue-as-ID ccitt recommendation"),
    hexField(3720, "  q"),
    hexField(3721, "  773"),
    hexField(3722, "  Space Character"),
    hexField(3723, "  as(1)"),
    hexField(3724, "  UnidialoguePDU"),
    hexField(3725, "  version1(1)"),
    tagField(3726, "Single ASN.1 Type Tag"),
    headerLength(3727),
    tagField(3728, "Unidirectional Dialogue Tag"),
    blockLength(3729),
    // PDU members shared by the request, response and unidirectional PDUs
    tagField(3786, "Protocol Version Tag"),
    octetLength(3787),
    digitsField(3788, "  Protocol Version").indented(),
    tagField(3789, "Application Context Name Tag"),
    octetLength(3790, "  Application Context Name Length"),
    tagField(3791, "Object Identifier Tag"),
    octetLength(3792),
    hexField(3793, "  Application Context Name CCITT recommendation"),
    hexField(3794, "  etsi"),
    hexField(3795, "  mobile Domain"),
    hexField(3796, "  umts/gsm Network"),
    enumField(3797, "cap", names::kAcCap).indented(),
    enumField(3799, "dialoguePDU", names::kAcDialoguePdu).indented(),
    enumField(3800, "version", names::kAcVersion).indented(),
    hexField(3877, "ac").indented(),
    enumField(3878, "Context", names::kCap3Context),
    hexField(3879, "ac").indented(),
    enumField(3880, "Context", names::kCap3OeContext),
    tagField(3801, "User Information Tag"),
    blockLength(3802),
    tagField(3808, "External Tag"),
    blockLength(3809),
    tagField(3819, "Object Identifier Tag"),
    octetLength(3820),
    hexField(3821, "CCITT Identified Organisation"),
    hexField(3822, "ETSI"),
    hexField(3823, "Mobile Domain"),
    hexField(3824, "GSM/UMTS_Network"),
    hexField(3825, "As_id"),
    enumField(3826, "Cap-datatypes", names::kCapDatatypes),
    hexField(3827, "Version3(2)"),
    tagField(3828, "Integer Tag"),
    octetLength(3829),
    digitsField(3830, "  Indirect Reference").indented(),
    tagField(3831, "Single ASN.1 Type Tag"),
    headerLength(3832),
    // Opaque walker over a Single ASN.1 Type of the user information
    hexField(3835, "", 1),
    enumField(3848, "ASN.1 Tag CLASS", names::kAsn1TagClass, 2).indented(),
    enumField(3849, "ASN.1 Tag FORM", names::kAsn1TagForm, 1).indented(),
    enumField(3850, "ASN.1 Tag Number", names::kAsn1TagNumber, 5).indented(),
    octetLength(3842, "Single-ASN.1 Length").indented(),
    hexField(3844, "ASN Type VALUE").indented(),
    octetLength(3841, "Single-ASN.1 Length").indented(),
    tagField(3851, "Octet Aligned Tag"),
    headerLength(3852),
    digitsField(3853, "Octet-Aligned Value").indented(),
    tagField(3854, "Arbitrary Tag"),
    headerLength(3855),
    digitsField(3856, "  Arbitrary Value").indented(),
    // Component portion (the Unidirectional message's, then every message's)
    tagField(3629, "Component Portion Tag"),
    blockLength(3630),
    tagField(3660, "Invoke"),
    blockLength(3661),
    tagField(3703, "Invoke Id Tag"),
    octetLength(3704),
    unsignedField(3705, "  Invoke Id").key(4, KeyForm::Octet),
    tagField(3706, "Linked Id Tag"),
    octetLength(3707),
    unsignedField(3708, "  Linked Id"),
    // Operation dispatch
    enumField(3876, "Operation Code Tag", names::kOperationCodeTag),
    octetLength(3668),
    enumField(1066, "Operation ID(Invoke)", names::kOperation).key(5, KeyForm::Octet),
    // Return Result (Last), Return Error, Reject
    tagField(3669, "Return Result (Last)").key(27, KeyForm::Octet),
    blockLength(3670),
    tagField(3685, "Return Error").key(28, KeyForm::Octet),
    blockLength(3686),
    tagField(3694, "Reject"),
    blockLength(3695),
    enumField(3701, "  Problem Code", names::kProblemType),
    octetLength(3709),
    enumField(3710, "  Problem Code", names::kGeneralProblem),
    octetLength(3711),
    enumField(3712, "  Problem Code", names::kInvokeProblem),
    octetLength(3713),
    enumField(3714, "  Problem Code", names::kReturnResultProblem),
    octetLength(3715),
    enumField(3716, "  Problem Code", names::kReturnErrorProblem),

    // ---- Begin ----
    headerLength(3608),
    tagField(3651, "Originating Trans Id Tag"),
    headerLength(3652),
    digitsField(3653, "Originating Transaction Id").indented().key(26, KeyForm::Variable),
    // Structured dialogue portion
    tagField(3737, "Dialogue Portion Tag"),
    blockLength(3738),
    tagField(3743, "External Tag"),
    blockLength(3744),
    tagField(3749, "Object Identifier Tag"),
    octetLength(3750),
    hexField(3751, "  CCITT recommendation"),
    hexField(3752, "  q"),
    hexField(3753, "  773"),
    hexField(3754, "  Space Character"),
    hexField(3755, "  as(1)"),
    hexField(3756, "  DialoguePDU"),
    hexField(3757, "  version1(1)"),
    tagField(3758, "Single ASN.1 Type Tag"),
    headerLength(3759),
    enumField(3760, "  Dialogue PDU", names::kDialoguePdu),
    headerLength(3762),
    headerLength(3763),
    tagField(3766, "Result Tag"),
    blockLength(3767),
    tagField(3772, "Integer Tag"),
    octetLength(3773),
    enumField(3774, "  Result", names::kResult),
    tagField(3775, "Result Source Diagnostic Tag"),
    blockLength(3776),
    tagField(3858, "Service User Tag"),
    blockLength(3859),
    tagField(3864, "Integer Tag"),
    octetLength(3865),
    enumField(3866, "  Service User Value", names::kServiceUser),
    tagField(3867, "Service Provider Tag"),
    blockLength(3868),
    tagField(3873, "Integer Tag"),
    octetLength(3874),
    enumField(3875, "  Service Provider Value", names::kServiceProvider),
    headerLength(3781),
    tagField(3783, "Abort Source Tag"),
    octetLength(3784),
    enumField(3785, "  Abort Source Value", names::kAbortSource),

    // ---- End ----
    headerLength(3611),
    tagField(3654, "Destination Trans Id Tag"),
    headerLength(3655),
    digitsField(3656, "Destination Transaction Id").indented().key(29, KeyForm::Variable),

    // ---- Continue ----
    headerLength(3612),

    // ---- Abort ----
    headerLength(3613),
    tagField(3657, "P-Abort Cause Tag"),
    octetLength(3658),
    enumField(3659, "  P-Abort Cause", names::kPAbortCause).key(3, KeyForm::Octet),
};

inline constexpr size_t kFieldCount = sizeof(kFields) / sizeof(kFields[0]);

// Position of a field id in the catalogue; kFieldCount when it is unknown.
constexpr size_t fieldIndex(uint32_t id) {
    for (size_t i = 0; i < kFieldCount; ++i)
        if (kFields[i].id == id)
            return i;
    return kFieldCount;
}

namespace detail {
constexpr const char *skipBlanks(const char *s) {
    while (*s == ' ')
        ++s;
    return s;
}
constexpr bool sameText(const char *a, const char *b) {
    while (*a != '\0' && *a == *b) {
        ++a;
        ++b;
    }
    return *a == *b;
}
} // namespace detail

// The display id of a field: the id of the first catalogue entry whose label
// equals the field's label with leading blanks ignored.
constexpr uint32_t displayIdOf(uint32_t id) {
    const char *label = detail::skipBlanks(kFields[fieldIndex(id)].label);
    for (size_t i = 0; i < kFieldCount; ++i)
        if (detail::sameText(detail::skipBlanks(kFields[i].label), label))
            return kFields[i].id;
    return id;
}

constexpr bool idsAreUnique() {
    for (size_t i = 0; i < kFieldCount; ++i)
        for (size_t j = i + 1; j < kFieldCount; ++j)
            if (kFields[i].id == kFields[j].id)
                return false;
    return true;
}
static_assert(idsAreUnique(), "a field id is declared twice");

// The declaration of a field known at compile time.
template <uint32_t Id>
struct Field {
    static_assert(fieldIndex(Id) < kFieldCount, "field id is not declared in kFields");
    static constexpr const FieldDef &def = kFields[fieldIndex(Id)];
    static constexpr uint32_t displayId = displayIdOf(Id);
};

} // namespace camel
