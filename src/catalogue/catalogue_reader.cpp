// static.ini, as the readers see it:
//
//   [***]
//   Title House
//   (0)
//   [buildings.House$Kiosk]
//   Mesh          3do/Buildings/Kiosk/mono.sim
//
// Bytes in, bytes out: no decoding and no limit on a line's length.
#include "catalogue/catalogue_reader.h"

#include "platform/platform.h"

#include <algorithm>
#include <cstring>

LineReader::LineReader(LineReader&& other) noexcept { *this = std::move(other); }

LineReader& LineReader::operator=(LineReader&& other) noexcept {
    std::swap(held_, other.held_);
    std::swap(file_, other.file_);
    std::swap(block_, other.block_);
    std::swap(blockSize_, other.blockSize_);
    std::swap(ended_, other.ended_);
    std::swap(failed_, other.failed_);
    std::swap(position_, other.position_);
    return *this;
}

LineReader::~LineReader() {
    if (file_ != 0) CloseFile(file_);
}

LineReader LinesOf(const std::string& bytes) {
    LineReader reader;
    reader.held_ = &bytes;
    return reader;
}

LineReader LinesOfFile(Handle file, std::size_t blockSize) {
    LineReader reader;
    reader.file_ = file;
    reader.blockSize_ = blockSize;
    return reader;
}

bool LineReader::ReadOn(std::size_t keepFrom, std::size_t& dropped) {
    dropped = 0;
    if (file_ == 0 || ended_) return false;
    block_.erase(0, keepFrom);
    dropped = keepFrom;
    position_ -= keepFrom;
    // A line longer than a block doubles what is read, so that moving it down stays linear.
    std::size_t kept = block_.size(), wanted = std::max(blockSize_, kept);
    block_.resize(kept + wanted);
    std::size_t got = ReadBytes(file_, block_.data() + kept, wanted);
    block_.resize(kept + got);
    if (got > 0) return true;
    ended_ = true;
    failed_ = ReadHasFailed(file_);
    return false;
}

std::string_view LineReader::Ahead(std::size_t count) {
    std::size_t dropped = 0;
    while (Bytes().size() - position_ < count && ReadOn(position_, dropped)) {}
    return std::string_view(Bytes()).substr(position_);
}

bool NextPhysicalLine(LineReader& reader, std::string_view& line) {
    std::size_t& position = reader.position_;
    std::size_t dropped = 0;
    if (position >= reader.Bytes().size() && !reader.ReadOn(position, dropped)) return false;
    std::size_t start = position, end = start;
    for (;;) {
        // strcspn stops at CR, at LF and at NUL, the three line ends, and is much faster than a loop
        // over the bytes; the string's own terminating NUL stops a scan that reaches its end.
        end += std::strcspn(reader.Bytes().data() + end, "\r\n");
        if (end < reader.Bytes().size()) break;
        bool more = reader.ReadOn(start, dropped);
        start -= dropped;
        end -= dropped;
        if (!more) break;
    }
    position = end;
    if (position < reader.Bytes().size()) {
        char ending = reader.Bytes()[position++];
        // The LF of a CR LF may wait in the next block.
        if (ending == '\r' && position == reader.Bytes().size()) {
            reader.ReadOn(start, dropped);
            start -= dropped;
            end -= dropped;
        }
        if (ending == '\r' && position < reader.Bytes().size() && reader.Bytes()[position] == '\n') ++position;
    }
    line = std::string_view(reader.Bytes().data() + start, end - start);
    return true;
}

bool NextCatalogueLine(LineReader& reader, std::string_view& line) {
    if (!NextPhysicalLine(reader, line)) return false;
    line = TrimBlanks(line);
    return true;
}

FileRead OpenLines(const std::string& folder, const std::string& fileName, LineReader& reader) {
    if (!MakeFolderCurrent(folder)) return FileRead::NotOpened;
    Handle file = OpenForReading(fileName);
    if (file == 0) return FileRead::NotOpened;
    reader = LinesOfFile(file);
    return FileRead::Whole;
}

std::string_view TrimBlanks(std::string_view line) {
    std::size_t first = line.find_first_not_of(' ');
    if (first == std::string_view::npos) return {};
    return line.substr(first, line.find_last_not_of(' ') + 1 - first);
}

bool IsBuildingHeader(std::string_view line) { return line.substr(0, 4) == "[bui"; }

std::string_view SectionNameByBracket(std::string_view header) {
    if (header.empty()) return {};
    std::size_t bracket = header.find(']', 1);
    return header.substr(1, bracket == std::string_view::npos ? std::string_view::npos : bracket - 1);
}

std::string_view SectionNameByEnds(std::string_view header) {
    if (header.size() < 2) return {};
    return header.substr(1, header.size() - 2);
}

// A header without "$" gives the whole line less its last character.
std::string_view ObjectNameOf(std::string_view header) {
    std::size_t dollar = header.find('$');
    std::size_t start = dollar == std::string_view::npos ? 0 : dollar + 1;
    std::size_t next = header.find('$', start);
    std::string_view name = header.substr(start, next == std::string_view::npos ? std::string_view::npos : next - start);
    if (!name.empty()) name.remove_suffix(1);
    return name;
}
