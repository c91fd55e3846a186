#include "frame/com/ErrorInfoSupport.h"

namespace br::com {

STDMETHODIMP ErrorInfoSupport::InterfaceSupportsErrorInfo(REFIID riid) {
  return class_.dual && IsEqualIID(riid, *class_.dual) ? S_OK : S_FALSE;
}

}  // namespace br::com
