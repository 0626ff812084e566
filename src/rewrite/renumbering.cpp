#include "rewrite/renumbering.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "output/app_state.h"
#include "output/catalogue_loading.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "platform/platform.h"

#include <algorithm>

namespace {

const char* const TemporaryName = "static.ini.tmp";
const char* const CantWriteTemporary = "Can't write static.ini.tmp";

// The numbering as the progress list shows it, from a second read of the catalogue: the text
// written holds its lines less the old number lines, and a new one above each header. False when
// the catalogue could not be read whole.
bool ShowNumbering(const std::string& catalogueFolder) {
    LineReader catalogue;
    if (OpenLines(catalogueFolder, "static.ini", catalogue) != FileRead::Whole) return false;
    long long number = 0;
    std::string_view line;
    while (NextPhysicalLine(catalogue, line)) {
        if (IsNumberLine(line)) continue;
        if (IsBuildingHeader(line)) {
            DrainOnePendingEvent();
            AddProgressLine("Add => " + NumberInParentheses(number++));
        }
        AddProgressLine(std::string(line));
    }
    return !catalogue.ReadFailed();
}

// Writes the replacement a large block at a time; a write that failed stops the writing, not the
// pass, so that the progress list still shows every line.
struct ReplacementWriter {
    Handle file = 0;
    std::string pending;
    bool failed = false;

    void Write(std::string_view text) {
        pending.append(text);
        if (pending.size() >= (1 << 16)) Flush();
    }
    void Flush() {
        if (!failed && !pending.empty() && !WriteBytes(file, pending.data(), pending.size())) failed = true;
        pending.clear();
    }
};

// While the catalogue is claimed no live run writes a static.ini.tmp beside it: one that is there
// was left by a run that died, and goes, unless it is a link or anything else the rewrite never
// makes.
Handle CreateTemporaryFile(Handle claim, const std::string& temporary) {
    Handle file = CreateReplacement(claim, temporary);
    if (file == 0 && RemoveFile(temporary)) file = CreateReplacement(claim, temporary);
    return file;
}

// The claimed catalogue rewritten through static.ini.tmp; what went wrong, or "" when it is done.
std::string RewriteClaimedCatalogue(const std::string& catalogueFolder, Numbering numbering, Handle claim) {
    LineReader catalogue;
    if (OpenLines(catalogueFolder, "static.ini", catalogue) != FileRead::Whole) return CantOpenToRewrite.text;
    std::string_view firstBlock = catalogue.Ahead(4096);
    if (catalogue.ReadFailed()) return CantReadCatalogue.text;
    if (!IsTextCatalogue(firstBlock)) return "static.ini is not a text file";
    const std::string temporary = catalogueFolder + TemporaryName;
    ReplacementWriter writer;
    writer.file = CreateTemporaryFile(claim, temporary);
    if (writer.file == 0) return CantWriteTemporary;
    RewriteCatalogue(catalogue, numbering, [&writer](std::string_view text) { writer.Write(text); });
    writer.Flush();
    bool readWhole = !catalogue.ReadFailed();
    catalogue = LineReader();  // closed now: Windows replaces no file that is open
    std::string failure;
    if (!readWhole)
        failure = CantReadCatalogue.text;
    else if (writer.failed || !FlushToDisk(writer.file))
        failure = CantWriteTemporary;
    else if (numbering == Numbering::Renumber && ProgressListOn && !ShowNumbering(catalogueFolder))
        failure = CantReadCatalogue.text;
    if (!failure.empty()) {
        CloseFile(writer.file);
    } else if (ReplaceClaimedFile(claim, writer.file)) {
        return "";
    } else {
        failure = "Can't replace static.ini";  // the attempt closed the replacement
    }
    RemoveFile(temporary);
    return failure;
}

}  // namespace

bool IsNumberLine(std::string_view line) {
    std::size_t first = line.find_first_not_of(' ');
    if (first == std::string_view::npos) return false;
    std::size_t last = line.find_last_not_of(' ');
    return last >= first + 2 && line[first] == '(' && line[last] == ')' &&
           line.find_first_not_of("0123456789", first + 1) == last;
}

// The progress list shows this pass as the denumbering.
void RewriteCatalogue(LineReader& catalogue, Numbering numbering,
                      const std::function<void(std::string_view)>& sink) {
    long long number = 0;
    std::string_view line;
    while (NextPhysicalLine(catalogue, line)) {
        if (IsNumberLine(line)) {
            if (ProgressListOn) AddProgressLine("Remove => " + std::string(line));
            continue;
        }
        if (ProgressListOn) {
            DrainOnePendingEvent();
            AddProgressLine(std::string(line));
        }
        if (numbering == Numbering::Renumber && IsBuildingHeader(line)) {
            sink(NumberInParentheses(number++));
            sink("\r\n");
        }
        sink(line);
        sink("\r\n");
    }
}

bool IsTextCatalogue(std::string_view bytes) {
    if (bytes.starts_with("\xFF\xFE") || bytes.starts_with("\xFE\xFF")) return false;
    std::string_view firstBlock = bytes.substr(0, 4096);
    return std::count(firstBlock.begin(), firstBlock.end(), '\0') * 8 <=
           static_cast<std::ptrdiff_t>(firstBlock.size());
}

// static.ini is never open for writing: the new text goes to static.ini.tmp, reaches the disk, and
// only then takes the catalogue's place in one step. The claim keeps a second rewrite out from the
// first read to that step; the user hears how it went once the catalogue is free again.
CommandResult RenumberCatalogue(const std::string& catalogueFolder, Numbering numbering) {
    if (ProgressListOn) ClearProgressList();
    Handle claim = 0;
    std::string failure;
    switch (ClaimForRewrite(catalogueFolder + "static.ini", claim)) {
        case FileClaim::Taken:
            failure = RewriteClaimedCatalogue(catalogueFolder, numbering, claim);
            ReleaseClaim(claim);
            break;
        case FileClaim::NotOpened:
            failure = CantOpenToRewrite.text;
            break;
        case FileClaim::ReadOnly:
            failure = "Can't replace static.ini";
            break;
        case FileClaim::Busy:
            failure = CantWriteTemporary;
            break;
    }
    if (!failure.empty()) {
        ShowMessage("static.ini failure", failure);
        return CommandResult::Failed;
    }
    ShowMessage(numbering == Numbering::Renumber ? "Renumber static.ini" : "Denumber static.ini", "Done");
    return CommandResult::Done;
}
