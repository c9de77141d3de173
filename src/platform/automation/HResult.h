#pragma once
// Status codes of the in-process server entry points, numbered as COM numbers them so
// that a code read in a log means what it means on Windows.

#include <cstdint>
#include <string>

namespace automation {

using HRESULT = int32_t;

inline constexpr HRESULT S_OK = 0;
inline constexpr HRESULT S_FALSE = 1;
inline constexpr HRESULT E_UNEXPECTED = static_cast<HRESULT>(0x8000FFFFu);
inline constexpr HRESULT E_POINTER = static_cast<HRESULT>(0x80004003u);
inline constexpr HRESULT E_FAIL = static_cast<HRESULT>(0x80004005u);
inline constexpr HRESULT E_OUTOFMEMORY = static_cast<HRESULT>(0x8007000Eu);
inline constexpr HRESULT E_INVALIDARG = static_cast<HRESULT>(0x80070057u);
inline constexpr HRESULT CLASS_E_CLASSNOTAVAILABLE = static_cast<HRESULT>(0x80040111u);
inline constexpr HRESULT SELFREG_E_TYPELIB = static_cast<HRESULT>(0x80040200u);
inline constexpr HRESULT SELFREG_E_CLASS = static_cast<HRESULT>(0x80040201u);

inline constexpr bool SUCCEEDED(HRESULT hr) { return hr >= 0; }
inline constexpr bool FAILED(HRESULT hr) { return hr < 0; }

// "0x80040111 (class not available)": the code in hexadecimal and what it means.
std::string HResultText(HRESULT hr);

// The description a server leaves behind when an entry point fails, as COM's
// SetErrorInfo does: the status code alone cannot say which file or key was at fault.
// One slot per thread; taking it empties it.
void SetErrorInfo(std::string description);
std::string TakeErrorInfo();

}  // namespace automation
