// Resource numbers of BR_Info.dll.
#pragma once

#define IDS_PROJNAME 100
#define IDC_CROSSHAIR 203
#define IDB_PICTURE_TOOLBAR 204
#define IDB_STRIP_205 205
#define IDD_PICTURE_BOX 206
#define IDB_STRIP_206 206
#define IDB_STRIP_207 207
#define IDB_STRIP_208 208
#define IDB_STRIP_209 209
#define IDB_STRIP_210 210
// IDB_TVINFO_PORT_COLOR_NEW is a named bitmap: load it by that name, not by a number.
