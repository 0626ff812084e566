#include "output/catalogue_loading.h"

#include "output/messages.h"

void TellCatalogueFailure(FileRead read, const CatalogueOpenFailure& notOpened) {
    if (read == FileRead::FailedPartway)
        ShowMessage(CantReadCatalogue.title, CantReadCatalogue.text);
    else if (read == FileRead::NotOpened && !notOpened.title.empty())
        ShowMessage(notOpened.title, notOpened.text);
}

bool LoadCatalogue(const std::string& folder, std::string& catalogue, const CatalogueOpenFailure& notOpened) {
    FileRead read = ReadWholeFile(folder, "static.ini", catalogue);
    if (read == FileRead::Whole) return true;
    TellCatalogueFailure(read, notOpened);
    return false;
}
