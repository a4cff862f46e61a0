// dpx-decode: runs the passes of the TCAP/CAMEL decoder module over hex
// messages or the TCAP messages of a pcap/pcapng capture and prints what a
// host would receive.
//
// Exit status: 0 all input decoded; 1 some input line was not hex or a file
// could not be read (the rest is still decoded); 2 the module could not be
// loaded; 3 a capture is damaged (every frame before the damage is
// decoded); 64 bad command line.

#include <CLI/CLI.hpp>
#include <unistd.h>

#include <iostream>
#include <optional>
#include <string>
#include <vector>

#include "input/hex_line.h"
#include "input/input.h"
#include "module.h"
#include "tables.h"
#include "views/output.h"
#include "views/summary.h"

namespace {

constexpr int kExitBadInput = 1;
constexpr int kExitNoModule = 2;
constexpr int kExitDamagedCapture = 3;
constexpr int kExitUsage = 64;

dpxdecode::PassSelection selectPasses(const std::vector<std::string> &names) {
    dpxdecode::PassSelection p{false, false, false, false};
    for (const std::string &n : names) {
        p.md |= n == "md";
        p.display |= n == "display";
        p.view |= n == "view";
        p.keys |= n == "keys";
    }
    return p;
}

// "146,6-8": subsystem numbers and ranges of them.
bool parseSsnList(const std::string &text, std::bitset<256> &out) {
    out.reset();
    size_t pos = 0;
    while (pos <= text.size()) {
        const size_t comma = std::min(text.find(',', pos), text.size());
        const std::string item = text.substr(pos, comma - pos);
        const size_t dash = item.find('-');
        unsigned long lo = 0, hi = 0;
        try {
            size_t used = 0;
            const std::string a = item.substr(0, dash);
            lo = std::stoul(a, &used);
            if (used != a.size())
                return false;
            hi = lo;
            if (dash != std::string::npos) {
                const std::string b = item.substr(dash + 1);
                hi = std::stoul(b, &used);
                if (used != b.size())
                    return false;
            }
        } catch (const std::exception &) {
            return false;
        }
        if (lo > hi || hi > 255)
            return false;
        for (unsigned long s = lo; s <= hi; ++s)
            out.set(s);
        pos = comma + 1;
    }
    return true;
}

// --tables: the description tables, as a host reads them.
int printTables(const dpxdecode::Module &module) {
    if (!dpxdecode::writeTables(std::cout, module)) {
        std::cerr << "dpx-decode: the module does not serve every description table\n";
        return kExitNoModule;
    }
    return std::cout.flush() ? 0 : kExitBadInput;
}

} // namespace

