// dpx-decode: runs the passes of the TCAP/CAMEL decoder module over hex
// messages or the TCAP messages of a pcap/pcapng capture and prints what a
// host would receive.
//
// Exit status: 0 all input decoded; 1 some input line was not hex or a file
// could not be read (the rest is still decoded); 2 the module could not be
// loaded; 3 a capture is damaged (every frame before the damage is
// decoded); 4 a capture held no CAMEL message (standard error says what it
// held); 64 bad command line.  When several apply: 3 before 1 before 4.

#include <CLI/CLI.hpp>
#include <unistd.h>

#include <algorithm>
#include <fstream>
#include <iostream>
#include <optional>
#include <string>
#include <vector>

#include "input/hex_line.h"
#include "input/input.h"
#include "module.h"
#include "parallel/decoder.h"
#include "parallel/pool.h"
#include "dialogues/tracker.h"
#include "filter/match.h"
#include "views/ek_output.h"
#include "views/dialogue_view.h"
#include "views/flow_svg.h"
#include "tables.h"
#include "views/output.h"
#include "views/srt_stats.h"
#include "views/summary.h"

namespace {

constexpr int kExitBadInput = 1;
constexpr int kExitNoModule = 2;
constexpr int kExitDamagedCapture = 3;
constexpr int kExitNoCamel = 4;
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
    bool ansi = false;
    std::string fieldsMode = "values";
    std::string timeFormat = "utc";
    bool version = false;
    std::vector<std::string> statsKinds;
    std::vector<std::string> matchExpressions;
    bool dialoguesView = false;
    double dialogueTimeout = 60;
    std::string flowFile;

    app.add_option("files", files, "files of hex messages or captures ('-' is standard input)");
    app.add_option("--hex", hexArgs, "a message in hex (repeatable)")->allow_extra_args(false);
    auto *passOption = app.add_option("--pass", passNames,
                                      "passes to run and show: md, display, view, keys or none (default: md in "
                                      "text, all four in json)")
                           ->delimiter(',')
                           ->check(CLI::IsMember({"md", "display", "view", "keys", "none"}))
                           ->allow_extra_args(false);
    app.add_option("--format", format, "output format: text, json or ek (bulk-index actions and documents)")
        ->check(CLI::IsMember({"text", "json", "ek"}));
    app.add_option("--fields", fieldsMode,
                   "text output: values (nested, tags and lengths folded; default), all (nested, every field) "
                   "or list (flat, as reported)")
        ->check(CLI::IsMember({"values", "all", "list"}));
    app.add_option("--time", timeFormat, "capture times in text: utc (ISO 8601, default), epoch or relative")
        ->check(CLI::IsMember({"utc", "epoch", "relative"}));
    app.add_flag("--spans", spans, "text output: append each field's bit ranges [first-last]=value");
    app.add_flag("--version", version, "print the module's version and interface version, and exit");
    app.add_option("--module", modulePath,
                   "decoder module to load (default: 3gpp_camel_400_DLL.so beside dpx-decode)");
    auto *ssnOption = app.add_option("--ssn", ssnList,
                                     "captures: take only SCCP messages whose called or calling SSN is in this "
                                     "list (default: SSN 146, and dialogues naming a CAMEL context on any SSN)");
    app.add_flag("--ansi", ansi, "captures: ANSI MTP3 routing labels and SCCP addresses");
    app.add_flag("--summary", summary, "one line per message instead of the passes' output");
    app.add_flag("--stats{messages}", statsKinds,
                 "counts by message type, operation, result, error, flag and skip reason; "
                 "--stats srt: response times, dialogue durations and counts per operation, error, "
                 "release cause, event type and service key")
        ->check(CLI::IsMember({"messages", "srt"}));
    app.add_option("--match", matchExpressions,
                   "only messages (with --dialogues, --stats srt or --flow: dialogues with a message) where "
                   "NAME=VALUE or NAME~PREFIX holds; repeatable, all must hold")
        ->allow_extra_args(false);
    app.add_flag("--dialogues", dialoguesView, "messages grouped into TCAP dialogues");
    app.add_option("--dialogue-timeout", dialogueTimeout,
                   "seconds of capture time after which a silent dialogue is written out as open (default 60)")
        ->check(CLI::Range(0.001, 1e9));
    app.add_option("--flow", flowFile, "write a call-flow picture (SVG) of the dialogues to this file");
    bool tables = false;
    const long cores = sysconf(_SC_NPROCESSORS_ONLN);
    unsigned jobs = unsigned(std::clamp(cores, 1L, long(dpxdecode::parallel::kMaxJobs)));
    app.add_option("--jobs", jobs,
                   "processes that decode at once, output still in input order (default: the number of online "
                   "cores, " + std::to_string(jobs) + " here; at most " +
                       std::to_string(dpxdecode::parallel::kMaxJobs) + "); 1 decodes in dpx-decode itself")
        ->check(CLI::Range(1u, dpxdecode::parallel::kMaxJobs));
    app.add_flag("--tables", tables, "print the module's description tables as one JSON object and exit");

