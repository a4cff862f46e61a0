/*
 * dpx_camel.h - binary contract between the DPX host framework and the
 * TCAP/CAMEL decoder module 3gpp_camel_400_DLL.
 *
 * Every record here crosses the module boundary.  Members are declared in
 * offset order; the offsets in the comments are the host's 32-bit layout
 * and are checked with static_assert whenever pointers are 4 bytes wide.
 * Bytes the module never touches are explicit reserved members.  In a 64-bit
 * build the same declarations are used and pointers simply widen.
 */
#ifndef DPX_CAMEL_H
#define DPX_CAMEL_H

#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* One contiguous run of message bits belonging to a field (24 bytes). */
typedef struct ValueSpan {
    uint32_t value;     /*  0 the bits read */
    uint32_t firstBit;  /*  4 first bit position (1-based) */
    uint32_t lastBit;   /*  8 last bit position */
    uint32_t flags;     /* 12 always written as 0 */
    uint32_t reserved[2]; /* 16 never written by the module */
} ValueSpan;

/* The field being assembled; lives inside DecodeState at offset 204. */
typedef struct FieldRecord {
    uint32_t fieldId;         /* 204 */
    char *label;              /* 208 255-byte host buffer */
    uint32_t value;           /* 212 */
    char *valueText;          /* 216 255-byte host buffer */
    uint32_t spansFilled;     /* 220 */
    uint32_t spansReported;   /* 224 */
    ValueSpan *spans;         /* 228 */
    uint32_t spanCapacity;    /* 232 */
    uint32_t lengthFieldStart;/* 236 */
    uint32_t lengthFieldBits; /* 240 */
    uint8_t reserved[8];      /* 244 */
    uint32_t valueKind;       /* 252 */
} FieldRecord;

/* One layer frame (56 bytes); only the start position is meaningful. */
typedef struct LayerFrame {
    uint32_t startBit;
    uint32_t cleared[13];
} LayerFrame;

/* The host-owned decoding state of one message. */
typedef struct DecodeState {
    const uint8_t *buffer;     /*   0 message bytes */
    const void *source;        /*   4 host member */
    uint32_t totalBits;        /*   8 host member */
    uint32_t bitCursor;        /*  12 next bit to decode, 1-based */
    uint8_t reserved0[4];      /*  16 */
    uint32_t remainingBits;    /*  20 bits to the end of the current window */
    uint32_t errorFlags;       /*  24 sticky DPX_ERR_* bits */
    uint32_t *posStack;        /*  28 element start positions */
    uint32_t *posTop;          /*  32 */
    uint32_t posIndex;         /*  36 */
    uint32_t posCapacity;      /*  40 */
    uint32_t *endStack;        /*  44 last bit of each open window */
    uint32_t *endTop;          /*  48 */
    uint32_t endIndex;         /*  52 */
    uint32_t endCapacity;      /*  56 */
    uint8_t testFlag;          /*  60 */
    uint8_t reserved1[3];      /*  61 */
    uint32_t fieldWidth;       /*  64 */
    uint32_t occurrenceCounter;/*  68 */
    char *elementName;         /*  72 host text buffer */
    uint8_t reservedArea[128]; /*  76 cleared by the host */
    FieldRecord field;         /* 204 */
    uint8_t reserved2[8];      /* 256 */
    LayerFrame *layerFrames;   /* 264 */
    uint32_t firstFrameFlag;   /* 268 */
    uint32_t frameIndex;       /* 272 */
    uint32_t frameCapacity;    /* 276 */
} DecodeState;

/* Error flags of DecodeState.errorFlags. */
#define DPX_ERR_MANDATORY_MISSING 0x2u
#define DPX_ERR_LENGTH_BEYOND 0x8u
#define DPX_ERR_LEFTOVER 0x10u
#define DPX_ERR_FRAME_GROWTH 0x10000000u
#define DPX_ERR_STACK_GROWTH 0x20000000u
#define DPX_ERR_SPAN_GROWTH 0x40000000u

/* Status the message-view pass stores when any error flag is set. */
#define DPX_STATUS_INVALID (-52)

/* Sizes the host provides when it prepares a state. */
#define DPX_TEXT_BUFFER_SIZE 255u
#define DPX_INITIAL_SPANS 200u
#define DPX_OUTPUT_LINE_SIZE 1000u

