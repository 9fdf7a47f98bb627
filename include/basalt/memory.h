/// @file
/// Memory management.
///
/// Sizes are in bytes. Where a size has 32 bits, values above 2^32 - 1 are refused with the operation's own
/// failure, although `unsigned long` has 64 bits here. Nothing throws: failures are null, false or 0. A
/// pointer into an object's storage is valid until that object frees, moves or destroys the block.
#ifndef BASALT_MEMORY_H
#define BASALT_MEMORY_H

#include "basalt/memory/allocators.h"
#include "basalt/memory/block_allocator.h"
#include "basalt/memory/buffer.h"
#include "basalt/memory/memory_map.h"
#include "basalt/memory/page_sources.h"

#endif