    // "--stats srt" names what --stats counts; "--stats FILE" is the flag and a file.
    std::vector<std::string> args(argv + std::min(argc, 1), argv + argc);
    for (size_t i = 0; i + 1 < args.size(); ++i)
        if (args[i] == "--stats" && args[i + 1] == "srt") {
            args[i] = "--stats=srt";
            args.erase(args.begin() + long(i) + 1);
        }
    std::reverse(args.begin(), args.end()); // CLI11 takes the arguments last first
    if (argc > 0)
        app.name(argv[0]);
    try {
        app.parse(args);
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
    inputOptions.walk.camelDialogues = ssnOption->count() == 0;
    inputOptions.progress = isatty(STDERR_FILENO) == 1;
    const bool stats = std::find(statsKinds.begin(), statsKinds.end(), "messages") != statsKinds.end();
    const bool srt = std::find(statsKinds.begin(), statsKinds.end(), "srt") != statsKinds.end();
    dpxdecode::MessageFilter filter;
    std::string filterError;
    if (!filter.parse(matchExpressions, filterError)) {
        std::cerr << "dpx-decode: " << filterError << '\n';
        return kExitUsage;
    }
    // Following calls: dialogues, response times or the picture.
    const bool follow = dialoguesView || srt || !flowFile.empty();
    std::ofstream flowOut;
    if (!flowFile.empty()) {
        flowOut.open(flowFile, std::ios::binary);
        if (!flowOut) {
            std::cerr << "dpx-decode: --flow: cannot write " << flowFile << '\n';
            return kExitUsage;
        }
    }
    if (format == "ek" && (summary || stats || follow || passOption->count() > 0)) {
        std::cerr << "dpx-decode: --format ek writes bulk-index documents only: no --summary, --stats, --pass, --dialogues or --flow\n";
        return kExitUsage;
    }

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
    if (version) {
        const void *interfaceVersion = nullptr;
        const bool served = module.getPtr(1, &interfaceVersion) == 0 && interfaceVersion != nullptr;
        std::cout << "dpx-decode " DPX_VERSION "\nmodule " << modulePath << "\ninterface version "
                  << (served ? static_cast<const char *>(interfaceVersion) : "(not served)") << '\n';
        return served ? 0 : kExitNoModule;
    }

    if (tables)
        return printTables(module);
    if (!dpxdecode::loadCatalogue(module))
        std::cerr << "dpx-decode: the module serves no field catalogue: labels left empty\n";

    std::ios::sync_with_stdio(false);
    static char outBuffer[1 << 16];
    std::cout.rdbuf()->pubsetbuf(outBuffer, sizeof outBuffer);

    // What is shown: the readable fields in text, every pass in JSON, the
    // passes named with --pass.  The summary, the statistics and the
    // bulk-index documents are made from the decoded-field and key-field
    // passes: those run for them even when their output is not wanted.
    // Filters and the dialogue views read the decoded and key fields too.
    const bool json = format == "json";
    const bool ek = format == "ek";
    const bool named = passOption->count() > 0;
    dpxdecode::PassSelection passes = selectPasses(passNames);
    if (!named && !json)
        passes = dpxdecode::PassSelection{!summary && !ek && !follow, false, false, false};
    const bool showMd = passes.md;
    const bool showKeys = passes.keys;
    const bool passOutput =
        !ek && ((!summary && !follow) || named) && (passes.md || passes.display || passes.view || passes.keys);
    dpxdecode::PassSelection run = passes;
    run.md |= summary || stats || ek || follow || !filter.empty();
    run.keys |= ek || follow || !filter.empty();

    dpxdecode::parallel::DecodeSettings settings;
    settings.run = run;
    settings.showMd = showMd;
    settings.showKeys = showKeys;
    settings.passOutput = passOutput;
    settings.summary = summary;
    settings.stats = stats;
    settings.ek = ek;
    settings.json = json;
    settings.follow = follow;
    settings.spans = spans;
    settings.fields = fieldsMode == "all"    ? dpxdecode::FieldsMode::All
                      : fieldsMode == "list" ? dpxdecode::FieldsMode::List
                                             : dpxdecode::FieldsMode::Values;
    settings.time = timeFormat == "epoch"      ? dpxdecode::TimeFormat::Epoch
                    : timeFormat == "relative" ? dpxdecode::TimeFormat::Relative
                                               : dpxdecode::TimeFormat::Utc;
    settings.filter = &filter;
    dpxdecode::parallel::MessageDecoder decoder(module, settings);
    if (!decoder.ok()) {
        std::cerr << "dpx-decode: out of memory preparing the decoding state\n";
        return kExitBadInput;
    }
    uint64_t index = 0;
    dpxdecode::Statistics statistics;
    dpxdecode::views::ResponseTimes responseTimes;
    dpxdecode::views::FlowPicture flow;
    dpxdecode::dialogues::TrackerLimits limits;
    limits.timeoutNs = static_cast<int64_t>(dialogueTimeout * 1e9);
    dpxdecode::dialogues::DialogueTracker tracker(limits, [&](const dpxdecode::dialogues::Dialogue &d) {
        if (!filter.empty() && !d.matched)
            return;
        if (dialoguesView) {
            if (json)
                dpxdecode::views::writeDialogueJson(std::cout, d);
            else
                dpxdecode::views::writeDialogueText(std::cout, d);
        }
        if (srt)
            responseTimes.add(d);
        if (flowOut.is_open())
            flow.add(d);
    });
    const dpxdecode::parallel::OrderedSinks sinks{std::cout, follow ? &tracker : nullptr,
                                                  stats ? &statistics : nullptr, !filter.empty()};
    std::optional<dpxdecode::parallel::WorkerPool> pool;
    if (jobs > 1)
        pool.emplace(module, settings, decoder, sinks, jobs);

    const dpxdecode::InputReport report = dpxdecode::readMessages(
        hexArgs, files, inputOptions,
        [&](const dpxdecode::InputMessage &msg) {
            if (pool) {
                pool->add(msg, index++);
                return;
            }
            decoder.decode(msg, index++, true);
            sinks.take(decoder.facts(), decoder.selected(), decoder.summary(), decoder.text());
        },
        std::cerr);
    if (pool)
        pool->finish();

    if (follow)
        tracker.finish();
    if (stats)
        statistics.write(std::cout, report, json);
    if (srt)
        responseTimes.write(std::cout, json);
    if (flowOut.is_open()) {
        flow.write(flowOut);
        flowOut.close();
        if (!flowOut) {
            std::cerr << "dpx-decode: --flow: cannot write " << flowFile << '\n';
            return kExitBadInput;
        }
        if (flow.omitted() != 0)
            std::cerr << "dpx-decode: --flow: " << flow.omitted() << " messages not drawn (the picture holds "
                      << "at most 5000; narrow it with --match)\n";
    }
    std::cout.flush();
    if (report.damagedCapture)
        return kExitDamagedCapture;
    if (report.badInput || !std::cout.good())
        return kExitBadInput;
    return report.captureWithoutCamel ? kExitNoCamel : 0;
}
