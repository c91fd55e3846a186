// A scene written by a test and loaded into the stand-in chart host (ChartScene.Scene,
// called through IDispatch): object records, databases, objects and their identity texts.
#pragma once

#include "tests/wine/common/DllUnderTest.h"

#include <string>
#include <vector>

namespace br::test {

// A scene file in the temporary folder, loaded into a ChartScene.Scene (REQUIREd).
class TestScene {
public:
  explicit TestScene(const std::string& json);
  ~TestScene();
  TestScene(const TestScene&) = delete;
  TestScene& operator=(const TestScene&) = delete;

  // Records of the named objects ("a, b, dataset:ID"): VT_ARRAY|VT_UI1, the caller clears it.
  VARIANT Records(const wchar_t* names);
  // The raw bytes of those records.
  std::vector<unsigned char> RecordBytes(const wchar_t* names);
  ComRef<IUnknown> Database(const wchar_t* name);
  ComRef<IUnknown> Object(const wchar_t* name);
  std::wstring ObjectId(const wchar_t* name);

private:
  VARIANT Call(const wchar_t* method, VARIANT* argument);
  std::wstring path_;
  ComRef<IDispatch> scene_;
};

// The identity text with its first 8 bytes zero.
std::wstring DataSetIdText(const std::wstring& objectId);

}  // namespace br::test
