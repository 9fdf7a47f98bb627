// BASALT_API marks what leaves the shared library; everything else stays hidden inside it. BASALT_LOCAL marks
// the members of an exported class that no caller can reach.
#ifndef BASALT_EXPORT_H
#define BASALT_EXPORT_H

#define BASALT_API __attribute__((visibility("default")))
#define BASALT_LOCAL __attribute__((visibility("hidden")))

#endif
