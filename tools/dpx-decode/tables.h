// The module's description tables as a host reads them through
// dp_DLLGetTable and dp_DLLGetPtr: the catalogue labels the outputs name
// fields by, and the whole set printed as one JSON object (--tables).
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "module.h"

namespace dpxdecode {

// Reads the module's field catalogue; the labels are then available to
// catalogueLabel.  False when the module serves no catalogue.
bool loadCatalogue(const Module &module);

// The catalogue label of field id `id` (no leading blanks); empty for an id
// the catalogue does not list.
const std::string &catalogueLabel(uint32_t id);

// Every description table as one JSON object on one line.  False when a
// table is not served.
bool writeTables(std::ostream &os, const Module &module);

} // namespace dpxdecode
