/// @file
/// Environment queries: operating-system and handheld codes, language, display and two small utilities; the
/// folders that the host configures; the identifier replacement table; conversions of text in fixed buffers.
///
/// No call takes a lock. Only _tempFilePath() and _REPLACE_LOAD() can fail, when out of memory. Values that
/// are determined once are stored until the library is unloaded; two threads that make the first query at
/// once both store the same value.
#ifndef BASALT_FRAME_H
#define BASALT_FRAME_H

#include <cstdint>

#include "basalt/export.h"
#include "basalt/platform/cstring.h"

/// Operating-system release code:
///
/// | code | release                    | code | release                        |
/// |-----:|----------------------------|-----:|--------------------------------|
/// | 0    | not determined             | 6    | Windows 2000                   |
/// | 1    | Win32s                     | 7    | Windows XP, Server 2003        |
/// | 2    | Windows 95                 | 9    | Windows Vista, Server 2008     |
/// | 3    | Windows 98                 | 10   | Windows 7                      |
/// | 4    | Windows Me                 | 11   | Windows 8                      |
/// | 5    | Windows NT 4.0             |      |                                |
///
/// There is no code 8. Codes compare by magnitude: a later release of the NT family has a higher code.
using basalt_os = std::uint32_t;

/// Handheld platform code: 0 not determined, 1 the desktop. The capability queries below also know 3, 5 to
/// 11, 13 and 14, which no detection of this library yields.
using basalt_hh = std::uint32_t;

/// Language setting, a code defined by the host; the library only knows 15 (the default) and 0 (read as 15).
using basalt_language = std::uint32_t;

/// The operating system's release code.
/// @return the code, detected at the first call and stored; 0 for an unknown release, which the next call
/// detects again. Other systems report code 11.
/// Threads: thread-safe.
BASALT_API basalt_os _operatingsystem();

/// The operating system's version number.
/// @return 0; each call repeats the detection of _operatingsystem().
/// Threads: thread-safe.
BASALT_API int _operatingsystemversion();

/// The handheld platform's code.
/// @return 1, the desktop, stored at the first call.
/// Threads: thread-safe.
BASALT_API basalt_hh _handheldVersion();

/// Whether the handheld runs the new generation of its system: the stored flag (false; the library never sets
/// it) on handhelds 6 and 13, false on all others.
/// Threads: thread-safe.
BASALT_API bool _isNewLumoOS();

/// Whether the handheld can carry a KV7 radio built in: handhelds 5, 6 and 8.
/// Threads: thread-safe.
BASALT_API bool _handheldCanHaveInBuildKV7Radio();

/// Whether the handheld can carry a modem built in: handhelds 3, 7, 10, 11 and 14.
/// Threads: thread-safe.
BASALT_API bool _handheldCanHaveInBuildModem();

/// Whether the handheld can carry a Kestra RTK receiver built in: handheld 7, and handheld 11 with the stored
/// option flag (false; the library never sets it).
/// Threads: thread-safe.
BASALT_API bool _handheldCanHaveInBuildKestraRTK();

/// Whether texts have the default font size: on all handhelds except 8 and 9.
/// Threads: thread-safe.
BASALT_API bool _isDefaultFontSize();

/// The display's resolution factor.
/// @return 1.0, stored at the first call.
/// Threads: thread-safe.
BASALT_API double _checkForHighResolution();

/// The language setting.
/// @return the last code set; 15 initially and for 0.
/// Threads: thread-safe.
BASALT_API basalt_language _languageVersion();

/// Sets the language.
/// @param language any code, stored without a check; 0 restores the default 15
/// Threads: thread-safe.
BASALT_API void _setLanguageVersion(basalt_language language);

/// Height of the task bar.
/// @return 26 (pixels).
/// Threads: thread-safe.
BASALT_API int _taskbarheight();

/// A pseudo-random number for names that need to be unlikely, not unpredictable.
///
/// Reseeds the C library's generator (`srand`) with the system's millisecond tick count whenever that has
/// changed since the last call, then draws from it (`rand`): calls within one millisecond continue a
/// sequence, and the same tick count starts the same sequence in every process. It changes the state of the
/// host's own `rand`.
/// @return the draw modulo 65535: 0 to 65534 (or up to RAND_MAX if that is smaller).
/// Threads: thread-safe; all threads share the sequence.
BASALT_API std::uint16_t _random_uint16();

/// Reverses the order of bytes in place: the first becomes the last.
/// @param data the bytes, of any record, at any alignment; may be null when count is 0
/// @param count number of bytes; 0 and 1 change nothing
/// Threads: reentrant; no other thread may use the bytes meanwhile.
BASALT_API void _reversebytes(void* data, std::uint32_t count);

