// --match EXPR: which messages to show.  Every expression must hold.
//
//   NAME=VALUE   equal          NAME~PREFIX   starts with
//
// NAME is one of the message's key facts (imsi, called, calling, charge,
// operation, error, cause, event, serviceKey, tid, otid, dtid, ssn, pc,
// opc, dpc, type) or the label of any decoded field ("Service Key=7",
// "Nature Of Address Ind~Inter"; leading blanks and case do not count).
// Facts come from the key-field pass and the decoded fields by id; a label
// is compared with the value text of the fields that carry it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "dialogues/message_facts.h"

namespace dpxdecode {

class MessageFilter {
public:
    // Parses every expression; on the first one that names nothing known or
    // has a value that cannot be, returns false with the reason in `error`.
    bool parse(const std::vector<std::string> &expressions, std::string &error);

    bool empty() const { return conditions_.empty(); }

    // `md` may be null: label conditions then fail.
    bool matches(const dialogues::MessageFacts &m, const MdOut *md) const;

    struct Condition {
        enum class What : uint8_t {
            Imsi, Called, Calling, Charge, Operation, Error, Cause, Event, ServiceKey,
            Tid, Otid, Dtid, Ssn, Pc, Opc, Dpc, Type, Label
        } what = What::Label;
        bool prefix = false;
        std::string text;    // the value as given (normalised for names and digits)
        int64_t number = -1; // the value as a number, where the fact is one
        std::vector<int32_t> codes; // operation or error codes a name or prefix stands for
        std::string label;          // normalised label of a label condition
    };

private:
    bool holds(const Condition &c, const dialogues::MessageFacts &m, const MdOut *md) const;
    std::vector<Condition> conditions_;
};

} // namespace dpxdecode
