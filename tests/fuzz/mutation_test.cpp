// Malformed input: mutated and random messages through all four passes.
// Every pass must walk the message to its end (result 1), agree with the
// other passes, and stay inside the message (the harness's state holds an
// exact copy of the bytes, so the address sanitizer sees any over-read).
#include <gtest/gtest.h>

#include <random>
#include <string>

#include "support/harness.h"

namespace {

using camel::test::Bytes;

Bytes mutate(const Bytes &seed, std::mt19937 &rng) {
    Bytes m = seed;
    std::uniform_int_distribution<int> kind(0, 5);
    const int edits = 1 + static_cast<int>(rng() % 3);
    for (int e = 0; e < edits; ++e) {
        if (m.empty()) {
            m.push_back(static_cast<uint8_t>(rng()));
            continue;
        }
        const size_t at = rng() % m.size();
        switch (kind(rng)) {
        case 0: m[at] = static_cast<uint8_t>(rng()); break;             // random octet
        case 1: m[at] ^= static_cast<uint8_t>(1u << (rng() % 8)); break; // bit flip
        case 2: m.resize(at); break;                                     // truncation
        case 3: m.insert(m.begin() + static_cast<long>(at), static_cast<uint8_t>(rng())); break;
        case 4: m[at] = (rng() & 1) ? 0x80 : 0x00; break;                // indefinite / EOC octets
        case 5: m[at] = static_cast<uint8_t>(0x81 + rng() % 4); break;   // long-form lengths
        }
    }
    return m;
}

TEST(Fuzz, MutatedMessagesDecodeSafelyInEveryPass) {
    auto seeds = camel::test::sampleMessages();
    // A few fixed messages so the test has seeds even without samples.
    seeds.push_back(camel::test::hexBytes("62 06 48 04 01 02 03 04"));
    seeds.push_back(camel::test::hexBytes("67 09 49 04 aa bb cc dd 4a 01 01"));
    std::mt19937 rng(20261206);
    for (int i = 0; i < 3000; ++i) {
        const Bytes m = mutate(seeds[static_cast<size_t>(i) % seeds.size()], rng);
        SCOPED_TRACE(i);
        const auto d = camel::test::decode(m);
        ASSERT_EQ(d.md.result, 1);
        if (HasFailure())
            break;
    }
}

TEST(Fuzz, RandomBytesDecodeSafelyInEveryPass) {
    std::mt19937 rng(7);
    const uint8_t types[] = {0x61, 0x62, 0x64, 0x65, 0x67};
    for (int i = 0; i < 2000; ++i) {
        Bytes m(rng() % 64);
        for (auto &b : m)
            b = static_cast<uint8_t>(rng());
        if (!m.empty())
            m[0] = types[rng() % 5];
        SCOPED_TRACE(i);
        camel::test::decode(m);
        if (HasFailure())
            break;
    }
}

} // namespace
