// The mesh reference run on arbitrary catalogues. Mode "doubled" against the plain index with its
// pass per standard title; mode "missing" over a small tree of mod mesh folders, where every mesh it
// reports as not found must indeed open in none of them.
#include "fuzz_support.h"

#include "checks/mesh_references.h"
#include "output/app_state.h"
#include "output/progress_list.h"

#include <sstream>

namespace {

const char* const MeshFiles[] = {"mods/Pack/3do/a.sim", "mods/Pack/3do/Buildings/b.sim", "mods/Caps/3DO/c.sim",
                                 "mods/3do/d.sim", "3do/e.sim", "mods/Old/3do_old/f.sim"};

// Whether the mesh opens in one of the searched folders: a mod's 3do folder, the mods root's own
// (".") and that of the folder above it ("..").
bool MeshOpensSomewhere(const std::string& value) {
    for (const char* folder : {"mods/Pack/", "mods/Caps/", "mods/", ""}) {
        std::string path = folder + value;
        for (char& c : path)
            if (c == '\\') c = '/';
        if (IsScratchFile(path)) return true;
    }
    return false;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string catalogue(reinterpret_cast<const char*>(data), size);
    ResetForInput();
    for (const char* file : MeshFiles) WriteScratchFile(file, "");
    WriteScratchFile("static.ini", catalogue);
    CatalogueFolder = ScratchFolder();
    ProgressListOn = size > 0 && (data[0] & 1);
    if (ProgressListOn) OpenProgressList();

    CommandResult doubled =
        CheckMeshReferences(CatalogueFolder, ScratchFolder() + "mods\\", MeshCheck::SharedLiveDeadMeshes);
    bool written = false, expected = false;
    std::string report = ReadDesktopFile("Doubled_sims_or_meshes.txt", written);
    Require(written && report == BaselineOutput("mesh-index", "Doubled_sims_or_meshes.txt", expected),
            "the doubled report is the plain index's");
    Require((doubled == CommandResult::Findings) == (report.find("\r\nMeshLive: ") != std::string::npos),
            "the doubled result");

    CheckMeshReferences(CatalogueFolder, ScratchFolder() + "mods\\", MeshCheck::MissingMeshes);
    std::istringstream lines(ReadDesktopFile("Missing_3do.txt", written));
    Require(written, "the missing report is written");
    for (std::string line; std::getline(lines, line);) {
        if (!line.empty() && line.back() == '\r') line.pop_back();
        for (const char* key : {"Not found: Mesh ", "Not found: MeshLive ", "Not found: MeshDead "})
            if (line.rfind(key, 0) == 0)
                Require(!MeshOpensSomewhere(line.substr(std::string(key).size())), "a reported mesh opens nowhere");
    }
    return 0;
}
