#include "frame/control/PropertyPagesFace.h"

namespace br::control {

STDMETHODIMP PropertyPagesFace::GetPages(CAUUID* pages) {
  if (!pages) return E_POINTER;
  pages->cElems = 0;
  pages->pElems = nullptr;
  return S_OK;
}

}  // namespace br::control
