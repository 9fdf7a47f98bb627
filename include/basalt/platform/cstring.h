/// @file
/// CString, the interface's wide text type.
#ifndef BASALT_PLATFORM_CSTRING_H
#define BASALT_PLATFORM_CSTRING_H

#endif
