#pragma once
// The identities under which the component is registered. They are fixed once and never
// change: hosts and older registrations know the component by them.

namespace component {

inline constexpr const char* kTypeLibName = "POC_Dorvantos";
inline constexpr const char* kTypeLibId = "{2BE30317-D17F-4FAF-84D0-F670C351FB81}";
inline constexpr const char* kTypeLibVersion = "1.0";

inline constexpr const char* kGeneralClassName = "General";
inline constexpr const char* kGeneralProgId = "POC_Dorvantos.General";
inline constexpr const char* kGeneralClsid = "{CC42EEA1-F69A-4136-8E21-E6DBD817FDB7}";

inline constexpr const char* kGeneralDetailsClassName = "GeneralDetails";
inline constexpr const char* kGeneralDetailsProgId = "POC_Dorvantos.GeneralDetails";
inline constexpr const char* kGeneralDetailsClsid = "{3F2B4680-08F2-4543-B4F6-6E7BA99C2C2E}";

}  // namespace component
