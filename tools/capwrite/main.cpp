// capwrite: hex TCAP messages in, a pcap or pcapng capture out.
//
// Input is what dpx-decode reads: one message a line, '#' comments.  A line
// starting with "#@" holds options that apply from there on (the carrier,
// direction, bundling, ...), so one input file can describe a whole call
// flow; dpx-decode sees such a line as a comment.

#include "../dpx-decode/input/hex_line.h"
#include "capture_writer.h"

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <functional>
#include <iostream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace {

using namespace capwrite;

const char kUsage[] =
    "usage: capwrite -o OUT [OPTION]... [FILE]...\n"
    "Writes the hex TCAP messages of FILE (default or '-': standard input) to a capture.\n"
    "File options:\n"
    "  -o, --output PATH      capture to write ('-': standard output)\n"
    "  --format pcap|pcapng   default: pcapng when PATH ends in .pcapng, else pcap\n"
    "  --link NAME            ethernet (default), sll, sll2, raw, loopback, mtp2, mtp2-phdr, mtp3\n"
    "  --nanoseconds          nanosecond time stamps\n"
    "  --snaplen N            cut frames to N octets\n"
    "  --time SECONDS         time stamp of the first frame (default 1767225600)\n"
    "Message options (also on '#@' lines of the input, from that line on):\n"
    "  --sigtran m3ua|m2ua|m2pa|sua   adaptation over SCTP (default m3ua)\n"
    "  --ipv4 | --ipv6        IP version (default 4)\n"
    "  --ip-options | --no-ip-options   IPv4 router-alert option / IPv6 hop-by-hop header\n"
    "  --vlan ID              add an Ethernet VLAN tag (repeat for QinQ); --no-vlan clears\n"
    "  --bundle N             DATA chunks per SCTP packet (default 1)\n"
    "  --fragment N           at most N octets per DATA chunk (default 0: unfragmented)\n"
    "  --stream N, --ppid N, --ports A,B   SCTP stream, payload protocol id, ports\n"
    "  --sccp udt|xudt|ludt   SCCP message type (default udt)\n"
    "  --segment N            XUDT segments of at most N data octets (default 0: none)\n"
    "  --return-on-error | --no-return-on-error   SCCP protocol class option\n"
    "  --opc N, --dpc N, --sls N, --ni N   routing label (side a sends OPC -> DPC)\n"
    "  --ansi | --itu         ANSI or ITU label and SCCP addresses (default ITU)\n"
    "  --called-ssn N, --calling-ssn N   as side a sends them (default 146)\n"
    "  --pc-in-address | --no-pc-in-address   point codes in the SCCP addresses\n"
    "  --from a|b             sending side; b swaps addresses, ports, point codes, SSNs\n"
    "  --interval USEC        time between frames (default 1000)\n"
    "  --at SECONDS           time stamp of the next frame\n"
    "Exit status: 0 all written, 1 a line or message could not be written, 64 bad usage.\n";

struct UsageError : std::runtime_error {
    using std::runtime_error::runtime_error;
};

unsigned long number(const std::string &s, unsigned long max) {
    char *end = nullptr;
    errno = 0;
    const unsigned long v = std::strtoul(s.c_str(), &end, 0);
    if (s.empty() || *end || errno || v > max || s[0] == '-')
        throw UsageError("bad number '" + s + "' (0.." + std::to_string(max) + ")");
    return v;
}

std::uint64_t seconds(const std::string &s) {
    char *end = nullptr;
    const double v = std::strtod(s.c_str(), &end);
    if (s.empty() || *end || !(v >= 0) || v > 4e9)
        throw UsageError("bad time '" + s + "'");
    return static_cast<std::uint64_t>(v * 1e9 + 0.5);
}

struct Settings {
    Carrier carrier;
    std::uint64_t at = ~std::uint64_t{0}; // time for the next frame, when set
};

