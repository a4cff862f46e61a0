/*
 * dpx_standin_host.h - control and inspection API of the stand-in host
 * libraries (libpu_ParserUtilities.so, libkf_OptSupport.so).
 *
 * The stand-in libraries implement the pu_* and kf_* functions the module
 * imports (declared in dpx_camel.h) the way a host would, and additionally
 * record everything the module hands them so that host programs and tests
 * can see exactly what a real host would see.  They also let a test inject
 * failures.  Nothing here is used by the module itself.
 */
#ifndef DPX_STANDIN_HOST_H
#define DPX_STANDIN_HOST_H

#include "dpx_camel.h"

#ifdef __cplusplus
extern "C" {
#endif

/* ---- libpu_ParserUtilities: state preparation -------------------------- */

/* Allocates a DecodeState with its stacks, span array, label, value-text and
 * element-name buffers (all through the host allocator) and prepares it for
 * the given message.  The message bytes are copied into a host-owned buffer
 * of exactly `length` bytes, so any read past the message is caught by the
 * address sanitizer.  Returns null when memory is exhausted. */
DecodeState *host_NewState(const uint8_t *message, uint32_t length);

/* Prepares an existing state again for a fresh pass over its message:
 * cursor 1, remaining bits = message bits, stacks with their bottom entries,
 * flags, counters and field record cleared, first-frame flag 1, frame 0.
 * Arrays a failed growth left null are allocated again. */
void host_ResetState(DecodeState *state);

/* Frees everything host_NewState allocated (null is allowed). */
void host_FreeState(DecodeState *state);

/* Fills a PreDecodeRequest for `state`: output lines (`lines` of 1000
 * bytes), one layer entry array of `layerLimit + 1` entries, layer index 0,
 * status 0.  host_FreeRequest releases what it allocated. */
void host_InitRequest(PreDecodeRequest *request, DecodeState *state,
                      uint32_t lines, uint32_t layerLimit);
void host_FreeRequest(PreDecodeRequest *request);

/* ---- libpu_ParserUtilities: what the module reported ------------------- */

typedef struct HostSpan {
    uint32_t value;
    uint32_t firstBit;
    uint32_t lastBit;
} HostSpan;

typedef struct HostDecodedField {
    char text[256];
    char label[256];
    uint32_t fieldId;
    uint32_t selector;
    uint32_t spanCount;
    const HostSpan *spans; /* spanCount entries, owned by the library */
    uint32_t arg8;         /* the two trailing arguments as received */
    uint32_t arg9;
    uint8_t lineLayerCode; /* byte 0 of the request's current output line */
} HostDecodedField;

typedef struct HostDisplayField {
    char text[256];
    uint32_t displayId;
} HostDisplayField;

/* A recorded field as it lies in the recorder: texts (NUL-terminated, at
 * most 255 characters) and spans point into the recorder's own storage and
 * stay valid until a field of the same kind is recorded or the records of
 * that kind are cleared.  Reading them copies nothing. */
typedef struct HostFieldView {
    const char *text;
    uint32_t textLength;
    const char *label;
    uint32_t labelLength;
    uint32_t fieldId;
    uint32_t selector;
    uint32_t spanCount;
    const HostSpan *spans;
    uint32_t arg8;
    uint32_t arg9;
    uint8_t lineLayerCode;
} HostFieldView;

typedef struct HostDisplayView {
    const char *text;
    uint32_t textLength;
    uint32_t displayId;
} HostDisplayView;

/* Forget every recorded field (both kinds), and the layer-call count. */
void host_ClearRecords(void);
/* Forget the decoded fields only, or the display fields only. */
void host_ClearDecodedRecords(void);
void host_ClearDisplayRecords(void);
uint32_t host_DecodedCount(void);
/* Fill *out with the index-th decoded field; 0 when out of range. */
int host_DecodedView(uint32_t index, HostFieldView *out);
/* The same field copied into a fixed-size record that stays valid until the
 * records are cleared; null when out of range. */
const HostDecodedField *host_Decoded(uint32_t index);
uint32_t host_DisplayCount(void);
int host_DisplayView(uint32_t index, HostDisplayView *out);
const HostDisplayField *host_Display(uint32_t index);
/* Number of pu_CreateNewLayerInfo calls since the last host_ClearRecords. */
uint32_t host_CreateLayerCalls(void);

/* ---- libpu_ParserUtilities: failure injection --------------------------- */

/* Make the n-th pu_Realloc call from now on return null (n >= 1); 0 turns
 * injection off.  Calls are counted from this call on. */
void host_SetReallocFailAt(uint32_t n);
/* pu_Realloc calls made since the last host_SetReallocFailAt. */
uint32_t host_ReallocCalls(void);
/* Result pu_access_point_name gives (1 by default: render and succeed). */
void host_SetAccessPointNameResult(uint8_t ok);

/* ---- libkf_OptSupport ---------------------------------------------------- */

/* Key buffer layout that kf_InitialiseOptKFE hands out:
 *   bytes 0..3        presence bits: entry i is bit (i % 8) of byte i / 8
 *   bytes 4..127      value slots: entry i at 4 + 4 * i (4 bytes each)
 *   bytes 128..       data area for packed variable values                */
#define HOST_KEY_PRESENCE_BYTES 4u
#define HOST_KEY_SLOT_BASE 4u
#define HOST_KEY_SLOT_SIZE 4u
#define HOST_KEY_DATA_START 128u

/* Override the result (and selected index) kf_InitialiseOptKFE returns;
 * the table is still filled in when the result is not negative. */
void host_SetKfInitResult(int32_t result, uint16_t selectedIndex);
/* Back to the real behaviour: fill the table and return 1. */
void host_ClearKfInitOverride(void);
/* kf_InitialiseOptKFE calls so far. */
uint32_t host_KfInitCalls(void);

#ifdef __cplusplus
}
#endif

#endif /* DPX_STANDIN_HOST_H */
