#include "key_text.h"

#include <cctype>

#include "field_kinds.h"
#include "output.h"

namespace dpxdecode {
namespace {

// Entries whose value is a digit string packed two to an octet.
bool isDigits(uint32_t entry) { return entry == 10 || entry == 12 || entry == 15 || entry == 17; }
constexpr uint32_t kEntryMnc = 20;
constexpr uint32_t kEntryApn = 21;

uint8_t hexDigit(char c) { return uint8_t(c <= '9' ? c - '0' : (c | 0x20) - 'a' + 10); }

// Access point name labels (length octet, then the label) joined by dots;
// false when the octets are not such labels.
bool apnText(const std::string &hex, std::string &out) {
    out.clear();
    size_t at = 0;
    const size_t octets = hex.size() / 2;
    const auto octet = [&hex](size_t i) { return uint8_t(hexDigit(hex[2 * i]) << 4 | hexDigit(hex[2 * i + 1])); };
    while (at < octets) {
        const size_t n = octet(at++);
        if (n == 0 || at + n > octets)
            return false;
        if (!out.empty())
            out += '.';
        for (size_t i = 0; i < n; ++i) {
            const uint8_t c = octet(at + i);
            if (c < 0x20 || c >= 0x7F)
                return false;
            out += char(c);
        }
        at += n;
    }
    return true;
}

} // namespace

bool keyText(const KeyEntryOut &e, KeyText &out) {
    out.isNumber = false;
    out.number = 0;
    out.text.clear();
    if (e.overflow)
        return false;
    const std::string &hex = e.value; // the stored bytes, two digits each
    switch (keyEntryForm(e.index)) {
    case KeyForm::Octet:
    case KeyForm::None:
        break;
    case KeyForm::Word: {
        if (hex.size() < 4)
            break;
        // Little-endian; a two-digit MNC fills the first byte only.
        const uint32_t low = uint32_t(hexDigit(hex[0]) << 4 | hexDigit(hex[1]));
        const uint32_t high = uint32_t(hexDigit(hex[2]) << 4 | hexDigit(hex[3]));
        static const char digits[] = "0123456789abcdef";
        if (e.index == kEntryMnc && high == 0) {
            out.text = {digits[low >> 4], digits[low & 0xF]};
        } else {
            const uint32_t v = high << 8 | low;
            out.text = {digits[v >> 8 & 0xF], digits[v >> 4 & 0xF], digits[v & 0xF]};
        }
        return true;
    }
    case KeyForm::Variable:
        if (isDigits(e.index)) {
            // Right-aligned: an odd count leaves the first half-octet over.
            const size_t count = e.bits / 4;
            out.text = hex.substr(hex.size() > count ? hex.size() - count : 0);
        } else if (e.index == kEntryApn && apnText(hex, out.text)) {
            return true;
        } else {
            out.text = hex;
        }
        for (char &c : out.text)
            c = char(std::tolower(static_cast<unsigned char>(c)));
        return true;
    }
    out.isNumber = true;
    for (const char c : hex)
        out.number = out.number << 4 | hexDigit(c);
    out.text = std::to_string(out.number);
    return true;
}

std::string_view keyValueName(const MdOut *md, uint32_t entry) {
    if (md == nullptr)
        return {};
    for (size_t i = md->fields.size(); i-- > 0;) {
        const DecodedOut &f = md->fields[i];
        if (fieldKeyEntry(f.id) == int(entry))
            return fieldShowsName(f.id) ? fieldValue(f) : std::string_view();
    }
    return {};
}

} // namespace dpxdecode
