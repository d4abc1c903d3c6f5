#ifndef TALUTIL_C_H
#define TALUTIL_C_H

/* TALUtil for C and for every language that can call C.
 *
 * Texts are UTF-8 and end with a NUL. A handle is one started library with its settings and objects; it may be used by
 * one thread at a time, different handles by different threads. Questions that members ask appear on the terminal if
 * standard input is one; otherwise they are answered as if they were cancelled. */

#include <stdbool.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

#if defined(__GNUC__)
#define TALUTIL_API __attribute__((visibility("default")))
#else
#define TALUTIL_API
#endif

typedef struct talutil_library talutil_library;

/* Starts a library. `options` is null or a JSON object: {"code_page": 1251} compares characters by that ANSI code page,
 * by default 1252 or that of TALUTIL_CODE_PAGE. Returns null on failure; talutil_open_failure then says why. */
TALUTIL_API talutil_library* talutil_open(const char* options);

/* Why the thread's last talutil_open failed; an empty text if it did not. Valid until the thread's next call of it. */
TALUTIL_API const char* talutil_open_failure(void);

/* Answers one call written as JSON, exactly as a line of "talutil batch" is answered: a text in UTF-8, to be released
 * with talutil_free. Errors are in the answer; null only if there is not enough memory for one. */
TALUTIL_API char* talutil_call(talutil_library* library, const char* request);

/* Releases a text returned by any of these functions; null is allowed. */
TALUTIL_API void talutil_free(char* text);

/* Ends a library and releases all of its objects; null is allowed. */
TALUTIL_API void talutil_close(talutil_library* library);

/* What the last typed function that failed had to say; an empty text if none has. Valid until the next one fails. */
TALUTIL_API const char* talutil_description(const talutil_library* library);

/* The version of the library, for example "1.0.0". */
TALUTIL_API const char* talutil_version(void);

/* Every member of the toolkit whose parameters and result are texts, numbers and truth values also has a function of
 * its own, here. It returns 0 or the number of the run-time error. A null text is an empty one. A result is a new text,
 * to be released with talutil_free, or null after an error; a text ends at its first NUL. What a member writes back to
 * an argument is stored also after an error: a number in place, a text in `..._after`, which may be null. */
#include "talutil_members.h"

#ifdef __cplusplus
}
#endif

#endif
