/// @file
/// Memory management.
///
/// Sizes are in bytes. Numbers of 32 bits are refused above 2^32 - 1, with the operation's own failure,
/// although `unsigned long` has 64 here. Nothing throws: failures are null, false or 0. A pointer into an
/// object's storage is valid until that object frees, moves or destroys what it leads to.
#ifndef BASALT_MEMORY_H
#define BASALT_MEMORY_H

#include "basalt/memory/allocators.h"
#include "basalt/memory/block_allocator.h"
#include "basalt/memory/buffer.h"
#include "basalt/memory/memory_map.h"
#include "basalt/memory/page_sources.h"

#endif
