#include "rewrite/renumbering.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "shell/app_state.h"
#include "shell/messages.h"
#include "shell/progress_list.h"
#include "shell/reports.h"

namespace {

const char* const TemporaryName = "static.ini.tmp";

// One streaming pass writes the final text: number lines left out and, when numbering, a fresh
// one above each header. The progress list shows this pass as the denumbering.
bool WriteRewrittenCatalogue(CatalogueReader& catalogue, ReportFile& temporary, bool numbering) {
    long long number = 0;
    std::string line;
    while (!temporary.failed && NextPhysicalLine(catalogue, line)) {
        if (IsNumberLine(line)) {
            if (ProgressListOn) AddProgressLine("Remove => " + line);
            continue;
        }
        if (ProgressListOn) {
            DrainOnePendingEvent();
            AddProgressLine(line);
        }
        if (numbering && IsBuildingHeader(line)) WriteReportLine(temporary, NumberInParentheses(number++));
        WriteReportLine(temporary, line);
    }
    return WritePendingText(temporary);
}

// The numbering pass as the progress list shows it, read back from what was written: every
// number line there is one the writing pass put in.
void ShowNumbering(const std::string& catalogueFolder) {
    CatalogueReader written;
    if (!OpenCatalogue(catalogueFolder, written, TemporaryName)) return;
    std::string line;
    while (NextPhysicalLine(written, line)) {
        if (IsNumberLine(line)) {
            DrainOnePendingEvent();
            AddProgressLine("Add => " + line);
        } else {
            AddProgressLine(line);
        }
    }
    CloseCatalogue(written);
}

CommandResult TellRewriteFailure(const std::string& text) {
    RemoveFile(TemporaryName);
    ShowMessage("static.ini failure", text);
    return CommandResult::Failed;
}

}  // namespace

bool IsNumberLine(const std::string& line) {
    std::size_t first = line.find_first_not_of(' ');
    if (first == std::string::npos) return false;
    std::size_t last = line.find_last_not_of(' ');
    return last >= first + 2 && line[first] == '(' && line[last] == ')' &&
           line.find_first_not_of("0123456789", first + 1) == last;
}

// static.ini is never open for writing: the new text goes to static.ini.tmp, reaches the disk,
// and only then takes the catalogue's place in one step.
CommandResult RenumberCatalogue(const std::string& catalogueFolder, const std::string& mode) {
    bool numbering = mode == "renumber";
    if (ProgressListOn) ClearProgressList();
    CatalogueReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue)) {
        ShowMessage("static.ini failure", "Can't open file static.ini");
        return CommandResult::Failed;
    }
    ReportFile temporary;
    temporary.fileName = TemporaryName;
    temporary.file = CreateForWriting(TemporaryName);
    bool written = temporary.file != 0 && WriteRewrittenCatalogue(catalogue, temporary, numbering);
    // A catalogue that could not be read to its end must not be replaced by the part that was.
    bool readWhole = !catalogue.failed;
    CloseCatalogue(catalogue);
    if (temporary.file != 0) {
        written = written && FlushToDisk(temporary.file);
        written = CloseFile(temporary.file) && written;
    }
    if (!readWhole) return TellRewriteFailure("Can't read static.ini");
    if (!written) return TellRewriteFailure("Can't write static.ini.tmp");
    if (numbering && ProgressListOn) ShowNumbering(catalogueFolder);
    if (!ReplaceFileWith("static.ini", TemporaryName)) return TellRewriteFailure("Can't replace static.ini");
    ShowMessage(numbering ? "Renumber static.ini" : "Denumber static.ini", "Done");
    return CommandResult::Done;
}
