// Flags of CIM_ElementSettingData: in which way a setting is one of its element's.
#ifndef VLN_AGENT_ELEMENT_SETTING_H
#define VLN_AGENT_ELEMENT_SETTING_H

#include "cimple/types.h"

namespace cimple {

inline constexpr uint16 SETTING_IS = 1;
inline constexpr uint16 SETTING_IS_NOT = 2;

} // namespace cimple

#endif // VLN_AGENT_ELEMENT_SETTING_H