using Handler = std::function<void(Settings &, const std::string &)>;
struct OptionDef {
    bool takesValue;
    Handler apply;
};

template <class T> void choose(T &out, const std::string &v, const std::map<std::string, T> &names) {
    const auto it = names.find(v);
    if (it == names.end())
        throw UsageError("unknown value '" + v + "'");
    out = it->second;
}

const std::map<std::string, OptionDef> &messageOptions() {
    static const std::map<std::string, OptionDef> defs = {
        {"--sigtran", {true, [](Settings &s, const std::string &v) {
             choose(s.carrier.adaptation, v,
                    {{"m3ua", Adaptation::M3ua}, {"m2ua", Adaptation::M2ua}, {"m2pa", Adaptation::M2pa}, {"sua", Adaptation::Sua}});
         }}},
        {"--ipv4", {false, [](Settings &s, const std::string &) { s.carrier.ipv6 = false; }}},
        {"--ipv6", {false, [](Settings &s, const std::string &) { s.carrier.ipv6 = true; }}},
        {"--ip-options", {false, [](Settings &s, const std::string &) { s.carrier.ipOptions = true; }}},
        {"--no-ip-options", {false, [](Settings &s, const std::string &) { s.carrier.ipOptions = false; }}},
        {"--vlan", {true, [](Settings &s, const std::string &v) {
             s.carrier.vlans.push_back(static_cast<std::uint16_t>(number(v, 4095)));
         }}},
        {"--no-vlan", {false, [](Settings &s, const std::string &) { s.carrier.vlans.clear(); }}},
        {"--bundle", {true, [](Settings &s, const std::string &v) { s.carrier.bundle = number(v, 1000); }}},
        {"--fragment", {true, [](Settings &s, const std::string &v) { s.carrier.fragment = number(v, 65535); }}},
        {"--stream", {true, [](Settings &s, const std::string &v) {
             s.carrier.stream = static_cast<std::uint16_t>(number(v, 65535));
         }}},
        {"--ppid", {true, [](Settings &s, const std::string &v) {
             s.carrier.ppid = static_cast<std::uint32_t>(number(v, 0xFFFFFFFF));
         }}},
        {"--ports", {true, [](Settings &s, const std::string &v) {
             const auto comma = v.find(',');
             if (comma == std::string::npos)
                 throw UsageError("--ports wants A,B");
             s.carrier.portA = static_cast<std::uint16_t>(number(v.substr(0, comma), 65535));
             s.carrier.portB = static_cast<std::uint16_t>(number(v.substr(comma + 1), 65535));
         }}},
        {"--sccp", {true, [](Settings &s, const std::string &v) {
             choose(s.carrier.sccp.type, v, {{"udt", SccpType::Udt}, {"xudt", SccpType::Xudt}, {"ludt", SccpType::Ludt}});
         }}},
        {"--segment", {true, [](Settings &s, const std::string &v) { s.carrier.segment = number(v, 255); }}},
        {"--return-on-error", {false, [](Settings &s, const std::string &) { s.carrier.sccp.returnOnError = true; }}},
        {"--no-return-on-error", {false, [](Settings &s, const std::string &) { s.carrier.sccp.returnOnError = false; }}},
        {"--opc", {true, [](Settings &s, const std::string &v) {
             s.carrier.label.opc = static_cast<std::uint32_t>(number(v, 0xFFFFFF));
             s.carrier.callingA.pc = s.carrier.label.opc;
         }}},
        {"--dpc", {true, [](Settings &s, const std::string &v) {
             s.carrier.label.dpc = static_cast<std::uint32_t>(number(v, 0xFFFFFF));
             s.carrier.calledA.pc = s.carrier.label.dpc;
         }}},
        {"--sls", {true, [](Settings &s, const std::string &v) {
             s.carrier.label.sls = static_cast<std::uint8_t>(number(v, 255));
         }}},
        {"--ni", {true, [](Settings &s, const std::string &v) {
             s.carrier.label.ni = static_cast<std::uint8_t>(number(v, 3));
         }}},
        {"--ansi", {false, [](Settings &s, const std::string &) { s.carrier.label.ansi = s.carrier.sccp.ansi = true; }}},
        {"--itu", {false, [](Settings &s, const std::string &) { s.carrier.label.ansi = s.carrier.sccp.ansi = false; }}},
        {"--called-ssn", {true, [](Settings &s, const std::string &v) {
             s.carrier.calledA.ssn = static_cast<std::uint8_t>(number(v, 255));
         }}},
        {"--calling-ssn", {true, [](Settings &s, const std::string &v) {
             s.carrier.callingA.ssn = static_cast<std::uint8_t>(number(v, 255));
         }}},
        {"--pc-in-address", {false, [](Settings &s, const std::string &) {
             s.carrier.calledA.withPc = s.carrier.callingA.withPc = true;
         }}},
        {"--no-pc-in-address", {false, [](Settings &s, const std::string &) {
             s.carrier.calledA.withPc = s.carrier.callingA.withPc = false;
         }}},
        {"--from", {true, [](Settings &s, const std::string &v) {
             choose(s.carrier.reverse, v, {{"a", false}, {"b", true}});
         }}},
        {"--interval", {true, [](Settings &s, const std::string &v) {
             s.carrier.intervalNs = std::uint64_t{number(v, 3600000000ul)} * 1000u;
         }}},
        {"--at", {true, [](Settings &s, const std::string &v) { s.at = seconds(v); }}},
    };
    return defs;
}

