// The strings and numbers of scripts; numbers against the C library as the independent method.
#include "core/player/limits.h"
#include "core/player/multibyte.h"
#include "core/player/numbers.h"
#include "core/player/random.h"
#include "core/player/values.h"

#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <sstream>

namespace {
// Not a number when the text is refused.
double Read(const std::string& text)
{
    double value = NAN;
    ParseDouble(text.data(), static_cast<int>(text.size()), &value);
    return value;
}

std::string AllDigits(long double value)
{
    char all[900];
    std::snprintf(all, sizeof all, "%.800Le", value);
    return all;
}

// Laid out and rounded as text, from all digits by the C library; a 0 in front takes the carry.
std::string Expected(double value)
{
    std::string digits = AllDigits(std::fabs(value)).erase(1, 1);
    const int e = std::stoi(digits.substr(digits.find('e') + 1));
    const bool plain = e > -6 && e < 15, small = plain && e < 0;
    std::string text =
        (small ? "00." + std::string(~static_cast<U32>(e), '0') : "0") + digits.substr(0, 15);
    text.insert(plain && !small ? static_cast<U32>(e) + 2 : 2, small ? "" : ".");
    size_t i = text.size() - 1;
    for (; digits[15] >= '5' && (text[i] == '9' || text[i] == '.'); i--)
        text[i] = text[i] == '9' ? '0' : '.';
    text[i] = static_cast<char>(text[i] + (digits[15] >= '5'));
    const bool carried = !plain && text[0] == '1';
    text = carried ? "1" : text.erase(text.find_last_not_of('0') + 1);
    text.erase(text.find_last_not_of('.') + 1);
    if (text[0] == '0' && text.size() > 1 && text[1] != '.')
        text.erase(0, 1);
    return (value < 0 ? "-" : "") + text + (plain ? "" : "e" + std::to_string(e + carried));
}

// Of any size; with few digits, so that ties occur; tied in the last digit; beside a power of ten.
double AnyDouble(U64 bits, int kind)
{
    const double part = static_cast<double>(bits >> 44), sign = kind % 8 ? 1 : -1;
    const double kinds[] = {std::ldexp(bits >> 11, static_cast<int>(bits % 2099) - 1127),
                            std::ldexp(part, -static_cast<int>(bits % 30)),
                            1e14 + 8e8 * part + 0.25 * static_cast<double>(bits % 4),
                            std::nextafter(std::pow(10, bits % 600 - 300.0), part - 5e5)};
    return sign * kinds[kind % 4];
}

// Random digits, or halfway between two doubles and the least bit more or less.
std::string AnyDecimal(U64 bits, U64 more, int kind)
{
    const std::string tens = std::to_string((static_cast<int>(bits % 680) - 350) >> more % 8);
    if (kind % 2)
        return std::to_string(more >> bits % 60) + "." + std::to_string(bits % 997) + "e" + tens;
    const double value = std::fabs(AnyDouble(more, kind / 2));
    std::string text = AllDigits((value + 0.0L + std::nextafter(value, HUGE_VAL)) / 2);
    const size_t e = text.find('e'), last = text.find_last_not_of('0', e - 1);
    text[last] = static_cast<char>(text[last] - (bits % 3 == 2 && text[last] > '0'));
    return bits % 3 == 1 ? text.insert(e, "00001") : text;
}
} // namespace

TEST(NumbersTest, ManyNumbersAreWrittenAndReadExactly)
{
    std::mt19937_64 random(1);
    for (int i = 0; i < 20000; i++) {
        const double value = AnyDouble(random(), i);
        const std::string text = Expected(value), decimal = AnyDecimal(random(), random(), i);
        ScriptValue kept;
        kept.SetNumber(value);
        ASSERT_TRUE(kept.Number() == std::strtod(text.c_str(), nullptr) && kept.Text() == text);
        ASSERT_EQ(Read(decimal), std::strtod(decimal.c_str(), nullptr)) << decimal;
    }
    const std::string zeros(5000, '0'), odd = "9007199254740993." + zeros;
    EXPECT_TRUE(Read("0." + zeros + "7e5001") == 7 && Read("7" + zeros + "e-5000") == 7);
    EXPECT_TRUE(Read(odd) == 9007199254740992 && Read(odd + "1") == 9007199254740994);
}