/* Record a caller hands to a child grammar unit (16 bytes). */
typedef struct ElementContext {
    uint32_t spare;           /*  0 */
    uint32_t present;         /*  4 */
    uint32_t occurrenceCount; /*  8 */
    uint32_t eocSeen;         /* 12 */
} ElementContext;

/* One decoded protocol layer (16 bytes). */
typedef struct LayerInfoEntry {
    uint32_t firstBit;  /*  0 */
    uint32_t lastBit;   /*  4 */
    uint32_t layerTag;  /*  8 */
    uint32_t layerCode; /* 12 */
} LayerInfoEntry;

/* Request of the three pre-decode entry points. */
typedef struct PreDecodeRequest {
    uint8_t reserved0[12];      /*   0 */
    uint32_t remainingBits;     /*  12 out */
    uint8_t reserved1[8];       /*  16 */
    uint8_t layerCode;          /*  24 */
    uint8_t reserved2[11];      /*  25 */
    uint32_t layerTag;          /*  36 */
    uint8_t reserved3[4];       /*  40 */
    int32_t status;             /*  44 out: -52 from the message-view pass */
    uint8_t reserved4[4];       /*  48 */
    char *outputLines;          /*  52 array of 1000-byte lines */
    uint32_t currentLineIndex;  /*  56 */
    uint8_t reserved5[20];      /*  60 */
    LayerInfoEntry *layerEntries; /* 80 */
    uint32_t layerIndex;        /*  84 */
    uint32_t layerLimit;        /*  88 */
    uint8_t reserved6[12];      /*  92 */
    DecodeState *state;         /* 104 */
} PreDecodeRequest;

/* Request of the key-field entry point. */
typedef struct KeyFieldRequest {
    uint8_t reserved0[8];  /*  0 */
    uint32_t remainingBits;/*  8 out */
    uint8_t reserved1[8];  /* 12 */
    uint8_t *keyBuffer;    /* 20 */
    uint16_t dataOffset;   /* 24 in/out: next free byte of the data area */
    uint16_t valueRoom;    /* 26 in: bytes available for variable values */
    DecodeState *state;    /* 28 */
} KeyFieldRequest;

/* One entry of the module's key table, filled in by kf_InitialiseOptKFE. */
typedef struct KeyTableEntry {
    uint32_t presenceOffset;  /*  0 host */
    uint32_t valueOffset;     /*  4 host */
    uint32_t presenceMask;    /*  8 host; only the first byte is used */
    const char *protocolName; /* 12 module */
    const char *fieldName;    /* 16 module */
    uint8_t reserved[12];     /* 20 */
} KeyTableEntry;

#define DPX_KEY_ENTRY_COUNT 31

/* Slot of a variable key value inside the key buffer (little-endian). */
typedef struct KeyValueSlot {
    uint16_t bitLength;  /* 0 bits of the value; 0 after an overflow */
    uint16_t dataOffset; /* 2 byte offset of the packed value; bit 15 on overflow */
} KeyValueSlot;

#define DPX_KEY_OVERFLOW_BIT 0x8000u

/* Return status of the table-access entry points on a bad index. */
#define DPX_TABLE_BAD_INDEX 0xD0410001u

/* ---- Description tables (dp_DLLGetTable / dp_DLLGetPtr) ---------------------
 * Indexes: 1 interface version text; 2 protocol description record (GetPtr:
 * the four-word header before it); 4 field catalogue (GetTable), layout
 * prototype block A (GetPtr); 5 the sample record of block B (GetTable),
 * block B (GetPtr); 6 value table; 7 value-code list; 8 string table;
 * 9 display attribute table.  Index 3 is not served.
 */
enum {
    DPX_TABLE_VERSION = 1,
    DPX_TABLE_DESCRIPTION = 2,
    DPX_TABLE_CATALOGUE = 4,
    DPX_TABLE_PROTOTYPE_A = 4,
    DPX_TABLE_PROTOTYPE_B = 5,
    DPX_TABLE_VALUES = 6,
    DPX_TABLE_CODES = 7,
    DPX_TABLE_STRINGS = 8,
    DPX_TABLE_ATTRIBUTES = 9
};

