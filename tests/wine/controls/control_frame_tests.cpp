// The control frame as a container sees it, through TidesWindow: the interfaces it
// answers, status and extent, persistence, the data object and quick activation.
#include "tests/wine/common/event_sink.h"
#include "tests/wine/controls/graph_test_support.h"

#include <doctest/doctest.h>

using namespace br::test;

namespace {

SIZEL ScreenHimetric(int width, int height) {
  HDC screen = GetDC(nullptr);
  const int x = GetDeviceCaps(screen, LOGPIXELSX);
  const int y = GetDeviceCaps(screen, LOGPIXELSY);
  ReleaseDC(nullptr, screen);
  return SIZEL{MulDiv(width, 2540, x), MulDiv(height, 2540, y)};
}

}  // namespace

TEST_CASE("a control answers every control interface, one object behind them all") {
  DllUnderTest dll;
  GraphControl graph(dll);
  const IID* answered[] = {&IID_IUnknown, &IID_IDispatch, &IID_ITidesWindow, &IID_IViewObjectEx,
                           &IID_IViewObject2, &IID_IViewObject, &IID_IOleInPlaceObjectWindowless,
                           &IID_IOleInPlaceObject, &IID_IOleWindow, &IID_IOleInPlaceActiveObject,
                           &IID_IOleControl, &IID_IOleObject, &IID_IPersistStreamInit, &IID_IPersist,
                           &IID_IConnectionPointContainer, &IID_ISpecifyPropertyPages, &IID_IQuickActivate,
                           &IID_IPersistStorage, &IID_IDataObject, &IID_IProvideClassInfo,
                           &IID_IProvideClassInfo2, &IID_IEmbeddedControl, &IID_IUnitsOption};
  IUnknown* identity = Query<IUnknown>(graph.Get());
  for (const IID* iid : answered) {
    IUnknown* face = nullptr;
    CHECK(graph->QueryInterface(*iid, reinterpret_cast<void**>(&face)) == S_OK);
    REQUIRE(face != nullptr);
    IUnknown* back = Query<IUnknown>(face);
    CHECK(back == identity);
    back->Release();
    face->Release();
  }
  identity->Release();
  // (IObjectSafety is refused in the boundary suite.)
  IUnknown* none = nullptr;
  CHECK(graph->QueryInterface(IID_IPersistPropertyBag, reinterpret_cast<void**>(&none)) == E_NOINTERFACE);
  CHECK(none == nullptr);

  IProvideClassInfo2* info = Query<IProvideClassInfo2>(graph.Get());
  GUID events{};
  CHECK(info->GetGUID(GUIDKIND_DEFAULT_SOURCE_DISP_IID, &events) == S_OK);
  CHECK(IsEqualGUID(events, DIID__ITidesWindowEvents));
  info->Release();
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

// (MiscStatus is checked with quick activation, the user type's name with registration.)
TEST_CASE("class, extent and property pages") {
  DllUnderTest dll;
  GraphControl graph(dll);
  IOleObject* ole = Query<IOleObject>(graph.Get());
  CLSID clsid{};
  CHECK(ole->GetUserClassID(&clsid) == S_OK);
  CHECK(IsEqualCLSID(clsid, CLSID_TidesWindow));
  CHECK(ole->GetMiscStatus(DVASPECT_CONTENT, nullptr) == E_POINTER);

  // The first extent is the preferred size, 300 x 200 pixels.
  const SIZEL preferred = ScreenHimetric(300, 200);
  SIZEL extent{};
  CHECK(ole->GetExtent(DVASPECT_CONTENT, &extent) == S_OK);
  CHECK(extent.cx == preferred.cx);
  CHECK(extent.cy == preferred.cy);
  CHECK(ole->GetExtent(DVASPECT_ICON, &extent) == DV_E_DVASPECT);
  SIZEL wanted{5000, 4000};
  CHECK(ole->SetExtent(DVASPECT_CONTENT, &wanted) == S_OK);
  IViewObject2* view = Query<IViewObject2>(graph.Get());
  CHECK(view->GetExtent(DVASPECT_CONTENT, -1, nullptr, &extent) == S_OK);
  CHECK(extent.cx == 5000);
  CHECK(extent.cy == 4000);
  view->Release();
  ole->Release();

  ISpecifyPropertyPages* pages = Query<ISpecifyPropertyPages>(graph.Get());
  CAUUID list{7, reinterpret_cast<GUID*>(1)};
  CHECK(pages->GetPages(&list) == S_OK);
  CHECK(list.cElems == 0);
  CHECK(list.pElems == nullptr);
  pages->Release();
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("IViewObject::Draw refuses what it cannot draw on") {
  DllUnderTest dll;
  GraphControl graph(dll);
  IViewObjectEx* view = Query<IViewObjectEx>(graph.Get());
  Canvas canvas(50, 50);
  const RECTL bounds{0, 0, 50, 50};
  CHECK(view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, nullptr, &bounds, nullptr, nullptr, 0) ==
        E_INVALIDARG);
  CHECK(view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, canvas.Dc(), nullptr, nullptr, nullptr, 0) ==
        E_INVALIDARG);
  CHECK(view->Draw(DVASPECT_ICON, -1, nullptr, nullptr, nullptr, canvas.Dc(), &bounds, nullptr, nullptr, 0) ==
        DV_E_DVASPECT);
  const RECTL empty{10, 10, 10, 40};
  CHECK(view->Draw(DVASPECT_CONTENT, -1, nullptr, nullptr, nullptr, canvas.Dc(), &empty, nullptr, nullptr, 0) ==
        S_OK);
  CHECK(canvas.Count(RGB(0x12, 0x34, 0x56), 0, 0, 50, 50) == 2500);  // nothing drawn
  DWORD viewStatus = 0;
  CHECK(view->GetViewStatus(&viewStatus) == S_OK);
  CHECK(viewStatus == (VIEWSTATUS_OPAQUE | VIEWSTATUS_SOLIDBKGND));
  DWORD hit = 0;
  const RECT box{0, 0, 100, 50};
  CHECK(view->QueryHitPoint(DVASPECT_CONTENT, &box, POINT{20, 20}, 0, &hit) == S_OK);
  CHECK(hit == HITRESULT_HIT);
  CHECK(view->QueryHitPoint(DVASPECT_CONTENT, &box, POINT{120, 20}, 0, &hit) == S_OK);
  CHECK(hit == HITRESULT_OUTSIDE);
  view->Release();
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("the saved state carries the extent through a stream and a storage") {
  DllUnderTest dll;
  GraphControl first(dll);
  GraphControl second(dll);
  IOleObject* ole = Query<IOleObject>(first.Get());
  SIZEL wanted{6123, 3456};
  REQUIRE(ole->SetExtent(DVASPECT_CONTENT, &wanted) == S_OK);
  ole->Release();

  IPersistStreamInit* saver = Query<IPersistStreamInit>(first.Get());
  CHECK(saver->IsDirty() == S_OK);
  ULARGE_INTEGER size{};
  CHECK(saver->GetSizeMax(&size) == S_OK);
  CHECK(size.QuadPart == 12);
  IStream* stream = nullptr;
  REQUIRE(CreateStreamOnHGlobal(nullptr, TRUE, &stream) == S_OK);
  CHECK(saver->Save(stream, TRUE) == S_OK);
  CHECK(saver->IsDirty() == S_FALSE);
  CLSID clsid{};
  CHECK(saver->GetClassID(&clsid) == S_OK);
  CHECK(IsEqualCLSID(clsid, CLSID_TidesWindow));
  saver->Release();

  IPersistStreamInit* loader = Query<IPersistStreamInit>(second.Get());
  CHECK(loader->InitNew() == S_OK);
  LARGE_INTEGER start{};
  stream->Seek(start, STREAM_SEEK_SET, nullptr);
  CHECK(loader->Load(stream) == S_OK);
  // A short stream, a stranger's bytes and no stream are refused without harm.
  CHECK(loader->Load(stream) == E_FAIL);  // nothing left to read
  IStream* junk = nullptr;
  REQUIRE(CreateStreamOnHGlobal(nullptr, TRUE, &junk) == S_OK);
  const char bytes[12] = "not a state";
  junk->Write(bytes, sizeof bytes, nullptr);
  junk->Seek(start, STREAM_SEEK_SET, nullptr);
  CHECK(loader->Load(junk) == E_FAIL);
  junk->Release();
  CHECK(loader->Load(nullptr) == E_POINTER);
  loader->Release();
  stream->Release();
  IOleObject* secondOle = Query<IOleObject>(second.Get());
  SIZEL extent{};
  CHECK(secondOle->GetExtent(DVASPECT_CONTENT, &extent) == S_OK);
  CHECK(extent.cx == 6123);
  CHECK(extent.cy == 3456);

  // The same through a compound-file storage, into a third control.
  ILockBytes* bytesOnMemory = nullptr;
  REQUIRE(CreateILockBytesOnHGlobal(nullptr, TRUE, &bytesOnMemory) == S_OK);
  IStorage* storage = nullptr;
  REQUIRE(StgCreateDocfileOnILockBytes(bytesOnMemory, STGM_CREATE | STGM_READWRITE | STGM_SHARE_EXCLUSIVE, 0,
                                       &storage) == S_OK);
  IPersistStorage* storageSaver = Query<IPersistStorage>(second.Get());
  CHECK(storageSaver->Save(storage, FALSE) == S_OK);
  CHECK(storageSaver->SaveCompleted(nullptr) == S_OK);
  storageSaver->Release();
  GraphControl third(dll);
  IPersistStorage* storageLoader = Query<IPersistStorage>(third.Get());
  CHECK(storageLoader->Load(storage) == S_OK);
  CHECK(storageLoader->Load(nullptr) == E_POINTER);
  storageLoader->Release();
  IOleObject* thirdOle = Query<IOleObject>(third.Get());
  CHECK(thirdOle->GetExtent(DVASPECT_CONTENT, &extent) == S_OK);
  CHECK(extent.cx == 6123);
  thirdOle->Release();
  secondOle->Release();
  storage->Release();
  bytesOnMemory->Release();
  third.Release();
  second.Release();
  first.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("the data object gives the picture as an enhanced metafile and a metafile picture") {
  DllUnderTest dll;
  GraphControl graph(dll);
  IDataObject* data = Query<IDataObject>(graph.Get());
  FORMATETC enhanced{CF_ENHMETAFILE, nullptr, DVASPECT_CONTENT, -1, TYMED_ENHMF};
  FORMATETC picture{CF_METAFILEPICT, nullptr, DVASPECT_CONTENT, -1, TYMED_MFPICT};
  FORMATETC text{CF_TEXT, nullptr, DVASPECT_CONTENT, -1, TYMED_HGLOBAL};
  CHECK(data->QueryGetData(&enhanced) == S_OK);
  CHECK(data->QueryGetData(&picture) == S_OK);
  CHECK(data->QueryGetData(&text) == DV_E_FORMATETC);
  FORMATETC wrongMedium{CF_ENHMETAFILE, nullptr, DVASPECT_CONTENT, -1, TYMED_HGLOBAL};
  CHECK(data->QueryGetData(&wrongMedium) == DV_E_TYMED);

  STGMEDIUM medium{};
  REQUIRE(data->GetData(&enhanced, &medium) == S_OK);
  REQUIRE(medium.tymed == TYMED_ENHMF);
  Canvas played(300, 200);
  const RECT all{0, 0, 300, 200};
  CHECK(PlayEnhMetaFile(played.Dc(), medium.hEnhMetaFile, &all));
  ReleaseStgMedium(&medium);
  CHECK(played.At(150, 100) == kNightColour);  // the empty night plot of a graph without a port
  CHECK(played.At(4, 100) == kFrameColour);

  STGMEDIUM old{};
  REQUIRE(data->GetData(&picture, &old) == S_OK);
  CHECK(old.tymed == TYMED_MFPICT);
  auto* description = static_cast<METAFILEPICT*>(GlobalLock(old.hMetaFilePict));
  REQUIRE(description != nullptr);
  CHECK(description->mm == MM_ANISOTROPIC);
  CHECK(description->xExt == ScreenHimetric(300, 200).cx);
  CHECK(description->hMF != nullptr);
  GlobalUnlock(old.hMetaFilePict);
  ReleaseStgMedium(&old);

  IEnumFORMATETC* formats = nullptr;
  REQUIRE(data->EnumFormatEtc(DATADIR_GET, &formats) == S_OK);
  FORMATETC listed[3]{};
  ULONG fetched = 0;
  formats->Next(3, listed, &fetched);
  CHECK(fetched == 2);
  CHECK(listed[0].cfFormat == CF_ENHMETAFILE);
  formats->Release();
  CHECK(data->GetData(&text, &medium) == DV_E_FORMATETC);
  data->Release();
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("quick activation takes the site and connects the event sink") {
  DllUnderTest dll;
  EventSink sink(DIID__ITidesWindowEvents);
  GraphControl graph(dll);
  IQuickActivate* quick = Query<IQuickActivate>(graph.Get());
  QACONTAINER container{};
  container.cbSize = sizeof(container);
  container.pUnkEventSink = static_cast<IDispatch*>(&sink);
  QACONTROL control{};
  control.cbSize = sizeof(control);
  control.dwPointerActivationPolicy = 77;
  CHECK(quick->QuickActivate(&container, &control) == S_OK);
  CHECK(control.dwMiscStatus == 131473);
  CHECK(control.dwViewStatus == (VIEWSTATUS_OPAQUE | VIEWSTATUS_SOLIDBKGND));
  CHECK(control.dwEventCookie != 0);
  CHECK(control.dwPointerActivationPolicy == 0);
  CHECK(sink.References() == 1);
  CHECK(quick->QuickActivate(nullptr, &control) == E_POINTER);
  QACONTROL tooSmall{};
  tooSmall.cbSize = 8;
  CHECK(quick->QuickActivate(&container, &tooSmall) == E_INVALIDARG);

  IConnectionPointContainer* points = Query<IConnectionPointContainer>(graph.Get());
  IConnectionPoint* point = nullptr;
  REQUIRE(points->FindConnectionPoint(DIID__ITidesWindowEvents, &point) == S_OK);
  CHECK(point->Unadvise(control.dwEventCookie) == S_OK);
  CHECK(sink.References() == 0);
  point->Release();
  points->Release();
  SIZEL content{1000, 2000};
  CHECK(quick->SetContentExtent(&content) == S_OK);
  SIZEL back{};
  CHECK(quick->GetContentExtent(&back) == S_OK);
  CHECK(back.cx == 1000);
  quick->Release();
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
