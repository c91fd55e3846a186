#include "frame/settings/settings.h"

#include "frame/settings/cRegSettings.h"

namespace br {

namespace {
constexpr const char* PLACEMENT_LEFT = "left";
constexpr const char* PLACEMENT_TOP = "top";
constexpr const char* PLACEMENT_RIGHT = "right";
constexpr const char* PLACEMENT_BOTTOM = "bottom";

LONG ReadPlacementValue(const char* name) {
  return static_cast<LONG>(cRegSettings::User().ReadDword(SETTINGS_PICTURE_BOX_KEY, name, 0));
}

bool WritePlacementValue(const char* name, LONG value) {
  return cRegSettings::User().WriteDword(SETTINGS_PICTURE_BOX_KEY, name,
                                         static_cast<DWORD>(value));
}
}  // namespace

std::string ReadKeyPath() {
  return cRegSettings::Machine().ReadString(SETTINGS_ENUM_KEY, SETTING_KEY_PATH, "");
}

std::string ReadBasesStore() {
  return cRegSettings::Machine().ReadString(SETTINGS_ENUM_KEY, SETTING_BASES_STORE, "");
}

DWORD ReadTreeMode() {
  return cRegSettings::Machine().ReadDword(SETTINGS_ENUM_KEY, SETTING_TREE_MODE, 0);
}

std::string ReadVolumeFolder(const std::string& database) {
  const std::string subkey = std::string(SETTINGS_ENUM_KEY) + "\\" + database + "\\Volumes\\00";
  return cRegSettings::Machine().ReadString(subkey.c_str(), nullptr, "");
}

RECT ReadPictureBoxPlacement() {
  RECT placement;
  placement.left = ReadPlacementValue(PLACEMENT_LEFT);
  placement.top = ReadPlacementValue(PLACEMENT_TOP);
  placement.right = ReadPlacementValue(PLACEMENT_RIGHT);
  placement.bottom = ReadPlacementValue(PLACEMENT_BOTTOM);
  return placement;
}

bool WritePictureBoxPlacement(const RECT& placement) {
  // Write all four even if one fails, so a partial failure leaves the most behind.
  bool ok = WritePlacementValue(PLACEMENT_LEFT, placement.left);
  ok = WritePlacementValue(PLACEMENT_TOP, placement.top) && ok;
  ok = WritePlacementValue(PLACEMENT_RIGHT, placement.right) && ok;
  ok = WritePlacementValue(PLACEMENT_BOTTOM, placement.bottom) && ok;
  return ok;
}

}  // namespace br
