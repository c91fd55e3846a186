#include "frame/settings/localised_texts.h"

#include "GeoData.h"
#include "frame/settings/cLocaliser.h"

namespace br {

namespace {

// A plain pointer, never a static object: nothing of it may run during static
// destruction, when the component's DLL can be gone.
cLocaliser* theLocaliser = nullptr;

cLocaliser& Localiser() {
  if (theLocaliser == nullptr) theLocaliser = new cLocaliser(CLSID_TextTable);
  return *theLocaliser;
}

void DestroyLocaliser() {
  cLocaliser* localiser = theLocaliser;
  theLocaliser = nullptr;
  delete localiser;
}

}  // namespace

std::string GetText(const char* section, long id, const char* defaultText) {
  std::string text;
  if (Localiser().Lookup(section, id, text)) return text;
  return defaultText != nullptr ? defaultText : std::string();
}

HRESULT GetLanguage(long* language) {
  if (language == nullptr) return E_POINTER;
  *language = -1;
  if (theLocaliser == nullptr) return OLE_E_BLANK;
  return theLocaliser->Language(*language);
}

void RegisterTextClient(const void* client) { Localiser().AddClient(client); }

void UnregisterTextClient(const void* client) {
  if (theLocaliser != nullptr && theLocaliser->RemoveClient(client) && !theLocaliser->HasClients()) {
    DestroyLocaliser();
  }
}

bool LocaliserExists() { return theLocaliser != nullptr; }

void DropLocaliserAtDetach() noexcept {
  if (theLocaliser != nullptr) theLocaliser->Abandon();
  theLocaliser = nullptr;  // the small object itself is left to the process's end
}

bool DestroyLocaliserAtUnload() {
  if (theLocaliser == nullptr) return true;
  if (theLocaliser->Thread() != GetCurrentThreadId()) return false;
  DestroyLocaliser();
  return true;
}

}  // namespace br
