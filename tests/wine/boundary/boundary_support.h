// Building blocks of the boundary matrices: VARIANTs and SAFEARRAYs of every awkward form,
// late-bound calls made the way script hosts make them, and marker values that a call
// which fails must leave where they were.
#pragma once

#include <windows.h>
#include <oaidl.h>
#include <oleauto.h>

#include <initializer_list>
#include <limits>
#include <string>
#include <vector>

namespace br::test::boundary {

inline const double kNaN = std::numeric_limits<double>::quiet_NaN();
inline const double kInfinity = std::numeric_limits<double>::infinity();
inline const double kLargest = std::numeric_limits<double>::max();
inline const double kSmallestDenormal = std::numeric_limits<double>::denorm_min();

// Written into out-parameters before a call that must not write them.
inline constexpr double kUntouchedDouble = -12345.678;
inline constexpr long kUntouchedLong = -777;
// An interface pointer value that no call may use, release or overwrite with a valid one.
inline IUnknown* const kUntouchedUnknown = reinterpret_cast<IUnknown*>(static_cast<UINT_PTR>(0x0BADF00D));

// One owned VARIANT. The factories below build the forms the matrices need.
class Variant {
public:
  Variant() { VariantInit(&v_); }
  ~Variant() { VariantClear(&v_); }
  Variant(Variant&& other) noexcept : v_(other.v_) { VariantInit(&other.v_); }
  Variant& operator=(Variant&& other) noexcept;
  Variant(const Variant&) = delete;
  Variant& operator=(const Variant&) = delete;

  static Variant Empty();
  static Variant Null();
  static Variant I2(SHORT value);
  static Variant I4(LONG value);
  static Variant UI1(BYTE value);
  static Variant R4(float value);
  static Variant R8(double value);
  static Variant Date(double value);
  static Variant Bool(bool value);
  static Variant Error(SCODE value);
  static Variant Bstr(const std::wstring& text);  // embedded zeros kept
  static Variant NullBstr();                       // VT_BSTR holding a null BSTR
  static Variant Unknown(IUnknown* object);        // takes its own reference; null allowed
  static Variant Dispatch(IDispatch* object);      // takes its own reference; null allowed
  static Variant Array(VARTYPE arrayType, SAFEARRAY* array);  // VT_ARRAY | arrayType, owns array
  // By-reference forms: the target is borrowed and must outlive the Variant.
  static Variant RefVariant(VARIANT* target);      // VT_BYREF | VT_VARIANT
  static Variant RefI4(LONG* target);
  static Variant RefR8(double* target);
  static Variant RefBstr(BSTR* target);
  static Variant RefUnknown(IUnknown** target);
  static Variant RefArray(VARTYPE arrayType, SAFEARRAY** target);  // VT_BYREF | VT_ARRAY | type

  VARIANT& get() { return v_; }
  const VARIANT& get() const { return v_; }
  VARTYPE vt() const { return v_.vt; }

private:
  VARIANT v_;
};

// A SAFEARRAY of the element type with the given bounds (one SAFEARRAYBOUND per
// dimension, as SafeArrayCreate takes them), every element zero.
SAFEARRAY* MakeArray(VARTYPE type, std::initializer_list<SAFEARRAYBOUND> bounds);
// A one-dimensional VT_I4 array holding values, lower bound lower.
SAFEARRAY* MakeLongArray(const std::vector<LONG>& values, LONG lower = 0);
// A one-dimensional array of count interface pointers (each with its own reference).
SAFEARRAY* MakeUnknownArray(const std::vector<IUnknown*>& objects, LONG lower = 0);
// A one-dimensional array of count elements of elementSize bytes and no element type,
// as a client that builds its descriptor by hand makes it.
SAFEARRAY* MakeRawArray(ULONG elementSize, ULONG count);

// A two-dimensional descriptor of interface pointers with no elements at all (one
// dimension is empty) whose other dimension claims `claimed` elements, over `data`, which
// it neither owns nor frees: an array that holds nothing however long a dimension says it is.
SAFEARRAY* MakeEmptyTwoDimensionArray(IUnknown** data, ULONG claimed, bool emptyFirst);

// A descriptor with no dimensions at all: the automation functions refuse to make one, so
// it lives in static storage; never destroy it or clear a VARIANT that holds it.
SAFEARRAY* ZeroDimensionArray();

// One late-bound call through IDispatch::Invoke, arguments given in call order.
class LateCall {
public:
  LateCall(IDispatch* target, DISPID id, WORD flags = DISPATCH_METHOD);
  ~LateCall();
  LateCall(const LateCall&) = delete;
  LateCall& operator=(const LateCall&) = delete;

  LateCall& Arg(Variant value);
  LateCall& Interface(const IID& riid);  // instead of IID_NULL
  LateCall& NoParams();                  // a null DISPPARAMS pointer
  HRESULT Run();

  VARIANT result;         // cleared by the destructor
  EXCEPINFO exception{};  // strings freed by the destructor
  UINT argumentError = 0xFFFFFFFF;

private:
  IDispatch* target_;
  DISPID id_;
  WORD flags_;
  IID iid_ = IID_NULL;
  bool noParams_ = false;
  std::vector<Variant> args_;
};

// The scode of a late-bound failure: the exception's scode for DISP_E_EXCEPTION, else the
// result itself.
HRESULT LateResult(HRESULT hr, const EXCEPINFO& exception);

}  // namespace br::test::boundary
