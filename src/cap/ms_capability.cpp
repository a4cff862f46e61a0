// The MS network capability bits and the MS radio access capability body.
#include "cap/ms_capability.h"

namespace camel {

namespace {

// ---- MS network capability ----------------------------------------------------------
// One- and two-bit fields taken from the least significant bit of each octet
// upwards, each consuming its bits: octet 1 holds GEA/1 to the revision
// level indicator, octet 2 the PFC feature mode, GEA/2 to GEA/7 and a spare
// bit.

constexpr FieldIndex kNetworkCapability[] = {
    fx(2535), fx(2536), fx(2537), fx(2538), fx(2539), fx(2540), fx(2541), fx(2542),
    fx(2543), fx(2544), fx(2545), fx(2546), fx(2547), fx(2548), fx(2549),
};

// ---- MS radio access capability body ---------------------------------------------------
// A stream of access capability records read most significant bit first:
// bit k of the body (k = 0 the most significant bit of its first octet)
// is message position base + 8 * (k / 8) + 7 - k % 8.  The cursor counts
// the stream bits taken (cursor = base + k), so windows, room tests and
// leftovers work on the stream as on any other element.
//
// A record: access technology type, length, the capability content of
// that many bits and the spare bits that fill it, then a selector whose 1
// Branch is a further record.  A technology type of 1111 announces
// additional access technologies, whose content the families below do not
// describe: that record's bits are shown as spare.  After the last record
// spare bits pad the stream to its octet.

enum class Family : uint8_t {
    Header, Technology, Length, RfPower, Selector,
    A5_1, A5_2, A5_3, A5_4, A5_5, A5_6, A5_7,
    EsInd, Ps, Vgcs, Vbs, Hscsd, GprsClass, GprsAllocation, SmsValue, SmValue, Spare,
    Count,
};

// How each family is declared (label, width, names), for the checks below.
constexpr FieldDef (*const kFamilyDeclaration[])(uint32_t) = {
    mscap::accessCapabilities, mscap::accessTechnologyType, mscap::capabilitiesLength,
    mscap::rfPowerCapability, mscap::selector,
    mscap::a5_1, mscap::a5_2, mscap::a5_3, mscap::a5_4, mscap::a5_5, mscap::a5_6, mscap::a5_7,
    mscap::esInd, mscap::ps, mscap::vgcs, mscap::vbs, mscap::hscsdClass, mscap::gprsClass,
    mscap::gprsDynamicAllocation, mscap::smsValue, mscap::smValue, mscap::spare,
};
static_assert(sizeof kFamilyDeclaration / sizeof kFamilyDeclaration[0] ==
              static_cast<size_t>(Family::Count));

// One row per field of a record; a selector's `branch` is the number of
// rows its 1 Branch holds, skipped when the selector is 0.
struct Row {
    Family family;
    uint8_t branch = 0;
};
constexpr Row kRecord[] = {
    {Family::Technology}, {Family::Length},
    // content
    {Family::RfPower},
    {Family::Selector, 7}, // A5 bits
    {Family::A5_1}, {Family::A5_2}, {Family::A5_3}, {Family::A5_4}, {Family::A5_5},
    {Family::A5_6}, {Family::A5_7},
    {Family::EsInd}, {Family::Ps}, {Family::Vgcs}, {Family::Vbs},
    {Family::Selector, 8}, // multislot capability
    {Family::Selector, 1}, {Family::Hscsd},
    {Family::Selector, 2}, {Family::GprsClass}, {Family::GprsAllocation},
    {Family::Selector, 2}, {Family::SmsValue}, {Family::SmValue},
    // filling the record to its length, then: does a record follow?
    {Family::Spare}, {Family::Selector},
};
constexpr uint32_t kRecordRows = sizeof kRecord / sizeof kRecord[0];
constexpr uint32_t kTechnologyRow = 0, kLengthRow = 1, kContentFirst = 2, kSpareRow = 24,
                   kNextRow = 25;
static_assert(kRecord[kSpareRow].family == Family::Spare && kNextRow + 1 == kRecordRows);
constexpr uint32_t kAdditionalTechnologies = 15;

// ---- Field ids -----------------------------------------------------------------------
// Every position of the grammar has a field id of its own, from 3919 on in
// decoding order: the header, eight record slots (the ninth and later
// records reuse the eighth slot's ids), the padding.  The first field of a
// family that has a display id of its own carries that id, so that the
// family is displayed under it; the other positions take the next id
// that no family holds.

constexpr uint32_t kFirstId = 3919, kLastId = 4139;
constexpr uint32_t kSlots = 8;

constexpr uint32_t familyId(Family f) {
    switch (f) {
    case Family::Technology: return 3919;
    case Family::RfPower: return 3926;
    case Family::Selector: return 3927;
    case Family::A5_1: case Family::A5_2: case Family::A5_3: case Family::A5_4:
    case Family::A5_5: case Family::A5_6: case Family::A5_7:
        return 3972 + (static_cast<uint32_t>(f) - static_cast<uint32_t>(Family::A5_1));
    case Family::EsInd: return 3929;
    case Family::Ps: return 3930;
    case Family::Vgcs: return 3931;
    case Family::Vbs: return 3932;
    case Family::Hscsd: return 3955;
    case Family::GprsClass: return 3947;
    case Family::GprsAllocation: return 3948;
    case Family::SmsValue: return 3944;
    case Family::SmValue: return 3945;
    default: return 0;
    }
}

struct BodyFields {
    FieldIndex header;
    FieldIndex record[kSlots][kRecordRows];
    FieldIndex padding;
    uint32_t lastId;
    bool undeclared; // an id the catalogue does not declare
};

consteval BodyFields assignFieldIds() {
    BodyFields out{};
    bool met[static_cast<size_t>(Family::Count)] = {};
    uint32_t next = kFirstId;
    const auto familyHolds = [](uint32_t id) {
        for (size_t f = 0; f < static_cast<size_t>(Family::Count); ++f)
            if (familyId(static_cast<Family>(f)) == id)
                return true;
        return false;
    };
    const auto take = [&](Family f) {
        uint32_t id = familyId(f);
        bool &first = met[static_cast<size_t>(f)];
        if (id == 0 || first) {
            while (familyHolds(next))
                ++next;
            id = next++;
        }
        first = true;
        out.lastId = id > out.lastId ? id : out.lastId;
        const size_t index = fieldIndex(id);
        out.undeclared = out.undeclared || index >= kFieldCount;
        return static_cast<FieldIndex>(index);
    };
    out.header = take(Family::Header);
    for (uint32_t s = 0; s < kSlots; ++s)
        for (uint32_t r = 0; r < kRecordRows; ++r)
            out.record[s][r] = take(kRecord[r].family);
    out.padding = take(Family::Spare);
    return out;
}
constexpr BodyFields kBody = assignFieldIds();
static_assert(kBody.lastId <= kLastId, "the body's field ids run past their range");
static_assert(!kBody.undeclared, "a body field id is not declared");

// Each position is declared as its family; each family is displayed under
// the id it stands for.
constexpr bool declaredAs(FieldIndex f, Family family) {
    const FieldDef want = kFamilyDeclaration[static_cast<size_t>(family)](0);
    return detail::sameText(kFields[f].label, want.label) && kFields[f].width == want.width &&
           kFields[f].render == want.render && kFields[f].names == want.names;
}
constexpr bool positionsDeclaredAsTheirFamilies() {
    bool ok = declaredAs(kBody.header, Family::Header) && declaredAs(kBody.padding, Family::Spare);
    for (uint32_t s = 0; s < kSlots; ++s)
        for (uint32_t r = 0; r < kRecordRows; ++r)
            ok = ok && declaredAs(kBody.record[s][r], kRecord[r].family);
    return ok;
}
static_assert(positionsDeclaredAsTheirFamilies(), "a body field is declared as another family");
constexpr bool familiesDisplayedUnderTheirIds() {
    for (uint32_t s = 0; s < kSlots; ++s)
        for (uint32_t r = 0; r < kRecordRows; ++r) {
            const Family f = kRecord[r].family;
            const uint32_t want = f == Family::Length  ? 3718
                                  : f == Family::Spare ? 1821
                                                       : familyId(f);
            if (kDisplayIds.id[kBody.record[s][r]] != want)
                return false;
        }
    return true;
}
static_assert(familiesDisplayedUnderTheirIds(), "a body family is displayed under another id");

// ---- Walking the stream ------------------------------------------------------------------

// A field of `width` bits (1 to 32) at the cursor's stream offset: one span
// per octet it touches, most significant piece first, the value assembled
// from the pieces.  `consumed` is the width, or 0 for a field that only
// shows what follows.  Bits the window does not hold mean that the
// structure runs past its window: flagged as a length beyond the window,
// and the rest of the construct of `ctx` is skipped.
template <Pass P>
int streamField(DecodeState *st, ElementContext *ctx, Request<P> *rq, uint32_t base,
                FieldIndex f, uint32_t width, uint32_t consumed) {
    if (ctx->present == 0)
        return 1;
    if (!room(st, width)) {
        st->errorFlags |= DPX_ERR_LENGTH_BEYOND;
        noteStatus<P>(st, rq);
        ctx->present = 0;
        return 1;
    }
    const uint32_t from = st->bitCursor - base, to = from + width;
    beginField(st, f);
    if (!ensureSpans(st, (to - 1) / 8 - from / 8))
        return 0;
    uint32_t value = 0;
    for (uint32_t k = from, i = 0; k < to; ++i) {
        const uint32_t octetEnd = (k / 8 + 1) * 8, stop = to < octetEnd ? to : octetEnd;
        const uint32_t octet = base + 8 * (k / 8);
        value = (value << (stop - k)) | setSpanAt(st, i, octet + 7 - (stop - 1) % 8, octet + 7 - k % 8);
        k = stop;
    }
    st->field.value = value;
    return finishField<P>(st, rq, f, consumed);
}

// A selector's branch, named for the host; returns whether it is the 1 Branch.
inline bool enterBranch(DecodeState *st) {
    const bool taken = st->field.value == 1;
    setElementName(st, taken ? "1 Branch" : "0 Branch");
    return taken;
}

// One record with the field ids of its slot.  Sets `more` when its final
// selector announces a further record; clears `body` when the record runs
// past the body.
template <Pass P>
int record(DecodeState *st, ElementContext *body, Request<P> *rq, uint32_t base,
           const FieldIndex (&ids)[kRecordRows], bool *more) {
    const auto field = [&](ElementContext *ctx, uint32_t row) {
        const uint32_t width = kFields[ids[row]].width;
        return streamField<P>(st, ctx, rq, base, ids[row], width, width);
    };
    if (!elementStart(st, "MS RA Capability Value Part"))
        return 0;
    ElementContext own{0, 1, 0, 0};
    if (!field(&own, kTechnologyRow))
        return 0;
    const uint32_t technology = st->field.value;
    if (!field(&own, kLengthRow))
        return 0;
    if (own.present == 0) {
        body->present = 0;
        return elementEnd<P>(st, rq);
    }
    // The record's window: its length in bits.
    if (!narrowWindow(st, st->field.value))
        body->present = 0;
    if (!pushEnd(st))
        return 0;
    for (uint32_t r = kContentFirst; technology != kAdditionalTechnologies && r < kSpareRow; ++r) {
        if (!field(&own, r))
            return 0;
        if (own.present == 0)
            break;
        if (kRecord[r].branch != 0 && !enterBranch(st))
            r += kRecord[r].branch;
    }
    // Spare bits fill the record; a record cut short leaves its bits over.
    while (own.present != 0 && st->remainingBits != 0) {
        const uint32_t width = st->remainingBits < 32 ? st->remainingBits : 32;
        if (!streamField<P>(st, &own, rq, base, ids[kSpareRow], width, width))
            return 0;
    }
    closeElementWindow<P>(st, rq);
    if (!field(body, kNextRow))
        return 0;
    *more = body->present != 0 && enterBranch(st);
    return 1;
}

} // namespace

template <Pass P>
int decodeMsNetworkCapability(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    for (const FieldIndex f : kNetworkCapability) {
        const uint32_t width = kFields[f].width;
        if (!fittedBitsField<P>(st, ctx, rq, f, 0, width, width))
            return 0;
    }
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeMsNetworkCapability, DecodeState *, ElementContext *);

template <Pass P>
int decodeMsRadioAccessCapability(DecodeState *st, ElementContext *ctx, Request<P> *rq) {
    if (ctx->present == 0)
        return 1;
    if (!elementStart(st, "MS Radio Access Capability Body"))
        return 0;
    // Whole octets only are read most significant bit first: a window that
    // ends inside an octet leaves that octet's bits over.
    const uint32_t base = st->bitCursor;
    st->remainingBits &= ~7u;
    if (!pushEnd(st))
        return 0;
    ElementContext body{0, 1, 0, 0};
    // The header shows the first record's technology type.
    if (room(st, 4) && !streamField<P>(st, &body, rq, base, kBody.header, 4, 0))
        return 0;
    bool more = true;
    for (uint32_t slot = 0; more && body.present != 0; slot += slot + 1 < kSlots ? 1 : 0) {
        more = false;
        if (!record<P>(st, &body, rq, base, kBody.record[slot], &more))
            return 0;
    }
    // After the last record, spare bits up to the end of its octet.
    const uint32_t padding = (8 - (st->bitCursor - base) % 8) % 8;
    if (body.present != 0 && padding != 0 &&
        !streamField<P>(st, &body, rq, base, kBody.padding, padding, padding))
        return 0;
    closeElementWindow<P>(st, rq);
    return 1;
}
CAMEL_INSTANTIATE_UNIT(decodeMsRadioAccessCapability, DecodeState *, ElementContext *);

} // namespace camel
