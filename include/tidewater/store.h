/**
 * @file store.h
 * The seven operations that the library needs of a parameter store: a file of named tables with
 * named columns.
 *
 * The library calls them as ordinary external functions.  libtabdll is their default
 * implementation; any other store that answers them may take its place at link or load time.  Every
 * operation returns a word: exactly #TW_STORE_SUCCESS on success, exactly #TW_STORE_END_OF_TABLE at
 * the end of a walk, anything else is a failure or a miss.  A walk must end: the library goes on
 * until it sees the end-of-table word.
 *
 * There is one current store, from an open to the next close; in libtabdll one for each thread.
 *
 * In libtabdll counts, walks and searches are views of the same rows, which are read and checked as
 * a whole when a file is first opened.  They are kept for later openings, from any thread, while
 * the file's device, inode, size and times are those that were read; an open store stays as it was
 * read whatever becomes of the file.
 */
#ifndef TIDEWATER_STORE_H
#define TIDEWATER_STORE_H

#include <stdint.h>

/** Marks what a store exports. */
#if defined(TIDEWATER_STATIC)
#define TW_STORE_API
#elif defined(_WIN32)
#if defined(TABDLL_BUILDING)
#define TW_STORE_API __declspec(dllexport)
#else
#define TW_STORE_API __declspec(dllimport)
#endif
#else
#define TW_STORE_API __attribute__((visibility("default")))
#endif

#ifdef __cplusplus
extern "C" {
#endif

/** A store operation's answer, built like TWstatus on the facility 0x0960. */
typedef uint32_t TWstoreword;

#define TW_STORE_SUCCESS UINT32_C(0x09608009)      /**< The operation worked, the row was found. */
#define TW_STORE_END_OF_TABLE UINT32_C(0x0960801B) /**< No further row; the low bit is set. */

/** Longest packed row, in bytes: no store gives more, and the library's buffers hold as much. */
#define TW_STORE_ROW_LIMIT 512

/**
 * Opens a store and makes it the current one.
 * @param path  the store's file, as the caller of the library gave it
 */
TW_STORE_API TWstoreword OLB7R3_PF_open(const char* path);

/**
 * Prepares a table for reading from its first row.
 * @param table  name, compared exactly
 */
TW_STORE_API TWstoreword OLB7R3_PF_reset_table(const char* table);

/**
 * Names the column by which the following OLB7R3_PF_get_next_row() calls walk a table.
 * @param table   name
 * @param column  name, compared exactly; null asks for the natural order
 */
TW_STORE_API TWstoreword OLB7R3_PF_define_table_search(const char* table, const char* column);

/**
 * Copies the next row of a walk and moves on.  After OLB7R3_PF_reset_table() alone the walk has the
 * natural order.
 * @param table  name
 * @param row    buffer as long as the table's packed rows
 */
TW_STORE_API TWstoreword OLB7R3_PF_get_next_row(const char* table, void* row);

/**
 * Finds the first row whose column equals a key and copies it.
 * @param table   name
 * @param mode    always 0
 * @param column  name
 * @param key     address of the key: of a text, or of a number of the column's packed type
 * @param row     buffer as long as the table's packed rows
 */
TW_STORE_API TWstoreword OLB7R3_PF_get_row_by_value(const char* table, int32_t mode,
                                                    const char* column, const void* key, void* row);

/**
 * Number of rows of a table; needs no OLB7R3_PF_reset_table() before it.
 * @param table  name
 * @param count  number of rows
 */
TW_STORE_API TWstoreword OLB7R3_PF_inq_num_rows(const char* table, int32_t* count);

/**
 * Closes the current store.
 * @param mode  always 0
 */
TW_STORE_API TWstoreword OLB7R3_PF_close(int32_t mode);

#ifdef __cplusplus
}
#endif

#endif
