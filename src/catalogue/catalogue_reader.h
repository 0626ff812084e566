// The shared catalogue reader and the name cuts of a building header.
#pragma once

#include "platform/platform.h"

#include <string>
#include <string_view>
#include <vector>

// The lines of bytes held in memory, or of a file read a block at a time so that a catalogue of any
// size takes no more memory than a block and its longest line. A line comes out as a view that
// holds until the next line is taken; bytes held in memory must outlive the reader.
class LineReader {
public:
    LineReader() = default;
    LineReader(const LineReader&) = delete;
    LineReader& operator=(const LineReader&) = delete;
    LineReader(LineReader&& other) noexcept;
    LineReader& operator=(LineReader&& other) noexcept;
    ~LineReader();

    const std::string& Bytes() const { return file_ == 0 ? *held_ : block_; }
    // Reads on until the bytes at hand hold at least count bytes from the current place, or the
    // file has ended; the bytes at hand from there.
    std::string_view Ahead(std::size_t count);
    // Whether a read of the file failed, so that what came in is not the whole file.
    bool ReadFailed() const { return failed_; }

private:
    friend LineReader LinesOf(const std::string& bytes);
    friend LineReader LinesOfFile(Handle file, std::size_t blockSize);
    friend bool NextPhysicalLine(LineReader& reader, std::string_view& line);
    // Drops the bytes before keepFrom and reads one more block after the rest; the number of bytes
    // dropped, so that places in the bytes can follow. False at the end of the file.
    bool ReadOn(std::size_t keepFrom, std::size_t& dropped);

    const std::string* held_ = nullptr;
    Handle file_ = 0;  // closed with the reader
    std::string block_;
    std::size_t blockSize_ = 0;
    bool ended_ = false, failed_ = false;
    std::size_t position_ = 0;
};

LineReader LinesOf(const std::string& bytes);
// The lines of an open file, read blockSize bytes at a time; the reader closes it.
LineReader LinesOfFile(Handle file, std::size_t blockSize = 1 << 16);
// A line ends at CR LF, LF, CR or NUL; a CR followed by any other byte leaves that byte for the
// next line. A line end at the very end of the data makes no further empty line.
bool NextPhysicalLine(LineReader& reader, std::string_view& line);
// The next physical line less its leading and trailing blanks (tabs stay).
bool NextCatalogueLine(LineReader& reader, std::string_view& line);

// How reading a file ended.
enum class FileRead {
    Whole,          // every byte is in
    NotOpened,      // the folder or the file could not be opened
    FailedPartway,  // a read failed: what came in is not the whole file
};
// Makes the folder current and opens the file there by its bare name; NotOpened or Whole.
FileRead OpenLines(const std::string& folder, const std::string& fileName, LineReader& reader);

std::string_view TrimBlanks(std::string_view line);
bool IsBuildingHeader(std::string_view line);
std::string_view SectionNameByBracket(std::string_view header);
std::string_view SectionNameByEnds(std::string_view header);
std::string_view ObjectNameOf(std::string_view header);
// Gives each building header's section name by the bracket cut to the sink, in file order.
template <typename Sink>
void ForEachBuildingSectionName(LineReader& reader, Sink&& sink) {
    std::string_view line;
    while (NextCatalogueLine(reader, line))
        if (IsBuildingHeader(line)) sink(SectionNameByBracket(line));
}