// Applies message options; returns the arguments it did not know.
std::vector<std::string> applyOptions(Settings &s, const std::vector<std::string> &args) {
    std::vector<std::string> rest;
    for (std::size_t i = 0; i < args.size(); ++i) {
        std::string name = args[i], value;
        const auto eq = name.find('=');
        const bool inlineValue = name.rfind("--", 0) == 0 && eq != std::string::npos;
        if (inlineValue) {
            value = name.substr(eq + 1);
            name.resize(eq);
        }
        const auto it = messageOptions().find(name);
        if (it == messageOptions().end()) {
            rest.push_back(args[i]);
            continue;
        }
        if (it->second.takesValue && !inlineValue) {
            if (i + 1 >= args.size())
                throw UsageError(name + " needs a value");
            value = args[++i];
        } else if (!it->second.takesValue && inlineValue) {
            throw UsageError(name + " takes no value");
        }
        try {
            it->second.apply(s, value);
        } catch (const UsageError &e) {
            throw UsageError(name + ": " + e.what());
        }
    }
    return rest;
}

std::vector<std::string> words(const std::string &line) {
    std::istringstream in(line);
    std::vector<std::string> out;
    for (std::string w; in >> w;)
        out.push_back(w);
    return out;
}

struct Run {
    Settings settings;
    int status = 0;
};

void writeStream(std::istream &in, const std::string &name, Run &run, FlowWriter &flow) {
    std::string line;
    for (unsigned lineNo = 1; std::getline(in, line); ++lineNo) {
        const std::string where = name + ":" + std::to_string(lineNo) + ": ";
        const auto first = line.find_first_not_of(" \t");
        if (first != std::string::npos && line.compare(first, 2, "#@") == 0) {
            try {
                const auto unknown = applyOptions(run.settings, words(line.substr(first + 2)));
                if (!unknown.empty())
                    throw UsageError("unknown option '" + unknown.front() + "'");
            } catch (const UsageError &e) {
                std::cerr << where << e.what() << '\n';
                run.status = 1;
            }
            continue;
        }
        const dpxdecode::HexLine hex = dpxdecode::parseHexLine(line);
        if (hex.kind == dpxdecode::LineKind::Empty)
            continue;
        if (hex.kind == dpxdecode::LineKind::Bad) {
            std::cerr << where << hex.error << '\n';
            run.status = 1;
            continue;
        }
        if (run.settings.at != ~std::uint64_t{0}) {
            flow.flush();
            flow.setTime(run.settings.at);
            run.settings.at = ~std::uint64_t{0};
        }
        try {
            flow.message(hex.bytes, run.settings.carrier);
        } catch (const CarrierError &e) {
            std::cerr << where << e.what() << '\n';
            run.status = 1;
        }
    }
}

