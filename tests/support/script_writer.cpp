#include "tests/support/script_writer.h"

#include "core/player/opcodes.h"
#include "tests/support/byte_writer.h"

#include <algorithm>
#include <bit>
#include <cstdio>
#include <cstdlib>
#include <map>

namespace {

std::string HexBytes(const std::string& digits)
{
    std::string bytes;
    for (size_t at = 0; at + 1 < digits.size(); at += 2) {
        at = std::min(digits.find_first_not_of(' ', at), digits.size() - 1);
        bytes += char(std::stoi(digits.substr(at, 2), nullptr, 16));
    }
    return bytes;
}

std::string Unescaped(std::string text)
{
    for (size_t at; (at = text.find("\\x")) != std::string::npos;)
        text.replace(at, 4, 1, char(std::stoi(text.substr(at + 2, 2), nullptr, 16)));
    return text;
}

} // namespace

// One word at a time; a quoted one, or one in angle brackets, may hold spaces.
ScriptWords SplitScript(const std::string& text)
{
    constexpr char kSpaces[] = " \t\r\n";
    ScriptWords words;
    for (size_t at = 0, end = 0; (at = text.find_first_not_of(kSpaces, end)) < text.size();) {
        const char kind = text[at];
        const bool bracketed = kind == '"' || kind == '<';
        const char* const stops = kind == '#'   ? "\n"
                                  : kind == '"' ? "\""
                                  : kind == '<' ? ">"
                                                : kSpaces;
        end = std::min(text.find_first_of(stops, at + 1), text.size());
        const std::string word = text.substr(at + bracketed, end - at - bracketed);
        end = std::min(end + bracketed, text.size());
        if (kind != '#')
            words.push_back({kind, kind == '<' ? HexBytes(word) : Unescaped(word)});
    }
    return words;
}

namespace {

// The operands of records with a payload: w word, b byte, s string, j jump.
const std::map<std::string, const char*> kOperands = {
    {"GotoFrame", "w"},  {"GetURL", "ss"},      {"WaitForFrame", "wb"}, {"WaitForFrameExpr", "b"},
    {"Jump", "j"},       {"If", "j"},           {"SetTarget", "s"},     {"GotoLabel", "s"},
    {"GetURLExpr", "b"}, {"GotoFrameExpr", "b"}};

[[noreturn]] void Refuse(const std::string& what)
{
    std::fprintf(stderr, "script: %s\n", what.c_str());
    std::abort();
}

int OpcodeOf(const std::string& name)
{
    for (int op = 0; op < 256; op++)
        if (OpcodeName(U8(op)) && name == OpcodeName(U8(op)))
            return op;
    Refuse("no record is called " + name);
}

bool IsNumber(const std::string& word)
{
    return std::isdigit(U8(word[0])) || word[0] == '-';
}

class Assembler {
public:
    explicit Assembler(const ScriptWords& script) : words(script) {}

    // The first pass finds the labels.
    std::vector<U8> Run()
    {
        for (pass = 0; pass < 2; pass++) {
            code = {};
            for (at = 0; at < words.size(); at++)
                PutWord(words[at]);
        }
        return code.Bytes();
    }

private:
    void PutWord(const ScriptWord& word)
    {
        const std::string& text = word.text;
        if (word.kind == '<')
            code.PutBytes({text.begin(), text.end()});
        else if (word.kind == '"')
            PutRecord(kOpPush, ByteWriter().PutU8(0).PutString(text));
        else if (text.back() == ':')
            labels[text] = code.Size();
        else if (IsNumber(text))
            PutRecord(kOpPush, ByteWriter().PutU8(1).PutU32(std::bit_cast<U32>(std::stof(text))));
        else
            PutNamed(text);
    }

    void PutNamed(const std::string& name)
    {
        const int op = OpcodeOf(name);
        const auto kinds = kOperands.find(name);
        ByteWriter payload;
        for (const char* kind = kinds != kOperands.end() ? kinds->second : ""; *kind; kind++) {
            if (++at == words.size())
                Refuse("an operand of " + name + " is missing");
            PutOperand(&payload, *kind, words[at].text);
        }
        PutRecord(op, payload);
    }

    void PutRecord(int op, const ByteWriter& payload)
    {
        code.PutU8(U32(op));
        if (op >= kFirstOpWithPayload)
            code.PutU16(U32(payload.Size())).PutBytes(payload.Bytes());
    }

    void PutOperand(ByteWriter* to, char kind, const std::string& text)
    {
        if (kind == 's')
            to->PutString(text);
        else if (kind == 'j')
            to->PutU16(U32(Distance(text)));
        else if (kind == 'b')
            to->PutU8(U32(std::stoi(text, nullptr, 0)));
        else
            to->PutU16(U32(std::stoi(text, nullptr, 0)));
    }

    // From the end of the jump that comes next.
    S64 Distance(const std::string& to)
    {
        if (pass == 0)
            return 0;
        if (const auto label = labels.find(to + ":"); label != labels.end())
            return S64(label->second) - S64(code.Size()) - 5;
        if (!IsNumber(to))
            Refuse("no place is called " + to);
        return std::stoi(to);
    }

    const ScriptWords& words;
    size_t at = 0;
    int pass = 0;
    std::map<std::string, size_t> labels;
    ByteWriter code;
};

} // namespace

std::vector<U8> AssembleScript(const ScriptWords& words)
{
    return Assembler(words).Run();
}
