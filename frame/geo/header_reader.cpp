#include "frame/geo/header_reader.h"

namespace br::geo {

namespace {

// Destroys what the host handed over, whatever the call's result.
class SafeArrayOwner {
public:
  ~SafeArrayOwner() {
    if (array_) SafeArrayDestroy(array_);
  }
  SAFEARRAY** Out() { return &array_; }
  SAFEARRAY* Get() const { return array_; }

private:
  SAFEARRAY* array_ = nullptr;
};

HRESULT ParseHeaderArray(HRESULT hr, SAFEARRAY* array, DataSetHeader& header) {
  if (FAILED(hr)) {
    return hr;
  }
  std::vector<unsigned char> bytes;
  if (!ReadByteArray(array, kDataSetHeaderSize, bytes)) {
    return E_INVALIDARG;
  }
  header = ParseDataSetHeader(bytes.data(), bytes.size());
  return S_OK;
}

}  // namespace

bool ReadByteArray(SAFEARRAY* array, std::size_t maxBytes, std::vector<unsigned char>& bytes) {
  bytes.clear();
  VARTYPE type = VT_EMPTY;
  if (array == nullptr || SafeArrayGetDim(array) != 1 || SafeArrayGetElemsize(array) != 1 ||
      FAILED(SafeArrayGetVartype(array, &type)) || type != VT_UI1) {
    return false;
  }
  // Only what the record can use is copied: a count larger than the data behind it
  // cannot lead the copy further than maxBytes.
  const ULONG count = array->rgsabound[0].cElements;
  const std::size_t wanted = count < maxBytes ? count : maxBytes;
  void* data = nullptr;
  if (FAILED(SafeArrayAccessData(array, &data))) {
    return false;
  }
  if (data != nullptr) {
    bytes.assign(static_cast<const unsigned char*>(data),
                 static_cast<const unsigned char*>(data) + wanted);
  }
  SafeArrayUnaccessData(array);
  return data != nullptr || wanted == 0;
}

HRESULT ReadDataSetHeader(IGeoDataSet* dataSet, DataSetHeader& header) {
  if (dataSet == nullptr) {
    return E_POINTER;
  }
  SafeArrayOwner array;
  const HRESULT hr = dataSet->GetHeader(array.Out());
  return ParseHeaderArray(hr, array.Get(), header);
}

HRESULT ReadDataSetHeader(IGeoDatabase* database, REFGUID id, DataSetHeader& header) {
  if (database == nullptr) {
    return E_POINTER;
  }
  SafeArrayOwner array;
  const HRESULT hr = database->GetDataSetHeader(id, array.Out());
  return ParseHeaderArray(hr, array.Get(), header);
}

}  // namespace br::geo
