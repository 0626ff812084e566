#include "catalogue/text.h"

std::string LowerCopy(std::string_view text) {
    std::string lower(text);
    for (char& c : lower)
        if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    return lower;
}

bool StartsWith(std::string_view text, std::string_view prefix) { return text.substr(0, prefix.size()) == prefix; }

bool Contains(std::string_view text, std::string_view part) { return text.find(part) != std::string_view::npos; }

// Built piece by piece: "(" + std::to_string(n) + ")" trips a false -Wrestrict in GCC 12 at -O2.
std::string NumberInParentheses(long long number) {
    std::string text = "(";
    text += std::to_string(number);
    text += ')';
    return text;
}
