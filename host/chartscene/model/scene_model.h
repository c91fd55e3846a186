#pragma once
// A loaded chart scene: databases, datasets, objects and the display components, held by
// index. scene_loader.h reads it from a scene file (docs/chart-scene.md); the stand-in's
// COM wrappers answer the host interfaces over it. Texts are UTF-8 unless said otherwise.

#include <array>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "host/chartscene/model/S57Catalogue.h"

namespace br::chartscene {

// A VARIANT to be: its type and the value in the field that type uses.
struct TypedValue {
  enum class Type { Empty, I1, I2, I4, UI1, UI2, UI4, R4, R8, Text, Date, Bool, ByteList, WordList };
  Type type = Type::Empty;
  long long integer = 0;  // I1 .. UI4, Bool
  double real = 0;        // R4, R8, Date (days since 1899-12-30)
  std::string text;       // Text
  std::vector<unsigned> list;  // ByteList (VT_ARRAY|VT_UI1), WordList (VT_ARRAY|VT_UI2)
};

enum class DatabaseKind { Chart, User, Hierarchy };
enum class DataSetType { Vector, Raster, Library };
// How GetParameters hands out its array: VT_ARRAY|VT_VARIANT, VT_BYREF to one, or a
// VT_BYREF|VT_VARIANT to a VARIANT holding one.
enum class ParameterForm { Direct, ByReference, InVariant };

struct GeoPosition {
  double lat = 0;
  double lon = 0;
};

struct SceneAttributeModel {
  long code = 0;
  TypedValue value;
};

struct StoredFile {
  std::string name;   // the stream name
  std::string bytes;  // the file's content
};

struct SceneObjectModel {
  std::string name;   // the scene's handle for it, unique in the scene
  long classCode = 0;
  long primitive = 6;  // 1 point, 2 line, 3 area, 6 none
  std::vector<GeoPosition> geometry;
  std::vector<SceneAttributeModel> attributes;  // in file order
  std::vector<std::size_t> members;   // objects it holds (indices into SceneModel::objects)
  std::vector<std::size_t> holders;   // objects that hold it
  std::map<long, TypedValue> properties;  // GetProperty; 0 is the flag word (VT_UI4)
  std::string text;    // GetText
  std::vector<StoredFile> files;
  std::size_t dataSet = 0;
  std::uint32_t number = 0;  // the first 4 bytes of its identity, from 1
};

struct SceneDataSetModel {
  std::string id;  // 8 characters, '.'-padded: the last 8 bytes of its objects' identities
  DataSetType type = DataSetType::Vector;
  std::size_t database = 0;
  std::vector<unsigned char> header;      // the header record
  std::vector<TypedValue> parameters;     // GetParameters
  ParameterForm parameterForm = ParameterForm::Direct;
  std::map<long, TypedValue> properties;  // GetDataSetProperty
  std::vector<std::size_t> objects;
  std::vector<unsigned char> chartHeader;  // raster: GetChartHeader
  std::vector<unsigned char> chartIssue;   // raster: GetChartIssueRecord
};

struct SceneDatabaseModel {
  std::string name;
  DatabaseKind kind = DatabaseKind::Chart;
  std::array<unsigned char, 16> kindId{};
  std::vector<std::size_t> dataSets;
};

struct SceneProjectionModel {
  std::string name;
  bool mercator = true;
  double centreLat = 0, centreLon = 0;
  double pixelsPerDegree = 1000;
  long width = 1024, height = 768;
};

struct ScenePaletteModel {
  std::string name;
  std::vector<std::array<unsigned char, 3>> colours;  // red, green, blue
};

struct SceneColorMapModel {
  std::string name;
  std::map<long, unsigned short> indices;  // chart colour number -> palette index
};

struct ScenePresParamsModel {
  std::string name;
  std::map<long, TypedValue> values;
};

struct SceneModel {
  S57Catalogue catalogue;  // gdal-data's, with the scene's own entries
  std::vector<SceneDatabaseModel> databases;
  std::vector<SceneDataSetModel> dataSets;
  std::vector<SceneObjectModel> objects;
  std::vector<SceneProjectionModel> projections;
  std::vector<ScenePaletteModel> palettes;
  std::vector<SceneColorMapModel> colorMaps;
  std::vector<ScenePresParamsModel> presParams;
  std::map<std::string, std::uint32_t> faults;  // operation -> HRESULT
};

// The 16 kind bytes of each database kind (GeoData.h's GEOKIND_* and the stand-in's
// own user kind), as they lie in memory.
std::array<unsigned char, 16> KindBytes(DatabaseKind kind);

// The 16 identity bytes of an object (its number, then its dataset's id), and of a
// dataset itself (first 8 bytes zero).
std::array<unsigned char, 16> ObjectIdentity(const SceneModel& scene, std::size_t object);
std::array<unsigned char, 16> DataSetIdentity(const SceneModel& scene, std::size_t dataSet);

// The dataset named by an identity's last 8 bytes, and the object named by all 16;
// SIZE_MAX when there is none.
std::size_t FindDataSet(const SceneModel& scene, const unsigned char* identity);
std::size_t FindObject(const SceneModel& scene, const unsigned char* identity);

}  // namespace br::chartscene