/// @name Configured folders
/// Values that the host sets at its start. They are stored unchanged, truncated to 259 characters; the disk
/// is not read, and separators are neither added nor removed.
///
/// A setter takes a terminated text, which may be a getter's result; null is not allowed. A getter returns
/// the stored text, which is valid until the library is unloaded, empty initially, changed by later settings
/// and read-only.
///
/// Threads: the getters are thread-safe; while a setter runs, no other thread may use its values.
/// @{

/// Sets the root folder of the product family, and determines the operating-system code.
BASALT_API void _setKestraRootPath(wchar_t* value);
/// The root folder.
BASALT_API wchar_t* _kestraRootPath();

/// Sets the folder of the machine-control product, with it the inbox folder, and determines the
/// operating-system code.
BASALT_API void _setKestraGRDXPath(wchar_t* value);
/// The product folder.
BASALT_API wchar_t* _kestraGRDXPath();
/// The inbox of the data-exchange service: the product folder followed by "\Inbox", also after a separator,
/// and never truncated; empty until the product folder is set.
BASALT_API wchar_t* _kestraPortulaInboxPath();

/// Sets the folder of the executable.
BASALT_API void _setKestraExePath(wchar_t* value);
/// The folder of the executable.
BASALT_API wchar_t* _kestraExePath();

/// Sets the application's version text.
BASALT_API void _setKestraApplicationVersion(wchar_t* value);
/// The application's version text.
BASALT_API wchar_t* _kestraApplicationVersion();
/// @}

/// The system's folder for temporary files, queried at each call.
/// @return the folder with a closing separator: TMPDIR, or /tmp/ if that is unset or empty, whether it exists
/// or not. Empty if it needs more than 259 characters. Threads: thread-safe while no thread changes the
/// environment.
BASALT_API CString _tempFilePath();

/// @name Identifier replacement
/// A process-wide table of at most 1000 pairs that the host loads, and a switch that is off initially. The
/// library itself never looks up an identifier.
///
/// Threads: one at a time; lookups alone from any number of threads.
/// @{

/// Appends a pair to the table, whether replacement is on or off. A pair beyond the 1000th is dropped.
/// Throws std::bad_alloc, with nothing stored, when out of memory.
/// @param from identifier to be replaced, any value; of several pairs with the same one the first counts
/// @param to its replacement, any value; it is not replaced in turn
BASALT_API void _REPLACE_LOAD(unsigned int from, unsigned int to);

/// The replacement of an identifier, by a linear search in the order of loading.
/// @return the replacement; the identifier itself if replacement is off or no pair has it.
BASALT_API unsigned int _REPLACE(unsigned int id);

/// Switches replacement on or off; the table is kept.
BASALT_API void _REPLACE_FLAG(bool enabled);

/// Releases the table and keeps the switch; the next load starts a new table. Unloading the library does not
/// release the table.
BASALT_API void _REPLACE_CLEANUP();
/// @}

/// @name Text in fixed buffers
/// Conversions of terminated text in the caller's buffers. The count n (0 or more) is the largest number of
/// characters before the terminator, so a destination has n + 1 characters; nothing behind index n is
/// written. Narrow text is in the active code page: the encoding of the environment's locale, UTF-8 if that
/// names none. The process's own locale is neither used nor changed.
///
/// Bad input: no pointer may be null, n may not be negative, source and destination may not overlap. Nothing
/// fails or throws. Results of 65,536 characters and more are terminated at their length modulo 65,536.
/// Threads: thread-safe; each buffer is the caller's.
/// @{

/// Copies wide text, truncated to n characters.
BASALT_API void _tchar2wchar(const wchar_t* source, wchar_t* destination, int n);
/// The same as _tchar2wchar().
BASALT_API void _wchar2tchar(const wchar_t* source, wchar_t* destination, int n);
/// The same as _tchar2wchar().
BASALT_API void _tchar2tchar(const wchar_t* source, wchar_t* destination, int n);

/// Converts narrow text to wide. The source is truncated to n bytes first, which may split its last
/// character. Each byte that is not part of a character, also of a split one, becomes U+FFFD.
BASALT_API void _char2tchar(const char* source, wchar_t* destination, int n);

/// Converts wide text to narrow; a result of more than n bytes becomes the empty text. A character that the
/// encoding lacks becomes `?`.
BASALT_API void _tchar2char(const wchar_t* source, char* destination, int n);

/// Writes a number in lower-case digits. Index n always holds a terminator.
/// @param value any; a negative one has a minus sign in radix 10 and is its 32-bit pattern in the others
/// @param destination the text; empty if text and terminator together need more than n characters (also a
/// text of exactly n) and for a radix out of range
/// @param n as above
/// @param radix 2 to 36
BASALT_API void _int2tchar(int value, wchar_t* destination, int n, int radix);
/// @}

#endif
