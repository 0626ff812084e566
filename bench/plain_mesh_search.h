// The mesh folder search done the plain way: every set mesh of every entry with a title opened once
// per searched 3do folder, found or not. The measure for the real search in tests and benchmarks.
#pragma once

#include "checks/mesh_references.h"
#include "platform/platform.h"

#include <string>
#include <vector>

void SearchModMeshFoldersPlainly(std::vector<MeshIndexEntry>& index, const std::string& modsRoot, Handle bar);
