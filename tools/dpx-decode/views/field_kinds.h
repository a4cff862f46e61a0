// What the views know about a reported field beyond its record: whether it
// is a tag, a length, an end-of-contents or a value, whether its value is a
// name, and the key entry it sets.  Looked up by field id in the module's
// own field declarations, so nothing here is typed a second time.
#pragma once

#include <cstdint>

namespace dpxdecode {

enum class FieldKind : uint8_t {
    Value,         // what a person reads; also every id not declared
    Tag,           // an element's identifier octet(s)
    Length,        // an element's length octet(s)
    EndOfContents, // the two octets closing an indefinite length
};

FieldKind fieldKind(uint32_t id);

// True for fields whose text shows the value's name (an operation, an
// error, a cause) rather than the number.
bool fieldShowsName(uint32_t id);

// The key entry the field sets, or -1.
int fieldKeyEntry(uint32_t id);

} // namespace dpxdecode
