// --dialogues: each dialogue as the dialogue layer closes it, in text or as
// one JSON object a line.
#pragma once

#include <iosfwd>
#include <string>

#include "dialogues/tracker.h"

namespace dpxdecode::views {

// What an arrow or a message line says about a message's components:
// "Initial DP", "result Prompt And Collect User Info.", "error Missing
// Parameter", "reject Mistyped Parameter"; the invoke id when the code was
// not decoded.
std::string componentLabel(const dialogues::Component &c);

// "pc 100 ssn 146", "ssn 146", "-".
std::string endName(const dialogues::End &e);

void writeDialogueText(std::ostream &os, const dialogues::Dialogue &d);
void writeDialogueJson(std::ostream &os, const dialogues::Dialogue &d);

} // namespace dpxdecode::views