TEST(NumbersTest, FormsAtTheirEdges)
{
    // A text, and what the number that it says is written as.
    std::istringstream pairs(
        "0.1 0.1 -0.5 -0.5 1e-5 0.00001 1e-6 1e-6 1e14 100000000000000 1e15 1e15 . 0 -. 0 "
        "999999999999999 999999999999999 999999999999999.9 1000000000000000 .5 0.5 5. 5 1e+3 1000 "
        "9.9999999999999999e-6 1e-5 0.9999999999999999 1 100000000000000.5 100000000000001 "
        "0.100000001490116119384765625 0.100000001490116 007 7 +8 8 -1.5E-1 -0.15 1e400 #ERROR# "
        "0e99999999999 0 1e-99999999999 0 2.4e-324 0 2.5e-324 4.94065645841247e-324 -0 0");
    ScriptValue v;
    for (std::string text, written; pairs >> text >> written;) {
        v.SetNumber(Read(text));
        EXPECT_EQ(v.Text(), written);
    }
    for (const char* bad : {"", "+", "-", " 1", "1 ", "1e", "0x10", "1.2.3", "Infinity", "#ERROR#"})
        EXPECT_TRUE(std::isnan(Read(bad))) << bad;
    S32 n = 5;
    EXPECT_TRUE(ConvertStringToInteger("-4294967297", &n) && n == -1);
    EXPECT_FALSE(ConvertStringToInteger("+", &n) || ConvertStringToInteger("1.", &n));
    EXPECT_TRUE(IsTrue("-0.5") && IsTrue("true") && IsTrue("yes") && !IsTrue("0e5"));
    EXPECT_TRUE(PowerOfTen(3) == 1000 && PowerOfTen(-1) == 0.1 && PowerOfTen(kS32Min) == 0);
    EXPECT_TRUE(TruncateToInt(-1.9) == -1 && TruncateToInt(-3e9) == kS32Min && !TruncateToInt(NAN));
}

TEST(NumbersTest, RandomNumbersRepeatAndAreEven)
{
    SeedRandom(12345 | 1 << 27); // 27 bits count
    EXPECT_TRUE(Random(kS32Max) == 2107256942 && Random(kS32Max) == 782833515 && Random(-5) == 0);
    SeedRandom(0); // the register is not stuck
    for (const int n : {2, 3, 10, 100}) {
        double hits[100] = {}, chi = -50000;
        for (int i = 0; i < 50000; i++)
            hits[Random(n)]++;
        for (const double h : hits)
            chi += h * h * n / 50000;
        EXPECT_LT(chi, n + 4 * std::sqrt(2.0 * n)) << n;
    }
}

TEST(NumbersTest, LeadBytesAndTheByteAfterThemAreOneCharacter)
{
    const auto part = [](const char* s, int start, int count, int multibyte) {
        int from = -1;
        const int n = PlayerStringExtract(s, start, count, multibyte, &from);
        return std::string(s + from, s + from + n) + "|";
    };
    EXPECT_EQ(part("abc", -7, 2, 0) + part("abc", 1, -1, 0) + part("abc", 9, 2, 0), "ab|bc||");
    EXPECT_EQ(part("a\x81zb", 1, 1, 1) + part("\xFC\xFC\x9F", 1, 7, 1), "\x81z|\x9F|");
    EXPECT_TRUE(PlayerStringLength("a\x81zb", 1) == 3 && PlayerStringLength("a\x81zb", 0) == 4);
    EXPECT_TRUE(PlayerIsMultiByte("a\x9Fz") && !PlayerIsMultiByte("\x80\xA0\xDF\xFDz\x9F"));
}

TEST(NumbersTest, TheStackKeepsItsValuesWhenItGrowsAndStopsAtItsLimits)
{
    gLimits.stackValues = 700;
    gLimits.stringBytes = 100;
    ValueStack stack;
    EXPECT_TRUE(stack.Pop().Length() == 0 && stack.PopNum() == 0);
    const std::string letters(90, 'a');
    for (int i = 0; i < 700; i++)
        i % 3 ? stack.Push()->SetText(letters.data(), i % 90) : stack.Push()->SetNumber(i / 4.0);
    EXPECT_TRUE(!stack.overflowed && !stack.Push() && stack.overflowed && !stack.Peek(700));
    for (int i = 700; i-- > 0;)
        EXPECT_EQ(stack.Pop().Text(), i % 3 ? letters.substr(0, i % 90u) : Expected(i / 4.0));
    ScriptValue a, b;
    a.SetText("1\0002", 3);
    b.SetBool(true);
    for (size_t n = 1; n < 300; n *= 2, a.Append(a))
        EXPECT_EQ(a.Text(), std::string(n, '1').substr(0, 100));
    b.Append(a);
    a.SetText(a.Text() + 50, 50);
    EXPECT_EQ(a.Text() + std::string(b.Text()), std::string(150, '1'));
    gLimits.allStringBytes = 1;
    a.Append(b);
    EXPECT_TRUE(a.Text()[0] == 0 && a.Length() == 0 && b.Length() == 100 && b.Number() > 1e98);
    gLimits = SLimits();
}
