// dpx-decode: runs the passes of the TCAP/CAMEL decoder module over hex
// messages and prints what a host would receive.
//
// Exit status: 0 all lines decoded; 1 some input line was not hex or a file
// could not be read (the rest is still decoded); 2 the module could not be
// loaded; 64 bad command line.

#include <CLI/CLI.hpp>

#include <iostream>
#include <string>
#include <vector>

#include "hex_line.h"
#include "input.h"
#include "module.h"
#include "output.h"

namespace {

constexpr int kExitBadInput = 1;
constexpr int kExitNoModule = 2;
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

} // namespace

int main(int argc, char **argv) {
    CLI::App app{"Decode TCAP/CAMEL messages with the 3gpp_camel_400_DLL module.\n"
                 "Input: one hex message a line; blanks and colons may separate digits,\n"
                 "'#' starts a comment.  Without --hex and files, standard input is read."};
    std::vector<std::string> hexArgs;
    std::vector<std::string> files;
    std::vector<std::string> passNames{"md", "display", "view", "keys"};
    std::string format = "text";
    std::string modulePath;
    bool spans = false;

    app.add_option("files", files, "files of hex messages ('-' is standard input)");
    app.add_option("--hex", hexArgs, "a message in hex (repeatable)")->allow_extra_args(false);
    app.add_option("--pass", passNames, "passes to run: md, display, view, keys (default all)")
        ->delimiter(',')
        ->check(CLI::IsMember({"md", "display", "view", "keys"}))
        ->allow_extra_args(false);
    app.add_option("--format", format, "output format: text or json")
        ->check(CLI::IsMember({"text", "json"}));
    app.add_flag("--spans", spans, "text output: append each field's bit ranges [first-last]=value");
    app.add_option("--module", modulePath,
                   "decoder module to load (default: 3gpp_camel_400_DLL.so beside dpx-decode)");

    try {
        app.parse(argc, argv);
    } catch (const CLI::ParseError &e) {
        const int rc = app.exit(e);
        return rc == 0 ? 0 : kExitUsage;
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

    const dpxdecode::PassSelection passes = selectPasses(passNames);
    const bool json = format == "json";
    const dpxdecode::TextOptions textOptions{spans};
    uint64_t index = 0;
    bool failed = false;

    const bool inputOk = dpxdecode::readMessages(
        hexArgs, files,
        [&](const dpxdecode::InputMessage &msg) {
            dpxdecode::MessageResult result;
            if (!dpxdecode::runPasses(module, msg.bytes, passes, result)) {
                std::cerr << "dpx-decode: " << msg.source << ':' << msg.line
                          << ": out of memory preparing the decoding state\n";
                failed = true;
                return;
            }
            const std::string hex = dpxdecode::toHex(msg.bytes);
            if (json)
                dpxdecode::writeJson(std::cout, index, hex, result);
            else
                dpxdecode::writeText(std::cout, index, hex, result, textOptions);
            ++index;
        },
        std::cerr);

    std::cout.flush();
    return inputOk && !failed && std::cout.good() ? 0 : kExitBadInput;
}
