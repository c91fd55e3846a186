#include "host/chartscene/model/scene_model.h"

#include <cstdint>
#include <cstring>

namespace br::chartscene {

std::array<unsigned char, 16> KindBytes(DatabaseKind kind) {
  switch (kind) {
    case DatabaseKind::Chart:  // {C3A9BCDF-3E0D-44FD-9A26-EBAFA78835D7}
      return {0xDF, 0xBC, 0xA9, 0xC3, 0x0D, 0x3E, 0xFD, 0x44, 0x9A, 0x26, 0xEB, 0xAF, 0xA7, 0x88, 0x35, 0xD7};
    case DatabaseKind::Hierarchy:  // {00000000-0000-0000-4353-490000000000}
      return {0, 0, 0, 0, 0, 0, 0, 0, 'C', 'S', 'I', 0, 0, 0, 0, 0};
    case DatabaseKind::User:  // {9B73BC4C-B16D-46D4-8ED2-8353BC74C97B}, the stand-in's own
    default:
      return {0x4C, 0xBC, 0x73, 0x9B, 0x6D, 0xB1, 0xD4, 0x46, 0x8E, 0xD2, 0x83, 0x53, 0xBC, 0x74, 0xC9, 0x7B};
  }
}

std::array<unsigned char, 16> DataSetIdentity(const SceneModel& scene, std::size_t dataSet) {
  std::array<unsigned char, 16> identity{};
  const std::string& id = scene.dataSets[dataSet].id;
  std::memcpy(identity.data() + 8, id.data(), id.size() < 8 ? id.size() : 8);
  return identity;
}

std::array<unsigned char, 16> ObjectIdentity(const SceneModel& scene, std::size_t object) {
  const SceneObjectModel& model = scene.objects[object];
  std::array<unsigned char, 16> identity = DataSetIdentity(scene, model.dataSet);
  for (int i = 0; i < 4; ++i) identity[static_cast<std::size_t>(i)] = static_cast<unsigned char>(model.number >> (8 * i));
  return identity;
}

std::size_t FindDataSet(const SceneModel& scene, const unsigned char* identity) {
  if (identity == nullptr) return SIZE_MAX;
  for (std::size_t i = 0; i < scene.dataSets.size(); ++i) {
    if (std::memcmp(scene.dataSets[i].id.data(), identity + 8, 8) == 0) return i;
  }
  return SIZE_MAX;
}

std::size_t FindObject(const SceneModel& scene, const unsigned char* identity) {
  const std::size_t dataSet = FindDataSet(scene, identity);
  if (dataSet == SIZE_MAX) return SIZE_MAX;
  std::uint32_t number = 0;
  for (int i = 3; i >= 0; --i) number = (number << 8) | identity[i];
  for (int i = 4; i < 8; ++i) {
    if (identity[i] != 0) return SIZE_MAX;
  }
  // Objects are numbered from 1 in dataset order: look there first, so a lookup by
  // identity costs no walk through a large dataset.
  const std::vector<std::size_t>& objects = scene.dataSets[dataSet].objects;
  if (number >= 1 && number <= objects.size() && scene.objects[objects[number - 1]].number == number) {
    return objects[number - 1];
  }
  for (std::size_t object : objects) {
    if (scene.objects[object].number == number) return object;
  }
  return SIZE_MAX;
}

}  // namespace br::chartscene
