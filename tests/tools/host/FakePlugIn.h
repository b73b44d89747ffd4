/// @file
#pragma once

/// What zekeltr_stop does, in the fakes that have it.
void stopFake(void** slot);
