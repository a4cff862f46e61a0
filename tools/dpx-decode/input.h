// Where dpx-decode's messages come from: --hex arguments, files, standard
// input.
#pragma once

#include <cstdint>
#include <functional>
#include <iosfwd>
#include <string>
#include <vector>

namespace dpxdecode {

struct InputMessage {
    std::string source; // file name, "<stdin>" or "--hex #N"
    size_t line = 0;    // 1-based line in the source
    std::vector<uint8_t> bytes;
};

// Reads the --hex arguments (one message each), then the files in order;
// "-" is standard input, and with neither --hex arguments nor files only
// standard input is read.  Every message goes to onMessage as soon as its
// line is read.  Lines that are not hex and files that cannot be read are
// reported on `errors` ("source:line: what"); the rest is still read.
// Returns false when anything was reported.
bool readMessages(const std::vector<std::string> &hexArgs, const std::vector<std::string> &files,
                  const std::function<void(const InputMessage &)> &onMessage,
                  std::ostream &errors);

} // namespace dpxdecode
