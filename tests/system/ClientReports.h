/// @file
#pragma once

#include "system/BoundaryClock.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"

/// Decoded data sets, written as linuxptp's client writes them.
Report reportOf(const zekelVantel::tTimeStatus& data);
Report reportOf(const zekelVantel::tParentDataSet& data);
Report reportOf(const zekelVantel::tDefaultDataSet& data);
Report reportOf(const zekelVantel::tPortDataSet& data);
Report reportOf(const zekelVantel::tPortDataSetNp& data);
Report reportOf(const zekelVantel::tPortProperties& data);
