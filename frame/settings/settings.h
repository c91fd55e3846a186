#pragma once
// Every registry value the library reads or writes, below "SOFTWARE\Brine".
// Missing values, and values of another type, give the defaults listed here.
//
//   root  key (below SOFTWARE\Brine)          value              type       default
//   HKLM  (base)                              LogBRCL            REG_DWORD  0     log mask
//   HKLM  (base)                              LogFileBRCL        REG_SZ     none  log file
//   HKLM  Brdata\Enum                         KeyPath            REG_SZ     ""    chart database folder
//   HKLM  Brdata\Enum                         BasesStore         REG_SZ     ""    picture file folder
//   HKLM  Brdata\Enum                         P_PORT_TreeMode    REG_DWORD  0     inspector tree mode
//   HKLM  Brdata\Enum\<database>\Volumes\00   (default)          REG_SZ     ""    first volume folder
//   HKCU  BR_Info\PictureBox                  left top right bottom  REG_DWORD 0  picture window placement

#include <windows.h>

#include <string>

namespace br {

inline constexpr const char* SETTING_LOG_MASK = "LogBRCL";
inline constexpr const char* SETTING_LOG_FILE = "LogFileBRCL";
inline constexpr const char* SETTINGS_ENUM_KEY = "Brdata\\Enum";
inline constexpr const char* SETTING_KEY_PATH = "KeyPath";
inline constexpr const char* SETTING_BASES_STORE = "BasesStore";
inline constexpr const char* SETTING_TREE_MODE = "P_PORT_TreeMode";
inline constexpr const char* SETTINGS_PICTURE_BOX_KEY = "BR_Info\\PictureBox";

std::string ReadKeyPath();
std::string ReadBasesStore();
DWORD ReadTreeMode();
// The default value of Brdata\Enum\<database>\Volumes\00.
std::string ReadVolumeFolder(const std::string& database);

// The picture window's last placement under the current user; zeros when absent.
RECT ReadPictureBoxPlacement();
bool WritePictureBoxPlacement(const RECT& placement);

}  // namespace br
