// Small text helpers shared by the readers. Text is 8-bit, never decoded.
#pragma once

#include <string>

// Letters lowered as the system lowers 8-bit text for the ASCII texts the program looks for.
std::string LowerCopy(const std::string& text);
bool StartsWith(const std::string& text, const std::string& prefix);
bool Contains(const std::string& text, const std::string& part);
// "(" + the number + ")", the way number lines and object lists write an object's number.
std::string NumberInParentheses(long long number);
