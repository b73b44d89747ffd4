#include "parameterSchema.h"

#include <gtest/gtest.h>

namespace {

constexpr char expectedSchema[] = R"schema({
   "neighborPropDelayThreshold": {
      "dataType": "int",
      "range": [0, 4294967295],
      "default": 20000000,
      "hidden": false
   },
   "logAnnounceInterval": {
      "dataType": "int",
      "range": [-128, 127],
      "default": 1,
      "hidden": false
   },
   "logSyncInterval": {
      "dataType": "int",
      "range": [-128, 127],
      "default": 0,
      "hidden": false
   },
   "priority1": {
      "dataType": "int",
      "range": [0, 254],
      "default": 128,
      "hidden": false
   },
   "priority2": {
      "dataType": "int",
      "range": [0, 255],
      "default": 128,
      "hidden": false
   },
   "offsetScaledLogVariance": {
      "dataType": "int",
      "range": [0, 65535],
      "default": 65535,
      "hidden": false
   },
   "udsAddress": {
      "dataType": "string",
      "default": "/var/run/ptp4l_bc",
      "hidden": false
   },
   "transportSpecific": {
      "dataType": "string",
      "default": "0x0",
      "hidden": false
   },
   "syncReceiptTimeout": {
      "dataType": "int",
      "range": [0, 255],
      "default": 0,
      "hidden": false
   },
   "assumeTwoStep": {
      "dataType": "bool",
      "default": false,
      "hidden": false
   },
   "pathTraceEnabled": {
      "dataType": "bool",
      "default": false,
      "hidden": false
   },
   "followUpInfo": {
      "dataType": "bool",
      "default": false,
      "hidden": false
   },
   "networkTransport": {
      "dataType": "string",
      "default": "UDPv4RAW",
      "hidden": false
   },
   "delayMechanism": {
      "dataType": "string",
      "default": "E2E",
      "hidden": false
   },
   "configFile": {
      "dataType": "string",
      "default": "/var/run/morwen/ClockHub/ptp4l_bc.conf",
      "hidden": false
   },
   "ptpDstMac": {
      "dataType": "string",
      "default": "01:00:5e:00:01:81",
      "hidden": false
   }
}
)schema";

TEST(ParameterSchemaTest, HasItsExactText) {
    EXPECT_STREQ(zekelVantel::parameterSchema, expectedSchema);
}

TEST(ParameterSchemaTest, SizeIncludesTheTerminatingZero) {
    EXPECT_EQ(zekelVantel::parameterSchemaSize, 1882U);
    EXPECT_EQ(zekelVantel::parameterSchema[zekelVantel::parameterSchemaSize - 1], '\0');
}

} // namespace
