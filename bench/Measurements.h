/// @file
#pragma once

class Program;

// Each adds one measurement to a program.
void addDelay(Program& program);
void addHostFootprint(Program& program);
void addInitializeCost(Program& program);
void addMetricsCost(Program& program);
void addPollCost(Program& program);
void addPollInstructions(Program& program);
void addPollLine(Program& program);
void addReportCost(Program& program);
void addSessionTimes(Program& program);
