// The boundary of every COM method: nothing thrown inside may cross it. Guarded() runs
// the body and turns whatever it throws into an HRESULT (with error information):
//   cComError     -> its HRESULT
//   std::bad_alloc -> E_OUTOFMEMORY
//   cErr, a plain int (the source line of a failed step), std::exception, anything else
//                 -> E_FAIL
// Usage:  STDMETHODIMP Foo::Bar(long x) { return Guarded(kClass, [&] { ...; return S_OK; }); }
#pragma once

#include "frame/com/ClassIdentity.h"
#include "frame/errors/cComError.h"
#include "frame/errors/cErr.h"

#include <exception>
#include <new>

namespace br::com {

// Reports one caught value; each returns the HRESULT the method gives back.
HRESULT CaughtComError(const ClassIdentity& cls, HRESULT hr) noexcept;
HRESULT CaughtLibraryError(const ClassIdentity& cls, std::uint32_t code) noexcept;
HRESULT CaughtLine(const ClassIdentity& cls, int line) noexcept;
HRESULT CaughtStdException(const ClassIdentity& cls, const char* what) noexcept;
HRESULT CaughtUnknown(const ClassIdentity& cls) noexcept;

template <class Body>
HRESULT Guarded(const ClassIdentity& cls, Body&& body) noexcept {
  try {
    return body();
  } catch (const cComError& e) {
    return CaughtComError(cls, e.Error());
  } catch (const cErr& e) {
    return CaughtLibraryError(cls, e.code());
  } catch (int line) {
    return CaughtLine(cls, line);
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  } catch (const std::exception& e) {
    return CaughtStdException(cls, e.what());
  } catch (...) {
    return CaughtUnknown(cls);
  }
}

}  // namespace br::com
