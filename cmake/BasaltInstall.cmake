# Package: headers, library, find_package(basalt) and basalt.pc.
