/// @file
/// Environment queries: operating-system and handheld codes, language, display and two small utilities; the
/// folders that the host configures; the identifier replacement table; conversions of text in fixed buffers.
///
/// None of them takes a lock, and none fails but _tempFilePath() and _REPLACE_LOAD(), for want of memory.
/// What is determined once is stored for the life of the library in the process; two threads that make the
/// first query at once both get, and store, the same answer.
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

/// Language setting, a plain code of the host's; here only 15 (the default) and 0 (read as 15) have a
/// meaning.
using basalt_language = std::uint32_t;

/// The operating system's release code.
/// @return the code, detected at the first call and stored; 0 when the release is none of the known ones, and
/// the next call detects again. A system other than those reports itself as code 11.
/// Threads: thread-safe.
BASALT_API basalt_os _operatingsystem();

/// The operating system's version number, which no detection sets.
/// @return 0, always; every call runs the detection of _operatingsystem() again.
/// Threads: thread-safe.
BASALT_API int _operatingsystemversion();

/// The handheld platform's code.
/// @return 1, the desktop, stored at the first call.
/// Threads: thread-safe.
BASALT_API basalt_hh _handheldVersion();

/// Whether the handheld runs the new generation of its system: the stored flag (false; nothing in the library
/// sets it) on handhelds 6 and 13, false on every other.
/// Threads: thread-safe.
BASALT_API bool _isNewLumoOS();

/// Whether the handheld can carry a KV7 radio built in: handhelds 5, 6 and 8.
/// Threads: thread-safe.
BASALT_API bool _handheldCanHaveInBuildKV7Radio();

/// Whether the handheld can carry a modem built in: handhelds 3, 7, 10, 11 and 14.
/// Threads: thread-safe.
BASALT_API bool _handheldCanHaveInBuildModem();

/// Whether the handheld can carry a Kestra RTK receiver built in: handheld 7, and handheld 11 with the stored
/// option flag (false; nothing in the library sets it).
/// Threads: thread-safe.
BASALT_API bool _handheldCanHaveInBuildKestraRTK();

/// Whether texts are shown in the default font size: everywhere but on handhelds 8 and 9.
/// Threads: thread-safe.
BASALT_API bool _isDefaultFontSize();

/// The display's resolution factor.
/// @return 1.0, stored at the first call.
/// Threads: thread-safe.
BASALT_API double _checkForHighResolution();

/// The language setting.
/// @return the code last set; 15 before any setting and for a setting of 0.
/// Threads: thread-safe.
BASALT_API basalt_language _languageVersion();

/// Sets the language.
/// @param language any code, stored without a check; 0 brings the default 15 back
/// Threads: thread-safe.
BASALT_API void _setLanguageVersion(basalt_language language);

/// Height of the task bar.
/// @return 26 (pixels).
/// Threads: thread-safe.
BASALT_API int _taskbarheight();

/// A pseudo-random number for names that need to be unlikely, not secret.
///
/// Reseeds the C library's generator (`srand`) with the system's millisecond tick count whenever that has
/// changed since the last call, then draws from it (`rand`): calls within one millisecond continue a
/// sequence, and the same tick count gives the same sequence in every process. The host's own use of `rand`
/// is disturbed.
/// @return the draw modulo 65535: 0 to 65534 (up to 32767 where the generator itself goes no further).
/// Threads: thread-safe; the sequence is shared, so which thread gets which number of it is open.
BASALT_API std::uint16_t _random_uint16();

/// Reverses the order of bytes in place: the first becomes the last.
/// @param data the bytes, of any record, at any alignment; may be null when count is 0
/// @param count number of bytes; 0 and 1 change nothing
/// Threads: reentrant; nobody else may use the bytes meanwhile.
BASALT_API void _reversebytes(void* data, std::uint32_t count);