/* The protocol description record: 25 consecutive 32-bit members. */
typedef struct ProtocolDescription {
    const char *organisation;   /*  0 */
    const char *shortName;      /*  4 */
    const char *longName;       /*  8 */
    const char *release;        /* 12 */
    const char *network;        /* 16 */
    const char *remark;         /* 20 */
    char *text7;                /* 24 writable, empty at load */
    const char *fileName;       /* 28 */
    char *text9;                /* 32 writable, empty at load */
    const char *generator;      /* 36 */
    const char *generatorCopy;  /* 40 */
    const char *selectorValue;  /* 44 */
    const char *selectorKind;   /* 48 */
    const char *standard;       /* 52: the 3GPP document decoded */
    char *text15;               /* 56 writable, empty at load */
    char *text16;               /* 60 writable, empty at load */
    uint32_t number17;          /* 64 */
    uint32_t number18;          /* 68 */
    uint32_t number19;          /* 72 */
    const char *shortNameCopy;  /* 76 */
    const char *fileNameCopy;   /* 80 */
    uint32_t number22;          /* 84 */
    uint32_t number23;          /* 88 */
    uint32_t number24;          /* 92 */
    uint32_t number25;          /* 96 */
} ProtocolDescription;

/* The four header words and the record right after them. */
typedef struct ProtocolDescriptionBlock {
    uint32_t header[4];
    ProtocolDescription record;
} ProtocolDescriptionBlock;

/* Bytes of each writable text area of the description record. */
#define DPX_DESCRIPTION_TEXT_SIZE 256

/* One field catalogue entry: 19 32-bit words. */
typedef struct CatalogueEntry {
    uint32_t packed;          /*  0 bits 0-7 storage class, 8-15 display variant,
                                    16-23 key flag, 24-31 group */
    uint32_t fieldId;         /*  4 */
    uint32_t keyNumber;       /*  8 1 to 26 for key fields, else 0 */
    const char *label;        /* 12 without leading blanks */
    const char *labelCopy;    /* 16 the same text */
    uint32_t valueCount;      /* 20 */
    uint32_t firstValue;      /* 24 value-table index; 0xFFFFFFFF: none */
    uint32_t width;           /* 28 0xFFFF0000 + bits; 0xFFFFFFFF: variable */
    uint32_t formatIndex;     /* 32 string-table index of the summary format */
    uint32_t unused1[6];      /* 36 0xFFFFFFFF */
    uint32_t attributeOffset; /* 60 byte offset in the attribute table */
    uint32_t unused2[3];      /* 64 0xFFFFFFFF */
} CatalogueEntry;

#define DPX_CATALOGUE_CLASS(packed) ((packed) & 0xFFu)
#define DPX_CATALOGUE_VARIANT(packed) (((packed) >> 8) & 0xFFu)
#define DPX_CATALOGUE_KEY_FLAG(packed) (((packed) >> 16) & 0xFFu)
#define DPX_CATALOGUE_GROUP(packed) (((packed) >> 24) & 0xFFu)
#define DPX_CATALOGUE_END 0xFFFFFFFFu /* packed word of the terminator */

/* One value-table entry. */
typedef struct ValueEntry {
    uint32_t kind;        /* 0 1: the value equals the code; 0x10000: any other value */
    uint32_t codeIndex;   /* 4 index into the value-code list */
    uint32_t stringIndex; /* 8 index into the string table */
} ValueEntry;

#define DPX_VALUE_NAMED 1u
#define DPX_VALUE_OTHERWISE 0x10000u

/* The last text of the string table, and the catalogue terminator's label. */
#define DPX_FINAL_STRING "$$_FINAL_STRING_$$"
#define DPX_LAST_FIELD "$_$LAST_FIELD$_$"

/* Display attribute table and layout prototype blocks. */
#define DPX_ATTRIBUTE_TABLE_SIZE 3996
typedef struct PrototypeHeader {
    uint32_t blockType;   /* 0 4: block A, 5: block B */
    uint32_t blockSize;   /* 4 bytes */
    uint32_t fixupOffset; /* 8 offset of the (pointer, target) offset pairs */
    uint32_t recordSize;  /* 12 the sample record's size; it starts at 16 */
} PrototypeHeader;

