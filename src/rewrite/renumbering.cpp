#include "rewrite/renumbering.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "output/app_state.h"
#include "output/catalogue_loading.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"

namespace {

const char* const TemporaryName = "static.ini.tmp";

// The numbering as the progress list shows it, read back from what was written: every number
// line there is one the rewrite put in.
void ShowNumbering(const std::string& catalogueFolder) {
    std::string written;
    if (ReadWholeFile(catalogueFolder, TemporaryName, written) != FileRead::Whole) return;
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

CommandResult TellRewriteFailure(const std::string& text) {
    RemoveFile(TemporaryName);
    ShowMessage("static.ini failure", text);
    return CommandResult::Failed;
}

bool WriteTemporaryFile(const std::string& text) {
    Handle file = CreateForWriting(TemporaryName);
    if (file == 0) return false;
    bool written = WriteBytes(file, text.data(), text.size()) && FlushToDisk(file);
    return CloseFile(file) && written;
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

// static.ini is never open for writing: the new text goes to static.ini.tmp, reaches the disk,
// and only then takes the catalogue's place in one step.
CommandResult RenumberCatalogue(const std::string& catalogueFolder, Numbering numbering) {
    if (ProgressListOn) ClearProgressList();
    std::string catalogue;
    if (!LoadCatalogue(catalogueFolder, catalogue, {"static.ini failure", "Can't open file static.ini"}))
        return CommandResult::Failed;
    if (!WriteTemporaryFile(RewrittenCatalogue(catalogue, numbering)))
        return TellRewriteFailure("Can't write static.ini.tmp");
    if (numbering == Numbering::Renumber && ProgressListOn) ShowNumbering(catalogueFolder);
    if (!ReplaceFileWith("static.ini", TemporaryName)) return TellRewriteFailure("Can't replace static.ini");
    ShowMessage(numbering == Numbering::Renumber ? "Renumber static.ini" : "Denumber static.ini", "Done");
    return CommandResult::Done;
}
