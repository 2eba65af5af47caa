#ifndef DCM_C_H
#define DCM_C_H

/**
 * @file
 * The C interface: documents in the DCM text format for hosts of any compiler and language.
 *
 * Every function returns a result code, `DCM_OK` or an error; dcm_last_error() has the error in
 * words. A null pointer where none is allowed, an index outside the list and an unknown constant
 * are refused and change nothing. When memory runs out the result is `DCM_ERROR_MEMORY` and all is
 * as it was. Nothing is thrown.
 *
 * A host owns documents alone: it gets them from dcm_document_new() and frees them with
 * dcm_document_free(). A document owns its parameters; the handles to them are borrowed and are
 * never freed. What a function stores in memory of the caller belongs to the caller. What the
 * caller passes is copied.
 *
 * Texts are UTF-8. What goes in has a length in bytes, or `DCM_TERMINATED` when a zero ends it;
 * what is no UTF-8 becomes U+FFFD. What comes out goes into a buffer of the caller: `length`
 * becomes the number of bytes without the terminating zero. When `size` is not above that number,
 * nothing is stored and the result is `DCM_ERROR_SIZE`; so a null buffer of size 0 asks for the
 * length.
 *
 * A document with its parameters is used by one thread at a time. Different documents have nothing
 * in common.
 *
 * Later versions only add to this interface.
 */

#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/** What a function returns: one of the codes below. */
typedef int32_t dcm_result;

enum
{
    DCM_OK = 0,
    /** A null pointer, an unknown constant, or what a parameter of this kind does not have. */
    DCM_ERROR_ARGUMENT = 1,
    /** An index is outside the list. */
    DCM_ERROR_INDEX = 2,
    /** The buffer is too small; the size that is needed has been stored. */
    DCM_ERROR_SIZE = 3,
    /** There is no such parameter. */
    DCM_ERROR_NOT_FOUND = 4,
    /** An element is of another type: a text instead of a number, or the other way round. */
    DCM_ERROR_TYPE = 5,
    /** A file cannot be read or written; the findings say why. */
    DCM_ERROR_FILE = 6,
    /** Memory ran out. */
    DCM_ERROR_MEMORY = 7,
    /** A fault of the library. */
    DCM_ERROR_INTERNAL = 8
};

/** The length of a text that a zero ends. */
#define DCM_TERMINATED ((size_t)-1)

/** The kinds of parameters, in the order in which a file has them. */
enum
{
    DCM_FESTWERT = 0,
    DCM_FESTWERTEBLOCK = 1,
    DCM_STUETZSTELLENVERTEILUNG = 2,
    DCM_KENNLINIE = 3,
    DCM_FESTKENNLINIE = 4,
    DCM_GRUPPENKENNLINIE = 5,
    DCM_KENNFELD = 6,
    DCM_FESTKENNFELD = 7,
    DCM_GRUPPENKENNFELD = 8,
    DCM_TEXTSTRING = 9
};

/** The texts of a document. */
enum
{
    /** The comment at the top of the file that was opened: its lines without their "* ". */
    DCM_COMMENT = 0,
    /** The text at the top of the file that is saved, as it is written there. Opening a file and
     *  setting the comment make it the comment's lines with "* " before each. */
    DCM_HEADER = 1
};

/** The texts of a parameter; empty for none. */
enum
{
    DCM_NAME = 0,
    DCM_LANGNAME = 1,
    DCM_DISPLAYNAME = 2,
    DCM_FUNCTION = 3,
    /** The unit of the values. A STUETZSTELLENVERTEILUNG has none. */
    DCM_UNIT = 4,
    /** The units of the axes. A STUETZSTELLENVERTEILUNG has that of x. */
    DCM_UNIT_X = 5,
    DCM_UNIT_Y = 6,
    /** The names of the distributions that the axes share. Curves have that of x, maps both. */
    DCM_DISTRIBUTION_X = 7,
    DCM_DISTRIBUTION_Y = 8
};

/** The arrays of a parameter. */
enum
{
    /** The values row after row, one row for each point of y. A FESTWERT or TEXTSTRING has at most
     *  one, a STUETZSTELLENVERTEILUNG none. */
    DCM_VALUES = 0,
    /** The points of the axes. Curves have x, maps x and y, and a STUETZSTELLENVERTEILUNG x. */
    DCM_POINTS_X = 1,
    DCM_POINTS_Y = 2
};

/** What an element of an array is. */
enum
{
    /** Neither: what the file counts but does not have. */
    DCM_ELEMENT_EMPTY = 0,
    DCM_ELEMENT_NUMBER = 1,
    DCM_ELEMENT_TEXT = 2
};

