/// @file
#pragma once

#include "system/realDaemonScene.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetMgmtTlv.h"
#include "tPtp4lPortDataSetNpMgmtTlv.h"
#include "tPtp4lPortPropertiesMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"

/// Decoded data sets, written as linuxptp's client writes them.
RealDaemonScene::Report reportOf(const zekelVantel::tTimeStatus& data);
RealDaemonScene::Report reportOf(const zekelVantel::tParentDataSet& data);
RealDaemonScene::Report reportOf(const zekelVantel::tDefaultDataSet& data);
RealDaemonScene::Report reportOf(const zekelVantel::tPortDataSet& data);
RealDaemonScene::Report reportOf(const zekelVantel::tPortDataSetNp& data);
RealDaemonScene::Report reportOf(const zekelVantel::tPortProperties& data);
