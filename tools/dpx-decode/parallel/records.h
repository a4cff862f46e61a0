// A message's facts and summary as bytes, for the trip from a worker
// process back to the ordered side.  Reading fills existing objects in
// place, so their strings and vectors keep their capacity.
#pragma once

#include <cstddef>
#include <string>

#include "dialogues/message_facts.h"
#include "views/summary.h"

namespace dpxdecode::parallel {

void putFacts(std::string &out, const dialogues::MessageFacts &f);
void putSummary(std::string &out, const MessageSummary &s);

// Reads what put... wrote at `pos`, advancing it; false when the bytes end
// early (nothing read beyond `size`).
bool getFacts(const char *data, size_t size, size_t &pos, dialogues::MessageFacts &f);
bool getSummary(const char *data, size_t size, size_t &pos, MessageSummary &s);

} // namespace dpxdecode::parallel
