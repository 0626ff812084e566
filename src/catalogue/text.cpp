#include "catalogue/text.h"

std::string LowerCopy(const std::string& text) {
    std::string lower = text;
    for (char& c : lower)
        if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    return lower;
}

bool StartsWith(const std::string& text, const std::string& prefix) { return text.compare(0, prefix.size(), prefix) == 0; }

bool Contains(const std::string& text, const std::string& part) { return text.find(part) != std::string::npos; }

// Built piece by piece: "(" + std::to_string(n) + ")" trips a false -Wrestrict in GCC 12 at -O2.
std::string NumberInParentheses(long long number) {
    std::string text = "(";
    text += std::to_string(number);
    text += ')';
    return text;
}
