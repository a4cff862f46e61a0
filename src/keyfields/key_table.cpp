// The key table handed to the host's kf_InitialiseOptKFE.  The module
// names the key fields; the host fills in, per entry, where the presence
// bit and the value go in its key buffer.

#include "keyfields/key_marks.h"

namespace camel {
namespace {

constexpr const char *kProtocol = "3gpp_camel_400";

// Name of the last entry: an empty string in a zero-filled buffer that
// nothing writes.
const char emptyKeyName[32] = {};

constexpr KeyTableEntry entry(const char *name) {
    return KeyTableEntry{0, 0, 0, kProtocol, name, {}};
}

} // namespace

// Writable: the host fills the offsets and masks on the first call.  The
// order is shared with the host and with the key entries of the field table.
KeyTableEntry g_keyTable[DPX_KEY_ENTRY_COUNT] = {
    entry("MT"),                         //  0
    entry("Return Result (Last)"),       //  1
    entry("Return Error"),               //  2
    entry("P-Abort Cause"),              //  3
    entry("Invoke Id"),                  //  4
    entry("Operation ID(Invoke)"),       //  5
    entry("Failure Cause Value"),        //  6
    entry("RP Cause Value"),             //  7
    entry("Cause Value"),                //  8
    entry("Called Party Num"),           //  9
    entry("Called Party Num"),           // 10
    entry("Address Signal"),             // 11
    entry("Address Signal"),             // 12
    entry("Event Type BCSM Value"),      // 13
    entry("Calling Party Num"),          // 14
    entry("Calling Party Num"),          // 15
    entry("IMSI Digits"),                // 16
    entry("IMSI Digits"),                // 17
    entry("MCC"),                        // 18
    entry("MNC"),                        // 19
    entry("MNC"),                        // 20
    entry("Access Point Name Value"),    // 21
    entry("Operation ID(RetRes)"),       // 22
    entry("Error Code"),                 // 23
    entry("Return Result (Last)"),       // 24
    entry("Return Error"),               // 25
    entry("Originating Transaction Id"), // 26
    entry("Return Result (Last)"),       // 27
    entry("Return Error"),               // 28
    entry("Destination Transaction Id"), // 29
    entry(emptyKeyName),                 // 30
};

} // namespace camel