/// @name Configured folders
/// Values that the host sets at its start and anybody reads. They are kept as given, up to 259 characters
/// (the rest is cut off): no folder is looked at, no separator added or taken away.
///
/// A setter takes a terminated text, which may be one a getter gave; null is not allowed. A getter gives the
/// stored text itself, valid until the library is unloaded: it is empty before any setting, changes with a
/// later one, and is not to be written to.
///
/// Threads: the getters are thread-safe; while a setter runs, nobody else may use its values.
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
/// and never cut; empty until the product folder is set for the first time.
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

/// The system's folder for temporary files, asked for at each call.
/// @return the folder with its closing separator: here TMPDIR, or /tmp/ when that is unset or empty, whether
/// it exists or not. Empty when it needs more than 259 characters, or the system does not answer.
/// Threads: thread-safe, as long as nobody changes the environment.
BASALT_API CString _tempFilePath();

/// @name Identifier replacement
/// A process-wide table of pairs that the host loads, at most 1000, and a switch that starts off. The
/// identifiers mean nothing to the library, which never looks one up itself.
///
/// Threads: one at a time, lookups too while another thread loads, switches or cleans up; lookups alone from
/// any number of threads.
/// @{

/// Appends a pair to the table, whether replacement is on or off. A pair beyond the 1000th is dropped.
/// Fails by std::bad_alloc, with nothing stored, when there is no memory for a table.
/// @param from identifier to be replaced, any value; of several pairs with the same one the earliest counts
/// @param to its replacement, any value; it is not looked up in turn
BASALT_API void _REPLACE_LOAD(unsigned int from, unsigned int to);

/// The replacement of an identifier, found by going through the pairs in the order they were loaded.
/// @return the replacement; the identifier itself when replacement is off or no pair has it.
BASALT_API unsigned int _REPLACE(unsigned int id);

/// Switches replacement on or off; the table stays as it is.
BASALT_API void _REPLACE_FLAG(bool enabled);

/// Releases the table; the switch stays as it is, and the next load begins a new table. Only this call
/// releases it: unloading the library does not.
BASALT_API void _REPLACE_CLEANUP();
/// @}

/// @name Text in fixed buffers
/// From one kind of terminated text to another, in buffers of the caller's. The count n (0 or more) is the
/// largest number of characters before the terminator, so a destination holds n + 1 of them; nothing behind
/// index n is written. Narrow text is in the active code page: the encoding of the environment's locale,
/// UTF-8 where that names none. The process's own locale is neither used nor changed.
///
/// Bad input: no pointer may be null, n may not be negative, source and destination may not overlap. Nothing
/// fails or throws. The two conversions are for results shorter than 65,536 characters; a longer one is
/// terminated at its length modulo 65,536.
/// Threads: thread-safe; each buffer is the caller's.
/// @{

/// Copies wide text; a source longer than n is cut to n characters.
BASALT_API void _tchar2wchar(const wchar_t* source, wchar_t* destination, int n);
/// The same as _tchar2wchar().
BASALT_API void _wchar2tchar(const wchar_t* source, wchar_t* destination, int n);
/// The same as _tchar2wchar().
BASALT_API void _tchar2tchar(const wchar_t* source, wchar_t* destination, int n);

/// Converts narrow text to wide; a source longer than n is cut to n bytes first, which may split its last
/// character. Each byte that belongs to no character, a split one's too, becomes U+FFFD.
BASALT_API void _char2tchar(const char* source, wchar_t* destination, int n);

/// Converts wide text to narrow; what does not fit is never cut: a result of more than n bytes is the empty
/// text. A character that the encoding lacks becomes `?`.
BASALT_API void _tchar2char(const wchar_t* source, char* destination, int n);

/// Writes a number as text, in lower-case digits. Index n holds a terminator in every case.
/// @param value any; negative ones have a minus sign in radix 10 and stand for their 32-bit pattern in others
/// @param destination the text; empty when text and terminator together need more than n characters (a text
/// of exactly n too) and for a radix out of range
/// @param n as above
/// @param radix 2 to 36
BASALT_API void _int2tchar(int value, wchar_t* destination, int n, int radix);
/// @}

#endif
