#pragma once
// The tree's pictures, drawn at run time so they follow the system colours: one image
// per icon number (0 to kIconCount - 1 of rules/object_groups.h). 0 an object of unknown
// geometry, 1 a point, 2 a line, 3 an area, 4 an object without geometry, 5 a dataset,
// 30 a harbour shown at its entry point; 6 to 11 are 0 to 5 marked (a red corner), and
// 31 to 77 with their marked forms 78 to 124 are numbered tiles for the panels' objects.

#include <windows.h>
#include <commctrl.h>

namespace br::inspector {

// A new image list of 16 x 16 pictures; the caller destroys it.
HIMAGELIST MakeTreeIcons();

}  // namespace br::inspector
