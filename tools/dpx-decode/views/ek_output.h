// --format ek: for each message an action line and a document, in the bulk
// format of OpenSearch and Elasticsearch (POST _bulk).
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "input/input.h"
#include "module.h"
#include "output.h"
#include "summary.h"

namespace dpxdecode {

// The document is made from the decoded-field pass (through `s`, its
// summary) and the key-field pass; `r.keys` must be set.  Messages of a
// capture go to the index "dpx-camel-YYYY-MM-DD" of their UTC day, others
// to "dpx-camel".
void writeEk(std::ostream &os, const InputMessage &msg, uint64_t index, const std::string &hex,
             const MessageResult &r, const MessageSummary &s, const TimeFormatter &time);

} // namespace dpxdecode
