// Every provider that does more than the pattern. The generated procedures include this, so that
// they see each specialisation of Provider_For before its use.
#ifndef VLN_SERVICES_PROVIDERS_H
#define VLN_SERVICES_PROVIDERS_H

#include "services/bridging/provider.h"
#include "services/channels/provider.h"
#include "services/configuration/provider.h"
#include "services/diagnostics/log_provider.h"
#include "services/diagnostics/settings_provider.h"
#include "services/diagnostics/test_provider.h"
#include "services/driver_parameters/provider.h"
#include "services/dump/provider.h"
#include "services/dump/settings_provider.h"
#include "services/fip/provider.h"
#include "services/firmware/provider.h"
#include "services/ip_tables/configuration_provider.h"
#include "services/ip_tables/provider.h"
#include "services/iscsi_settings/provider.h"
#include "services/nic_settings/provider.h"
#include "services/phy/provider.h"
#include "services/profiles/provider.h"
#include "services/record_logs/provider.h"
#include "services/wwn/provider.h"

#endif // VLN_SERVICES_PROVIDERS_H
