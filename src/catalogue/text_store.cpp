#include "catalogue/text_store.h"

#include <algorithm>

std::string_view TextStore::Keep(std::string_view text) {
    const std::size_t blockSize = 1 << 20;
    if (blocks_.empty() || blocks_.back().size() + text.size() > blocks_.back().capacity()) {
        blocks_.emplace_back();
        blocks_.back().reserve(std::max(blockSize, text.size()));
    }
    std::string& block = blocks_.back();
    std::size_t at = block.size();
    block.append(text);
    return std::string_view(block).substr(at, text.size());
}
