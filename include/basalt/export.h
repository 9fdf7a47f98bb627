// BASALT_API marks what leaves the shared library; everything else stays hidden inside it.
#ifndef BASALT_EXPORT_H
#define BASALT_EXPORT_H

#define BASALT_API __attribute__((visibility("default")))

#endif