int main(int argc, char **argv) {
    CLI::App app{"Decode TCAP/CAMEL messages with the 3gpp_camel_400_DLL module.\n"
                 "Input: hex messages, one a line ('#' starts a comment), or pcap/pcapng\n"
                 "captures.  Without --hex and files, standard input is read."};
    std::vector<std::string> hexArgs;
    std::vector<std::string> files;
    std::vector<std::string> passNames{"md", "display", "view", "keys"};
    std::string format = "text";
    std::string modulePath;
    std::string ssnList = "146";
    bool spans = false;
    bool summary = false;
    bool stats = false;
    bool ansi = false;

    app.add_option("files", files, "files of hex messages or captures ('-' is standard input)");
    app.add_option("--hex", hexArgs, "a message in hex (repeatable)")->allow_extra_args(false);
    auto *passOption = app.add_option("--pass", passNames, "passes to run: md, display, view, keys (default all)")
                           ->delimiter(',')
                           ->check(CLI::IsMember({"md", "display", "view", "keys"}))
                           ->allow_extra_args(false);
    app.add_option("--format", format, "output format: text or json")
        ->check(CLI::IsMember({"text", "json"}));
    app.add_flag("--spans", spans, "text output: append each field's bit ranges [first-last]=value");
    app.add_option("--module", modulePath,
                   "decoder module to load (default: 3gpp_camel_400_DLL.so beside dpx-decode)");
    app.add_option("--ssn", ssnList,
                   "captures: take SCCP messages whose called or calling SSN is in this list (default 146)");
    app.add_flag("--ansi", ansi, "captures: ANSI MTP3 routing labels and SCCP addresses");
    app.add_flag("--summary", summary, "one line per message instead of the passes' output");
    app.add_flag("--stats", stats, "counts by message type, operation, result, error, flag and skip reason");
    bool tables = false;
    app.add_flag("--tables", tables, "print the module's description tables as one JSON object and exit");

    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError &e) {
        const int rc = app.exit(e);
        return rc == 0 ? 0 : kExitUsage;
    }
    dpxdecode::InputOptions inputOptions;
    inputOptions.walk.ansi = ansi;
    if (!parseSsnList(ssnList, inputOptions.walk.ssns)) {
        std::cerr << "dpx-decode: --ssn: expected subsystem numbers 0-255 and ranges, e.g. 146,6-8\n";
        return kExitUsage;
    }
    inputOptions.progress = isatty(STDERR_FILENO) == 1;

    if (modulePath.empty()) {
        modulePath = dpxdecode::defaultModulePath();
        if (modulePath.empty()) {
            std::cerr << "dpx-decode: cannot find the directory of the executable; use --module\n";
            return kExitNoModule;
        }
    }
    dpxdecode::Module module;
    std::string error;
    if (!dpxdecode::loadModule(modulePath, module, error)) {
        std::cerr << "dpx-decode: cannot load module: " << error << '\n';
        return kExitNoModule;
    }

    if (tables)
        return printTables(module);
    if (!dpxdecode::loadCatalogue(module))
        std::cerr << "dpx-decode: the module serves no field catalogue: labels left empty\n";

    std::ios::sync_with_stdio(false);
    static char outBuffer[1 << 16];
    std::cout.rdbuf()->pubsetbuf(outBuffer, sizeof outBuffer);

    // The summary and the statistics are made from the decoded-field pass:
    // it runs for them even when its output is not wanted.
    dpxdecode::PassSelection passes = selectPasses(passNames);
    if (summary && passOption->count() == 0)
        passes = dpxdecode::PassSelection{false, false, false, false};
    const bool showMd = passes.md;
    const bool passOutput = !summary || passOption->count() > 0;
    dpxdecode::PassSelection run = passes;
    run.md |= summary || stats;

    const bool json = format == "json";
    const dpxdecode::TextOptions textOptions{spans};
    uint64_t index = 0;
    dpxdecode::Session session(module);
    if (!session.ok()) {
        std::cerr << "dpx-decode: out of memory preparing the decoding state\n";
        return kExitBadInput;
    }
    dpxdecode::MessageResult result;
    std::optional<dpxdecode::MdOut> hiddenMd;
    dpxdecode::MessageSummary messageSummary;
    dpxdecode::Statistics statistics;

    const dpxdecode::InputReport report = dpxdecode::readMessages(
        hexArgs, files, inputOptions,
        [&](const dpxdecode::InputMessage &msg) {
            session.run(msg.bytes.data(), msg.bytes.size(), run, result);
            if (summary || stats) {
                dpxdecode::summarize(*result.md, messageSummary);
                if (stats)
                    statistics.add(messageSummary, result.md->errorFlags);
                if (summary)
                    dpxdecode::writeSummary(std::cout, index, msg.capture, messageSummary);
            }
            if (passOutput) {
                // The decoded fields made only for the summary or the
                // statistics are set aside while the message is written.
                if (!showMd)
                    hiddenMd.swap(result.md);
                const std::string hex = dpxdecode::toHex(msg.bytes);
                if (json)
                    dpxdecode::writeJson(std::cout, index, hex, result, msg.capture);
                else
                    dpxdecode::writeText(std::cout, index, hex, result, textOptions, msg.capture);
                if (!showMd)
                    hiddenMd.swap(result.md);
            }
            ++index;
        },
        std::cerr);

    if (stats)
        statistics.write(std::cout, report, json);
    std::cout.flush();
    if (report.damagedCapture)
        return kExitDamagedCapture;
    return !report.badInput && std::cout.good() ? 0 : kExitBadInput;
}