/** How much a finding matters. */
enum
{
    /** No data are lost. */
    DCM_NOTE = 0,
    /** Data are doubtful, or altered in a way that may matter. */
    DCM_WARNING = 1,
    /** Data are lost, or the work ended before its end. */
    DCM_ERROR = 2
};

/** The texts of a finding. */
enum
{
    /** What kind of finding it is, such as "unfinished-block". */
    DCM_FINDING_ID = 0,
    /** Keyword and name of the block; empty outside of a block. */
    DCM_FINDING_BLOCK = 1,
    /** One English sentence. */
    DCM_FINDING_MESSAGE = 2
};

/** A list of parameters with a comment, as a file holds them. */
typedef struct dcm_document dcm_document;
/** One named block of any kind. It belongs to a document. */
typedef struct dcm_parameter dcm_parameter;

/** The last error of the calling thread in words, zero-terminated; empty when there was none. A
 *  call that succeeds leaves it. The text is the library's, valid until the thread's next error. */
const char* dcm_last_error(void);

/** The version of the library that runs, such as "1.0.0". `*version` is never freed. */
dcm_result dcm_version(const char** version);

/** Chooses the code page of the files that the calling thread opens and saves: 1252 (with which a
 *  thread starts on Linux; on Windows that of the system), 28591 for ISO-8859-1, 65001 for UTF-8 or
 *  another one that the system converts. An unknown one gives `DCM_ERROR_ARGUMENT`. */
dcm_result dcm_set_code_page(uint32_t identifier);

/** The keyword of a kind, such as "KENNFELD". */
dcm_result dcm_kind_keyword(int32_t kind, char* buffer, size_t size, size_t* length);

/* ---- Documents ------------------------------------------------------------------------------- */

/** Makes an empty document. The caller frees it with dcm_document_free(). On an error `*document`
 *  is null. */
dcm_result dcm_document_new(dcm_document** document);

/** Frees a document with its parameters, whose handles end here. Does nothing for null. */
dcm_result dcm_document_free(dcm_document* document);

/** Replaces parameters, comment and header by those of the file at `path`, which a zero ends; the
 *  parameters are in the order of their kinds. Handles to the old parameters end. When the file
 *  cannot be read, the result is `DCM_ERROR_FILE` and they stay as they were. The findings are
 * those of this call either way. */
dcm_result dcm_document_open(dcm_document* document, const char* path);
/** The same with a path of wide characters. */
dcm_result dcm_document_open_wide(dcm_document* document, const wchar_t* path);

/** Writes the document to `path`, which a zero ends, in the order of the kinds. A file that is
 * there is replaced in one step: it is whole and old or whole and new, whatever happens. When that
 * fails, the result is `DCM_ERROR_FILE`. The findings are those of this call. */
dcm_result dcm_document_save(dcm_document* document, const char* path);
/** The same with a path of wide characters. */
dcm_result dcm_document_save_wide(dcm_document* document, const wchar_t* path);

/** `DCM_COMMENT` or `DCM_HEADER`. */
dcm_result dcm_document_get_text(const dcm_document* document, int32_t field, char* buffer,
                                 size_t size, size_t* length);
dcm_result dcm_document_set_text(dcm_document* document, int32_t field, const char* text,
                                 size_t length);

/** How many findings of the last open or save are listed: up to 1000 of one id, in the order of
 *  their lines. */
dcm_result dcm_document_finding_count(const dcm_document* document, size_t* count);
/** How many findings of a severity there were, those that are not listed included. */
dcm_result dcm_document_severity_count(const dcm_document* document, int32_t severity,
                                       size_t* count);
/** Severity of a finding, and its line in the file from 1, 0 for none. */
dcm_result dcm_document_finding(const dcm_document* document, size_t index, int32_t* severity,
                                int64_t* line);
/** `DCM_FINDING_ID`, `DCM_FINDING_BLOCK` or `DCM_FINDING_MESSAGE` of a finding. */
dcm_result dcm_document_finding_text(const dcm_document* document, size_t index, int32_t field,
                                     char* buffer, size_t size, size_t* length);

/** How many parameters the document has. */
dcm_result dcm_document_parameter_count(const dcm_document* document, size_t* count);

/** The parameter at `index`. The handle stays valid until the parameter is removed, another file is
 *  opened in the document or the document is freed. On an error `*parameter` is null. */
dcm_result dcm_document_parameter(const dcm_document* document, size_t index,
                                  dcm_parameter** parameter);

