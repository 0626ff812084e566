// Text kept for views: what is put in never moves, so a view of it holds as long as the store.
#pragma once

#include <deque>
#include <string>
#include <string_view>

class TextStore {
public:
    std::string_view Keep(std::string_view text);

private:
    std::deque<std::string> blocks_;  // each filled no further than the room reserved for it
};
