// The words of a command line: options and the rest.
#pragma once

#include <span>
#include <string>
#include <vector>

// An option that a command knows, with its dashes.
struct OptionForm {
    const char* name;
    bool takesValue;
};

// Long options take their value after a space or an equals sign, "-o" after a space; "--" ends the
// options; a lone "-" is no option. Of an option given twice the last one holds.
class Arguments {
public:
    // False, with `error` set, when an option is unknown, lacks its value or has one too many.
    bool Parse(std::span<char* const> words, std::span<const OptionForm> known);

    bool Has(const char* option) const { return Find(option) != nullptr; }
    // The option's value, or null when it was not given.
    const std::string* Find(const char* option) const;
    const std::vector<std::string>& Rest() const { return rest; }

    std::string error;

private:
    struct Given {
        std::string name;
        std::string value;
    };
    bool Take(std::span<char* const> words, size_t& i, std::span<const OptionForm> known);

    std::vector<Given> options;
    std::vector<std::string> rest;
};

// A decimal number from low to high and nothing else.
bool ParseNumber(const std::string& text, int low, int high, int* value);
