#include "input.h"

#include <cerrno>
#include <cstring>
#include <fstream>
#include <iostream>

#include "hex_line.h"

namespace dpxdecode {
namespace {

// Reads one message per line until the end of `in`.
bool readStream(std::istream &in, const std::string &name,
                const std::function<void(const InputMessage &)> &onMessage, std::ostream &errors) {
    bool ok = true;
    std::string text;
    InputMessage msg;
    msg.source = name;
    for (size_t lineNo = 1; std::getline(in, text); ++lineNo) {
        HexLine parsed = parseHexLine(text);
        if (parsed.kind == LineKind::Empty)
            continue;
        if (parsed.kind == LineKind::Bad) {
            errors << "dpx-decode: " << name << ':' << lineNo << ": " << parsed.error << '\n';
            ok = false;
            continue;
        }
        msg.line = lineNo;
        msg.bytes = std::move(parsed.bytes);
        onMessage(msg);
    }
    if (in.bad()) {
        errors << "dpx-decode: " << name << ": read error\n";
        ok = false;
    }
    return ok;
}

} // namespace

bool readMessages(const std::vector<std::string> &hexArgs, const std::vector<std::string> &files,
                  const std::function<void(const InputMessage &)> &onMessage,
                  std::ostream &errors) {
    bool ok = true;
    for (size_t i = 0; i < hexArgs.size(); ++i) {
        const std::string name = "--hex #" + std::to_string(i + 1);
        HexLine parsed = parseHexLine(hexArgs[i]);
        if (parsed.kind == LineKind::Empty) {
            parsed.kind = LineKind::Bad;
            parsed.error = "no hex digits";
        }
        if (parsed.kind == LineKind::Bad) {
            errors << "dpx-decode: " << name << ": " << parsed.error << '\n';
            ok = false;
            continue;
        }
        onMessage(InputMessage{name, 1, std::move(parsed.bytes)});
    }

    if (hexArgs.empty() && files.empty())
        return readStream(std::cin, "<stdin>", onMessage, errors) && ok;

    for (const std::string &file : files) {
        if (file == "-") {
            ok = readStream(std::cin, "<stdin>", onMessage, errors) && ok;
            continue;
        }
        std::ifstream in(file);
        if (!in) {
            errors << "dpx-decode: " << file << ": " << std::strerror(errno) << '\n';
            ok = false;
            continue;
        }
        ok = readStream(in, file, onMessage, errors) && ok;
    }
    return ok;
}

} // namespace dpxdecode
