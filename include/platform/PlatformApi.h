// Marks what a platform library exports. The platform libraries are built with hidden
// visibility, so only what carries this mark is part of their interface.
#pragma once

#define QELO_PLATFORM_API __attribute__((visibility("default")))
