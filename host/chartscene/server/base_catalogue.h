#pragma once
// The S-57 catalogue every scene starts from: gdal-data's three files, read once per
// process from CHARTSCENE_S57 (a folder) or from the "s57" folder beside chartscene.dll,
// where the build copies them.

#include <string>

#include "host/chartscene/model/S57Catalogue.h"

namespace br::chartscene {

// Null, with the reason, when the files cannot be read; later calls try again.
const S57Catalogue* BaseCatalogue(std::string& error);

}  // namespace br::chartscene
