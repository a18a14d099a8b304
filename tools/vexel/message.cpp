#include "tools/vexel/message.h"

#include <cstdarg>
#include <cstdio>

std::string Format(const char* format, ...)
{
    char text[512];
    va_list args;
    va_start(args, format);
    const int length = std::vsnprintf(text, sizeof text, format, args);
    va_end(args);
    const size_t kept = length < 0 ? 0 : static_cast<size_t>(length);
    return std::string(text, kept < sizeof text ? kept : sizeof text - 1);
}

static void PrintLine(std::string line)
{
    for (char& c : line) {
        if (static_cast<unsigned char>(c) < 32 || c == 127)
            c = '?';
    }
    line += '\n';
    std::fwrite(line.data(), 1, line.size(), stderr);
}

void Complain(const std::string& subject, const std::string& what)
{
    PrintLine("vexel: " + subject + ": " + what);
}

int ComplainUsage(const std::string& what)
{
    PrintLine("vexel: " + what + " (see vexel --help)");
    return kExitUsage;
}