/** The first parameter of this name, or the next one after `after` when that is not null: names may
 *  repeat, in other kinds too. `after` must be a parameter of the document with this name. Upper
 *  and lower case differ. `DCM_ERROR_NOT_FOUND`, with `*parameter` null, when there is none. The
 *  handle is as that of dcm_document_parameter(). */
dcm_result dcm_document_find(dcm_document* document, const char* name, size_t length,
                             const dcm_parameter* after, dcm_parameter** parameter);

/** Appends a new parameter without content. The handle is as that of dcm_document_parameter(). */
dcm_result dcm_document_add(dcm_document* document, int32_t kind, const char* name, size_t length,
                            dcm_parameter** parameter);

/** Appends a copy of a parameter of any document. */
dcm_result dcm_document_add_copy(dcm_document* document, const dcm_parameter* source,
                                 dcm_parameter** parameter);

/** Removes a parameter of the document, whose handle ends here. The later ones move up. A parameter
 *  of another document gives `DCM_ERROR_ARGUMENT`. */
dcm_result dcm_document_remove(dcm_document* document, dcm_parameter* parameter);

/* ---- Parameters ------------------------------------------------------------------------------ */

/** The kind, such as `DCM_KENNFELD`. */
dcm_result dcm_parameter_kind(const dcm_parameter* parameter, int32_t* kind);

/** A text, such as `DCM_NAME`. What the kind does not have is empty, and setting it gives
 *  `DCM_ERROR_ARGUMENT`. */
dcm_result dcm_parameter_get_text(const dcm_parameter* parameter, int32_t field, char* buffer,
                                  size_t size, size_t* length);
dcm_result dcm_parameter_set_text(dcm_parameter* parameter, int32_t field, const char* text,
                                  size_t length);

/** How many elements an array has, such as `DCM_VALUES`; 0 for one that the kind does not have. */
dcm_result dcm_parameter_count(const dcm_parameter* parameter, int32_t array, size_t* count);

/** How many values are in a row: for a map the number of points of x, for a FESTWERTEBLOCK with
 *  both counts the first, otherwise the number of values. They need not fill the last row. */
dcm_result dcm_parameter_columns(const dcm_parameter* parameter, size_t* columns);

/** The counts of x and y as the first line of the block declares them, and those of a
 *  FESTWERTEBLOCK in rows; 0 for none. A count that is not above 0 leaves the first line to the
 *  number of points. */
dcm_result dcm_parameter_get_counts(const dcm_parameter* parameter, int32_t* x, int32_t* y);
dcm_result dcm_parameter_set_counts(dcm_parameter* parameter, int32_t x, int32_t y);

/** Stores the numbers of an array in `numbers`, which has room for `size`; `*count` becomes their
 *  number. With less room nothing is stored and the result is `DCM_ERROR_SIZE`; so null and size 0
 *  ask for the number. Where elements are no numbers, not-a-number is stored and the result is
 *  `DCM_ERROR_TYPE`; the others are stored all the same. */
dcm_result dcm_parameter_get_numbers(const dcm_parameter* parameter, int32_t array, double* numbers,
                                     size_t size, size_t* count);

/** Replaces all elements of an array. `numbers` may be null when `count` is 0. An array that the
 *  kind does not have, and a second value for a FESTWERT or TEXTSTRING, give `DCM_ERROR_ARGUMENT`.
 *  When the number of points of an axis changes, the count that the first line declares is
 *  dropped; here and below. */
dcm_result dcm_parameter_set_numbers(dcm_parameter* parameter, int32_t array, const double* numbers,
                                     size_t count);

/** What an element is, such as `DCM_ELEMENT_NUMBER`. */
dcm_result dcm_parameter_element_type(const dcm_parameter* parameter, int32_t array, size_t index,
                                      int32_t* type);

/** One number. `DCM_ERROR_TYPE` when the element is none. */
dcm_result dcm_parameter_get_number(const dcm_parameter* parameter, int32_t array, size_t index,
                                    double* number);
/** Replaces an element, or appends one when `index` is the number of elements. An axis or the
 *  values of a curve or map hold numbers or texts: from the first of the other type on, they are
 *  not written. A FESTWERTEBLOCK writes its numbers before its texts. */
dcm_result dcm_parameter_set_number(dcm_parameter* parameter, int32_t array, size_t index,
                                    double number);

/** The same for texts. */
dcm_result dcm_parameter_get_element_text(const dcm_parameter* parameter, int32_t array,
                                          size_t index, char* buffer, size_t size, size_t* length);
dcm_result dcm_parameter_set_element_text(dcm_parameter* parameter, int32_t array, size_t index,
                                          const char* text, size_t length);

#ifdef __cplusplus
}
#endif

#endif
