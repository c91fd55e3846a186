#pragma once
// Every user-interface text of the library: looked up by section and id in the outside
// text component (CLSID_TextTable), with the built-in English default in every other case.
// The component is reached through one process-wide cLocaliser, made on first use and
// destroyed when its last client leaves, or when the library is unloaded. All of it runs
// on the host's user-interface thread.

#include <windows.h>

#include <string>

namespace br {

// The component's text when it answers exactly S_OK, converted to the ANSI code page
// (an empty text stays empty); otherwise defaultText.
std::string GetText(const char* section, long id, const char* defaultText);

// The component's language identifier. Does not make the localiser: without one, or
// without a component, -1 and OLE_E_BLANK.
HRESULT GetLanguage(long* language);

// Objects that use texts (the inspector, the legend) register while they live. The last
// one to leave destroys the localiser, so the next use makes a new one.
void RegisterTextClient(const void* client);
void UnregisterTextClient(const void* client);

bool LocaliserExists();

// Module life. At process detach the localiser is only forgotten (no Release or
// CoUninitialize under the loader lock). When DllCanUnloadNow is about to let the library
// go, it is destroyed properly, if this is the thread that made it; answers whether it
// is gone.
void DropLocaliserAtDetach() noexcept;
bool DestroyLocaliserAtUnload();

}  // namespace br
