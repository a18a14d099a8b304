#include "tools/vexel/arguments.h"

#include <charconv>

bool Arguments::Parse(std::span<char* const> words, std::span<const OptionForm> known)
{
    bool optionsOver = false;
    for (size_t i = 0; i < words.size(); i++) {
        const std::string word = words[i];
        if (optionsOver || word.size() < 2 || word[0] != '-')
            rest.push_back(word);
        else if (word == "--")
            optionsOver = true;
        else if (!Take(words, i, known))
            return false;
    }
    return true;
}

bool Arguments::Take(std::span<char* const> words, size_t& i, std::span<const OptionForm> known)
{
    const std::string word = words[i];
    const size_t equals = word.compare(0, 2, "--") == 0 ? word.find('=') : std::string::npos;
    Given given = {word.substr(0, equals), ""};
    const OptionForm* option = nullptr;
    for (const OptionForm& candidate : known) {
        if (given.name == candidate.name)
            option = &candidate;
    }
    if (option == nullptr) {
        error = "unknown option " + given.name;
    } else if (!option->takesValue && equals != std::string::npos) {
        error = given.name + " takes no value";
    } else if (option->takesValue && equals != std::string::npos) {
        given.value = word.substr(equals + 1);
    } else if (option->takesValue && i + 1 == words.size()) {
        error = given.name + " needs a value";
    } else if (option->takesValue) {
        given.value = words[++i];
    }
    options.push_back(given);
    return error.empty();
}

const std::string* Arguments::Find(const char* option) const
{
    const std::string* found = nullptr;
    for (const Given& given : options) {
        if (given.name == option)
            found = &given.value;
    }
    return found;
}

bool ParseNumber(const std::string& text, int low, int high, int* value)
{
    const char* end = text.data() + text.size();
    int number = 0;
    const auto [stop, status] = std::from_chars(text.data(), end, number);
    if (text.empty() || status != std::errc() || stop != end || number < low || number > high)
        return false;
    *value = number;
    return true;
}
