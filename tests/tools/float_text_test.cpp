// SPDX-License-Identifier: MIT
// The fast float text against std::to_chars, its reference, over the values
// it takes a short cut for and their neighbours, a whole binade, the edges of
// where fixed notation stops being the shorter, and random bit patterns.
#include <gtest/gtest.h>

#include <bit>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <random>
#include <string>

#include "vantrel/float_text.h"

namespace {

std::string Reference(float value)
{
    char text[32];
    return std::string(text, std::to_chars(text, text + sizeof text, value).ptr);
}

// Counts the values whose text differs, and shows the first few.
class Comparison {
public:
    void Check(float value)
    {
        std::string fast;
        vantrel_cli::AppendShortestFloat(fast, value);
        const std::string reference = Reference(value);
        ++checked_;
        if (fast == reference) return;
        if (++differences_ <= 5)
            ADD_FAILURE() << "bits 0x" << std::hex << std::bit_cast<uint32_t>(value) << ": " << fast << " instead of "
                          << reference;
    }
    ~Comparison() { EXPECT_EQ(differences_, 0u) << "of " << checked_ << " values"; }

private:
    uint64_t checked_ = 0, differences_ = 0;
};

TEST(FloatText, ShortDecimalsAndTheirNeighbours)
{
    Comparison comparison;
    const double scales[] = {1.0, 10.0, 100.0, 1000.0, 10000.0, 100000.0};
    for (const double scale : scales) {
        for (int64_t n = -300000; n <= 300000; ++n) {
            const float value = float(double(n) / scale);
            comparison.Check(value);
            comparison.Check(std::nextafter(value, INFINITY));
            comparison.Check(std::nextafter(value, -INFINITY));
        }
    }
    // Where fixed and scientific notation trade places, and the ends of the
    // short cut's range.
    for (const double edge : {1e-4, 1e-3, 1e-2, 1e4, 1e5, 1e6, 1e7, 1e8}) {
        for (int step = -2000; step <= 2000; ++step) {
            const float value = float(edge * (1.0 + step * 1e-4));
            comparison.Check(value);
            comparison.Check(-value);
            comparison.Check(float(std::round(double(value))));
        }
    }
    for (const float special : {0.0f, -0.0f, 1.0f, 0.5f, 1024.0f, 65536.0f, 100000.0f, 1200.0f, INFINITY, -INFINITY,
                                NAN, 3.4028235e38f, 1.17549435e-38f, 1e-45f})
        comparison.Check(special);
}

TEST(FloatText, AWholeBinadeAndRandomBits)
{
    Comparison comparison;
    // Every float in [8, 16): all the short decimals of that size and the
    // values between them.
    for (uint32_t bits = std::bit_cast<uint32_t>(8.0f); bits < std::bit_cast<uint32_t>(16.0f); ++bits)
        comparison.Check(std::bit_cast<float>(bits));
    std::mt19937 random(20261123);
    for (int i = 0; i < 2000000; ++i) comparison.Check(std::bit_cast<float>(uint32_t(random())));
}

}  // namespace
