#pragma once
// The text of the tree's header item: which dataset the listed objects come from.
//   raster chart entry:  "Raster chart" and the chart's name (the identity's dataset name)
//   library:             "Library <name from its header>   <database>"
//   dataset "1":         "Mariner Objects   <database>"
//   any other dataset:   "DataSet <file name up to its stop>   <database>", the
//                        identity's dataset name standing in when the header is unreadable

#include <windows.h>
#include <unknwn.h>

#include <string>

namespace br::inspector {

std::wstring DataSetLabel(IUnknown* owner, const GUID& id);

}  // namespace br::inspector
