#pragma once
// The one process-wide holder of the outside text component (ITextTable). Made on the
// first text lookup or client registration: COM for the thread, the component, its table
// "BRInfo.csv". When any step fails it stays without a component, and the attempt is not
// repeated while it lives. Its clients (the objects that use texts) decide its lifetime;
// see localised_texts.h.

#include <windows.h>

#include <string>
#include <vector>

#include "GeoData.h"

namespace br {

class cLocaliser {
public:
  explicit cLocaliser(REFCLSID component);
  // Releases the component and undoes the COM initialisation it made, on the thread that
  // made it; call it from no other.
  ~cLocaliser();
  cLocaliser(const cLocaliser&) = delete;
  cLocaliser& operator=(const cLocaliser&) = delete;

  bool HasComponent() const { return table_ != nullptr; }
  DWORD Thread() const { return thread_; }

  // True with the component's text when it answers exactly S_OK (a null text is empty);
  // the returned string is freed whatever the answer.
  bool Lookup(const char* section, long id, std::string& text) const;
  // The component's language; OLE_E_BLANK without a component.
  HRESULT Language(long& language) const;

  // A set: adding an object twice keeps it once. Remove answers whether it was there.
  void AddClient(const void* client);
  bool RemoveClient(const void* client);
  bool HasClients() const { return !clients_.empty(); }

  // Forgets the component without calling into it: at process detach the loader lock is
  // held and the component's DLL may be gone already.
  void Abandon() noexcept;

private:
  ITextTable* table_ = nullptr;
  bool comInitialised_ = false;
  DWORD thread_ = 0;
  std::vector<const void*> clients_;
};

}  // namespace br