int runMain(int argc, char **argv) {
    std::vector<std::string> args(argv + 1, argv + argc);
    Run run;
    const std::vector<std::string> rest = applyOptions(run.settings, args);
    FileOptions fo;
    std::string output, format;
    std::uint64_t start = 1767225600ull * 1000000000ull;
    std::vector<std::string> inputs;
    static const std::map<std::string, Link> links = {
        {"ethernet", Link::Ethernet}, {"sll", Link::LinuxSll}, {"sll2", Link::LinuxSll2}, {"raw", Link::RawIp},
        {"loopback", Link::Loopback}, {"mtp2", Link::Mtp2}, {"mtp2-phdr", Link::Mtp2WithPhdr}, {"mtp3", Link::Mtp3}};
    for (std::size_t i = 0; i < rest.size(); ++i) {
        const std::string &a = rest[i];
        const auto value = [&]() -> const std::string & {
            if (i + 1 >= rest.size())
                throw UsageError(a + " needs a value");
            return rest[++i];
        };
        if (a == "-h" || a == "--help") {
            std::cout << kUsage;
            return 0;
        } else if (a == "-o" || a == "--output") {
            output = value();
        } else if (a == "--format") {
            format = value();
            if (format != "pcap" && format != "pcapng")
                throw UsageError("--format: pcap or pcapng");
        } else if (a == "--link") {
            choose(fo.link, value(), links);
        } else if (a == "--nanoseconds") {
            fo.nanoseconds = true;
        } else if (a == "--snaplen") {
            fo.snaplen = static_cast<std::uint32_t>(number(value(), 262144));
        } else if (a == "--time") {
            start = seconds(value());
        } else if (a.size() > 1 && a[0] == '-') {
            throw UsageError("unknown option '" + a + "'");
        } else {
            inputs.push_back(a);
        }
    }
    if (output.empty())
        throw UsageError("no output: -o PATH");
    if (format.empty())
        format = output.size() >= 7 && output.compare(output.size() - 7, 7, ".pcapng") == 0 ? "pcapng" : "pcap";
    fo.format = format == "pcapng" ? FileFormat::Pcapng : FileFormat::Pcap;
    if (inputs.empty())
        inputs.push_back("-");

    std::FILE *out = output == "-" ? stdout : std::fopen(output.c_str(), "wb");
    if (!out) {
        std::cerr << "capwrite: " << output << ": " << std::strerror(errno) << '\n';
        return 1;
    }
    {
        CaptureFile file(out, fo);
        FlowWriter flow(file, start);
        for (const std::string &in : inputs) {
            if (in == "-") {
                writeStream(std::cin, "<stdin>", run, flow);
                continue;
            }
            std::ifstream f(in);
            if (!f) {
                std::cerr << "capwrite: " << in << ": cannot read\n";
                run.status = 1;
                continue;
            }
            writeStream(f, in, run, flow);
        }
        flow.flush();
    }
    if (out != stdout ? std::fclose(out) != 0 : std::fflush(out) != 0) {
        std::cerr << "capwrite: " << output << ": write failed\n";
        return 1;
    }
    return run.status;
}

} // namespace

int main(int argc, char **argv) {
    try {
        return runMain(argc, argv);
    } catch (const UsageError &e) {
        std::cerr << "capwrite: " << e.what() << "\n" << kUsage;
        return 64;
    } catch (const std::exception &e) {
        std::cerr << "capwrite: " << e.what() << '\n';
        return 1;
    }
}
