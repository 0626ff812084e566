#include "output/catalogue_loading.h"

#include "output/messages.h"

void TellCatalogueFailure(FileRead read, const CatalogueOpenFailure& notOpened) {
    if (read == FileRead::FailedPartway)
        ShowMessage(CantReadCatalogue.title, CantReadCatalogue.text);
    else if (read == FileRead::NotOpened && !notOpened.title.empty())
        ShowMessage(notOpened.title, notOpened.text);
}

bool OpenCatalogue(const std::string& folder, LineReader& catalogue, const CatalogueOpenFailure& notOpened) {
    FileRead read = OpenLines(folder, "static.ini", catalogue);
    if (read == FileRead::Whole) return true;
    TellCatalogueFailure(read, notOpened);
    return false;
}

bool ReadToTheEnd(const LineReader& catalogue) {
    if (!catalogue.ReadFailed()) return true;
    TellCatalogueFailure(FileRead::FailedPartway, {});
    return false;
}

bool CatalogueReadsWhole(const std::string& folder, const CatalogueOpenFailure& notOpened) {
    LineReader catalogue;
    if (!OpenCatalogue(folder, catalogue, notOpened)) return false;
    std::string_view line;
    while (NextPhysicalLine(catalogue, line)) {}
    return ReadToTheEnd(catalogue);
}

CataloguePass PassesOver(const std::string& folder, LineReader& opened) {
    return [&opened, folder, first = true](LineReader& reader) mutable {
        if (!first) return OpenLines(folder, "static.ini", reader) == FileRead::Whole;
        first = false;
        reader = std::move(opened);
        return true;
    };
}