/* Entry points exported by the module. */
uint8_t dpx_PreDecodeMD(PreDecodeRequest *request);
uint8_t dpx_PreDecodeMV(PreDecodeRequest *request);
uint8_t dpx_PreDecodeTO(PreDecodeRequest *request);
int32_t KFE_3gpp_camel_400(KeyFieldRequest *request);
uint32_t dp_DLLGetPtr(int32_t index, const void **out);
uint32_t dp_DLLGetTable(int32_t index, const void **out);
char *date_conv(char *dst, uint32_t unused, const void *record);

/* Host parser utility library (pu_ParserUtilities). */
void *pu_Realloc(void *block, size_t size);
void *pu_Malloc(size_t size);
void pu_CreateNewLayerInfo(PreDecodeRequest *request);
int32_t pu_AddDecodedFieldsData(PreDecodeRequest *request, uint32_t spanCount,
                                ValueSpan *spans, char *text, uint32_t spanSelector,
                                char *label, uint32_t fieldId, uint32_t zero1,
                                uint32_t zero2);
int32_t pu_AddFieldsToDisplayData(PreDecodeRequest *request, char *text,
                                  uint32_t displayId);
uint8_t pu_access_point_name(char *text, uint32_t value, DecodeState *state);

/* Host key-field support library (kf_OptSupport). */
int32_t kf_InitialiseOptKFE(KeyTableEntry *table, int32_t count,
                            uint16_t *selectedIndex);

#ifdef __cplusplus
} /* extern "C" */
#endif

/* The host's 32-bit layout, checked wherever pointers are 4 bytes wide. */
#if defined(__cplusplus)
#define DPX_LAYOUT_ASSERT(cond, msg) static_assert(cond, msg)
#else
#define DPX_LAYOUT_ASSERT(cond, msg) _Static_assert(cond, msg)
#endif

