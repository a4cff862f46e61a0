// Running the built dpx-decode from a test: arguments, standard input from
// a temporary file, standard output, standard error and exit status back.
#pragma once

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace dpxtest {

struct Outcome {
    int status = -1; // exit status, or -1 when it did not exit normally
    std::string out, err;
    std::vector<std::string> lines() const {
        std::vector<std::string> l;
        std::istringstream in(out);
        for (std::string s; std::getline(in, s);)
            l.push_back(s);
        return l;
    }
    std::vector<nlohmann::json> objects() const {
        std::vector<nlohmann::json> o;
        for (const std::string &l : lines())
            o.push_back(nlohmann::json::parse(l));
        return o;
    }
};

// `s` in single quotes for the shell.
inline std::string quote(const std::string &s) {
    std::string q = "'";
    for (char c : s)
        q += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return q + "'";
}

// A file in the test's temporary directory, named after the running test and
// this process, so that test runs of several builds at once do not collide.
inline std::string tempFile(const std::string &name, const std::string &content) {
    const std::string path = ::testing::TempDir() + "dpx_decode_" + std::to_string(getpid()) + "_" +
                             ::testing::UnitTest::GetInstance()->current_test_info()->name() + "_" + name;
    std::ofstream(path, std::ios::binary) << content;
    return path;
}

// Runs dpx-decode with `args` (quoted as needed), standard input from `input`;
// under the build's emulator where this machine cannot execute its programs.
inline Outcome run(const std::string &args, const std::string &input = "") {
    const std::string errPath = tempFile("stderr", "");
    const std::string emulator = DPX_TEST_EMULATOR;
    const std::string command = (emulator.empty() ? "" : quote(emulator) + " ") +
                                quote(DPX_BUILD_DIR "/dpx-decode") + " " + args + " <" +
                                quote(tempFile("stdin", input)) + " 2>" + quote(errPath);
    Outcome r;
    FILE *p = popen(command.c_str(), "r");
    if (p == nullptr)
        return r;
    char buf[4096];
    for (size_t n; (n = fread(buf, 1, sizeof buf, p)) > 0;)
        r.out.append(buf, n);
    const int st = pclose(p);
    r.status = WIFEXITED(st) ? WEXITSTATUS(st) : -1;
    std::ostringstream err;
    err << std::ifstream(errPath).rdbuf();
    r.err = err.str();
    return r;
}

} // namespace dpxtest
