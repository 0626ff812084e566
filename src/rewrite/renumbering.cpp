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

// The numbering as the progress list shows it, from the text written: every number line there is
// one the rewrite put in.
void ShowNumbering(const std::string& written) {
    LineReader reader = LinesOf(written);
    std::string_view line;
    while (NextPhysicalLine(reader, line)) {
        if (IsNumberLine(line)) {
            DrainOnePendingEvent();
            AddProgressLine("Add => " + std::string(line));
        } else {
            AddProgressLine(std::string(line));
        }
    }
}

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
    std::string catalogue;
    FileRead read = ReadWholeFile(catalogueFolder, "static.ini", catalogue);
    if (read != FileRead::Whole)
        return read == FileRead::NotOpened ? CantOpenToRewrite.text : CantReadCatalogue.text;
    if (!IsTextCatalogue(catalogue)) return "static.ini is not a text file";
    const std::string temporary = catalogueFolder + TemporaryName;
    Handle file = CreateTemporaryFile(claim, temporary);
    if (file == 0) return CantWriteTemporary;
    std::string text = RewrittenCatalogue(catalogue, numbering);
    if (!WriteBytes(file, text.data(), text.size()) || !FlushToDisk(file)) {
        CloseFile(file);
        RemoveFile(temporary);
        return CantWriteTemporary;
    }
    if (numbering == Numbering::Renumber && ProgressListOn) ShowNumbering(text);
    if (ReplaceClaimedFile(claim, file)) return "";
    RemoveFile(temporary);
    return "Can't replace static.ini";
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
std::string RewrittenCatalogue(const std::string& catalogue, Numbering numbering) {
    std::string text;
    text.reserve(catalogue.size() + catalogue.size() / 8);
    long long number = 0;
    LineReader reader = LinesOf(catalogue);
    std::string_view line;
    while (NextPhysicalLine(reader, line)) {
        if (IsNumberLine(line)) {
            if (ProgressListOn) AddProgressLine("Remove => " + std::string(line));
            continue;
        }
        if (ProgressListOn) {
            DrainOnePendingEvent();
            AddProgressLine(std::string(line));
        }
        if (numbering == Numbering::Renumber && IsBuildingHeader(line))
            text.append(NumberInParentheses(number++)).append("\r\n");
        text.append(line).append("\r\n");
    }
    return text;
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
