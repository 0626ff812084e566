// All that works on a catalogue alone, on the same arbitrary bytes: the reader and the name cuts
// against a plain splitter; each check, both mission-builder lists and the mesh reference run over a
// tiny mods tree against the bench's baselines; renumbering and denumbering as a round trip.
#include "fuzz_support.h"

#include "catalogue/catalogue_reader.h"
#include "checks/mesh_references.h"
#include "commands/command_table.h"
#include "platform/headless/headless.h"
#include "rewrite/mission_builder_list.h"
#include "rewrite/renumbering.h"

#include <filesystem>

namespace {

// The platform matches letter case as Windows does and opens no folder as a file; the baseline's
// fopen does neither. It cannot judge a catalogue with a mesh value that the two open differently.
bool HostOpensOtherwise() {
    std::string catalogue = ReadFile("static.ini");
    LineReader lines = LinesOf(catalogue);
    MeshIndex index = BuildMeshIndex(lines);
    for (const MeshIndexEntry& entry : index.entries)
        for (const std::string_view* value : {&entry.mesh, &entry.meshLive, &entry.meshDead})
            for (const char* mod : {"Pack\\", "Caps\\", ".\\", "..\\"}) {  // "." and ".." hold a 3do too
                std::string path = (Scratch + "mods\\" + mod).append(*value);
                Handle opened = OpenForReading(path);
                if (opened) CloseFile(opened);
                if (!value->empty() && (opened != 0) != std::filesystem::exists(HeadlessHostPath(path)))
                    return true;
            }
    return false;
}

std::string Rewritten(const std::string& catalogue, Numbering numbering) {
    std::string text;
    LineReader lines = LinesOf(catalogue);
    RewriteCatalogue(lines, numbering, [&text](std::string_view piece) { text.append(piece); });
    return text;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string input = Fresh(data, size), kept;
    LineReader physical = LinesOf(input), trimmed = LinesOf(input);
    std::string_view raw, line;
    bool judged = true;  // the plain two passes drop lines with a bracket: only number lines may have one
    // A line ends at CR LF, LF, CR or NUL; no empty line follows a final end.
    for (std::size_t at = 0, end; at < size; at = end + (input.compare(end, 2, "\r\n") == 0 ? 2 : 1)) {
        end = std::min(input.find_first_of(std::string("\r\n\0", 3), at), size);
        std::string expected = input.substr(at, end - at);
        std::size_t first = expected.find_first_not_of(' '), last = expected.find_last_not_of(' ');
        std::string bare = first == std::string::npos ? "" : expected.substr(first, last - first + 1);
        Require(NextPhysicalLine(physical, raw) && raw == expected, "the physical lines");
        Require(NextCatalogueLine(trimmed, line) && line == bare, "the catalogue lines, less blanks");
        std::string_view bracket = SectionNameByBracket(line), name = ObjectNameOf(line);
        std::size_t cut = 1 + bracket.size();  // where the bracket cut stops: the first "]" or the end
        Require(IsBuildingHeader(line) == line.starts_with("[bui") && name.find('$') == std::string::npos &&
                    line.find(name) != std::string::npos &&
                    (line.size() < 2 ||
                     (SectionNameByEnds(line) == line.substr(1, line.size() - 2) &&
                      line.substr(1, bracket.size()) == bracket && bracket.find(']') == std::string::npos &&
                      (cut == line.size() || line[cut] == ']'))),
                "the name cuts");
        // "(", digits, ")" between blanks: the lines the denumbering takes out.
        bool number = bare.size() > 2 && bare[0] == '(' &&
                      bare.find_first_not_of("0123456789", 1) == bare.size() - 1 && bare.back() == ')';
        if (!number) kept += expected + "\r\n";
        judged = judged && (number || expected.find_first_of("()") == std::string::npos);
    }
    Require(!NextPhysicalLine(physical, raw) && !NextCatalogueLine(trimmed, line), "no more lines");

    CommandInput inScratch;
    inScratch.catalogueFolder = Scratch;
    auto run = [&](const char* command) { return CommandNamed(command)->run(inScratch); };
    RequireBaseline(run("doubled-objects"), "Doubled_objects.txt", "pairwise");
    RequireBaseline(run("irregular-entries"), "Irregular_entrys.txt", "prefix-table");
    RequireBaseline(run("empty-references"), "Empty_references.txt", "bare-keys",
                    "\r\nEmpty reference: ");
    RequireBaseline(CreateMissionBuilderList(Scratch, BuilderList::Fmb), "Static_list_FMB.txt", "entry-list",
                    nullptr);
    RequireBaseline(CreateMissionBuilderList(Scratch, BuilderList::FmbPlus), "Static_list_FMBplus.txt",
                    "entry-list-plus", nullptr);
    for (const char* file :
         {"mods/Pack/3do/Buildings/Pier/live.sim", "mods/Caps/3DO/Buildings/Boathouse/mono.sim",
          "mods/3do/Buildings/Kiosk/live.sim", "3do/Buildings/Chapel/live.sim",
          "mods/Old/3do_old/Buildings/Mill/mono.sim"})
        WriteFile(file, "");
    RequireBaseline(CheckMeshReferences(Scratch, Scratch + "mods\\", MeshCheck::SharedLiveDeadMeshes),
                    "Doubled_sims_or_meshes.txt", "mesh-index", "\r\nMeshLive: ");
    RequireBaseline(CheckMeshReferences(Scratch, Scratch + "mods\\", MeshCheck::MissingMeshes),
                    "Missing_3do.txt", "open-per-mesh", "\r\nNot found: ", HostOpensOtherwise);

    std::string renumbered = Rewritten(input, Numbering::Renumber);
    Require(Rewritten(renumbered, Numbering::Renumber) == renumbered,
            "a second renumbering changes nothing");
    if (judged) RunBaselineOnScratch("two-passes");
    Require(!judged || ReadFile("static.ini") == renumbered, "renumbering as the plain two passes");
    WriteFile("static.ini", renumbered);
    Require(RenumberCatalogue(Scratch, Numbering::Denumber) == CommandResult::Done &&
                ReadFile("static.ini") == kept,
            "denumbering gives back every line but the number lines, with CR LF");
    Require(!OpenForReading(Scratch + "static.ini.tmp"), "static.ini.tmp is gone");

    // Read in small blocks, the file gives the lines the bytes give in memory, wherever a block ends.
    WriteFile("static.ini", input);
    LineReader inMemory = LinesOf(input), inBlocks = LinesOfFile(OpenForReading(Scratch + "static.ini"), 1 + size % 7);
    for (bool more = true; more;) {
        more = NextPhysicalLine(inMemory, raw);
        Require(NextPhysicalLine(inBlocks, line) == more && (!more || line == raw), "the lines of a file in blocks");
    }
    return 0;
}
