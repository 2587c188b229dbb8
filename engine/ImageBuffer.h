// The buffer for a device image or a part of it.
#pragma once

#include "framework/ScratchBuffer.h"

/// The data of one request, at most 250 bytes on a serial line, fits without the heap.
using ImageBuffer = ScratchBuffer<256>;
