// How many semaphores and ports there are, for get_system_info(). Internal to this kit.
#pragma once

#include <SupportDefs.h>

uint32 count_semaphores();
uint32 count_ports();
