// The pointer width the suite runs with, printed for CTest (the pointer_width
// entry checks it against the width the preset builds for), and the ELF class
// of every program and library the tests load or start, which must match it:
// a 64-bit dpx-decode in the 32-bit build would otherwise pass its tests on a
// machine that runs both.

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <string>

namespace {

TEST(Build, ArtefactsMatchThePointerWidthTheSuiteRunsWith) {
    std::printf("pointer width: %zu bytes\n", sizeof(void *));
    const char want = sizeof(void *) == 4 ? 1 : 2; // EI_CLASS: ELFCLASS32, ELFCLASS64
    for (const std::string name : {"camel_tests", "dpx-decode", "3gpp_camel_400_DLL.so",
                                   "libpu_ParserUtilities.so", "libkf_OptSupport.so"}) {
        std::ifstream in(DPX_BUILD_DIR "/" + name, std::ios::binary);
        char ident[5] = {};
        in.read(ident, sizeof ident);
        ASSERT_TRUE(in) << name << " is missing";
        EXPECT_EQ(std::string(ident, 4), "\177ELF") << name;
        EXPECT_EQ(ident[4], want) << name;
    }
}

} // namespace
