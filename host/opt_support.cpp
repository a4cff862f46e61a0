// Stand-in for the host's key-field support library (libkf_OptSupport.so).
//
// kf_InitialiseOptKFE hands every key table entry its place in the host's key
// buffer (layout in dpx_standin_host.h).  Tests can override its result to
// exercise the module's handling of a failed or selecting initialisation.

#include "host_export.h"

namespace {

uint32_t g_initCalls = 0;
bool g_overridden = false;
int32_t g_overrideResult = 0;
uint16_t g_overrideIndex = 0;

void fillTable(KeyTableEntry *table, int32_t count) {
    for (int32_t i = 0; i < count; ++i) {
        const auto n = static_cast<uint32_t>(i);
        table[i].presenceOffset = n / 8;
        table[i].presenceMask = 1u << (n % 8);
        table[i].valueOffset = HOST_KEY_SLOT_BASE + HOST_KEY_SLOT_SIZE * n;
    }
}

} // namespace

extern "C" {

int32_t kf_InitialiseOptKFE(KeyTableEntry *table, int32_t count, uint16_t *selectedIndex) {
    ++g_initCalls;
    if (g_overridden && g_overrideResult < 0) {
        return g_overrideResult;
    }
    if (table != nullptr) {
        fillTable(table, count);
    }
    if (!g_overridden) {
        return 1;
    }
    if (selectedIndex != nullptr) {
        *selectedIndex = g_overrideIndex;
    }
    return g_overrideResult;
}

void host_SetKfInitResult(int32_t result, uint16_t selectedIndex) {
    g_overridden = true;
    g_overrideResult = result;
    g_overrideIndex = selectedIndex;
}

void host_ClearKfInitOverride(void) {
    g_overridden = false;
    g_overrideResult = 0;
    g_overrideIndex = 0;
}

uint32_t host_KfInitCalls(void) { return g_initCalls; }

} // extern "C"