#if UINTPTR_MAX == 0xFFFFFFFFu
#define DPX_AT(type, member, off) \
    DPX_LAYOUT_ASSERT(offsetof(type, member) == (off), #type "." #member " at " #off)
DPX_AT(ValueSpan, value, 0);
DPX_AT(ValueSpan, firstBit, 4);
DPX_AT(ValueSpan, lastBit, 8);
DPX_AT(ValueSpan, flags, 12);
DPX_LAYOUT_ASSERT(sizeof(ValueSpan) == 24, "ValueSpan is 24 bytes");
DPX_AT(DecodeState, buffer, 0);
DPX_AT(DecodeState, source, 4);
DPX_AT(DecodeState, totalBits, 8);
DPX_AT(DecodeState, bitCursor, 12);
DPX_AT(DecodeState, remainingBits, 20);
DPX_AT(DecodeState, errorFlags, 24);
DPX_AT(DecodeState, posStack, 28);
DPX_AT(DecodeState, posTop, 32);
DPX_AT(DecodeState, posIndex, 36);
DPX_AT(DecodeState, posCapacity, 40);
DPX_AT(DecodeState, endStack, 44);
DPX_AT(DecodeState, endTop, 48);
DPX_AT(DecodeState, endIndex, 52);
DPX_AT(DecodeState, endCapacity, 56);
DPX_AT(DecodeState, testFlag, 60);
DPX_AT(DecodeState, fieldWidth, 64);
DPX_AT(DecodeState, occurrenceCounter, 68);
DPX_AT(DecodeState, elementName, 72);
DPX_AT(DecodeState, reservedArea, 76);
DPX_AT(DecodeState, field, 204);
DPX_AT(DecodeState, field.fieldId, 204);
DPX_AT(DecodeState, field.label, 208);
DPX_AT(DecodeState, field.value, 212);
DPX_AT(DecodeState, field.valueText, 216);
DPX_AT(DecodeState, field.spansFilled, 220);
DPX_AT(DecodeState, field.spansReported, 224);
DPX_AT(DecodeState, field.spans, 228);
DPX_AT(DecodeState, field.spanCapacity, 232);
DPX_AT(DecodeState, field.lengthFieldStart, 236);
DPX_AT(DecodeState, field.lengthFieldBits, 240);
DPX_AT(DecodeState, field.valueKind, 252);
DPX_AT(DecodeState, layerFrames, 264);
DPX_AT(DecodeState, firstFrameFlag, 268);
DPX_AT(DecodeState, frameIndex, 272);
DPX_AT(DecodeState, frameCapacity, 276);
DPX_LAYOUT_ASSERT(sizeof(LayerFrame) == 56, "LayerFrame is 56 bytes");
DPX_AT(ElementContext, spare, 0);
DPX_AT(ElementContext, present, 4);
DPX_AT(ElementContext, occurrenceCount, 8);
DPX_AT(ElementContext, eocSeen, 12);
DPX_LAYOUT_ASSERT(sizeof(ElementContext) == 16, "ElementContext is 16 bytes");
DPX_AT(LayerInfoEntry, firstBit, 0);
DPX_AT(LayerInfoEntry, lastBit, 4);
DPX_AT(LayerInfoEntry, layerTag, 8);
DPX_AT(LayerInfoEntry, layerCode, 12);
DPX_LAYOUT_ASSERT(sizeof(LayerInfoEntry) == 16, "LayerInfoEntry is 16 bytes");
DPX_AT(PreDecodeRequest, remainingBits, 12);
DPX_AT(PreDecodeRequest, layerCode, 24);
DPX_AT(PreDecodeRequest, layerTag, 36);
DPX_AT(PreDecodeRequest, status, 44);
DPX_AT(PreDecodeRequest, outputLines, 52);
DPX_AT(PreDecodeRequest, currentLineIndex, 56);
DPX_AT(PreDecodeRequest, layerEntries, 80);
DPX_AT(PreDecodeRequest, layerIndex, 84);
DPX_AT(PreDecodeRequest, layerLimit, 88);
DPX_AT(PreDecodeRequest, state, 104);
DPX_AT(KeyFieldRequest, remainingBits, 8);
DPX_AT(KeyFieldRequest, keyBuffer, 20);
DPX_AT(KeyFieldRequest, dataOffset, 24);
DPX_AT(KeyFieldRequest, valueRoom, 26);
DPX_AT(KeyFieldRequest, state, 28);
DPX_AT(KeyTableEntry, presenceOffset, 0);
DPX_AT(KeyTableEntry, valueOffset, 4);
DPX_AT(KeyTableEntry, presenceMask, 8);
DPX_AT(KeyTableEntry, protocolName, 12);
DPX_AT(KeyTableEntry, fieldName, 16);
DPX_LAYOUT_ASSERT(sizeof(KeyTableEntry) == 32, "KeyTableEntry is 32 bytes");
DPX_AT(KeyValueSlot, bitLength, 0);
DPX_AT(KeyValueSlot, dataOffset, 2);
DPX_AT(ProtocolDescription, text7, 24);
DPX_AT(ProtocolDescription, standard, 52);
DPX_AT(ProtocolDescription, number17, 64);
DPX_AT(ProtocolDescription, shortNameCopy, 76);
DPX_AT(ProtocolDescription, number25, 96);
DPX_LAYOUT_ASSERT(sizeof(ProtocolDescription) == 100, "ProtocolDescription is 25 words");
DPX_AT(ProtocolDescriptionBlock, record, 16);
DPX_AT(CatalogueEntry, fieldId, 4);
DPX_AT(CatalogueEntry, keyNumber, 8);
DPX_AT(CatalogueEntry, label, 12);
DPX_AT(CatalogueEntry, labelCopy, 16);
DPX_AT(CatalogueEntry, valueCount, 20);
DPX_AT(CatalogueEntry, firstValue, 24);
DPX_AT(CatalogueEntry, width, 28);
DPX_AT(CatalogueEntry, formatIndex, 32);
DPX_AT(CatalogueEntry, attributeOffset, 60);
DPX_LAYOUT_ASSERT(sizeof(CatalogueEntry) == 76, "CatalogueEntry is 76 bytes");
DPX_LAYOUT_ASSERT(sizeof(ValueEntry) == 12, "ValueEntry is 12 bytes");
DPX_LAYOUT_ASSERT(sizeof(PrototypeHeader) == 16, "PrototypeHeader is 16 bytes");
#undef DPX_AT
#endif

#endif /* DPX_CAMEL_H */
