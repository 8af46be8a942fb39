// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT
//
// The hive engine's whole contract: registry-style calls on one offline "regf" hive, over callbacks of the caller.
#pragma once

#include <cstddef>
#include <cstdint>

// Conventions of every function below
//
// * Names and paths are 8-bit text ended by a zero; path components are parted by '\'. "A" functions hand out
//   8-bit text, "W" functions UTF-16 in the machine's (little-endian) order.
// * A size argument is in/out: the room in the buffer going in, the size of the whole item coming out. Sizes of
//   data, and of names in "W" functions, are bytes; sizes of names in "A" functions are characters, which are one
//   byte each there. Where a terminator is written, the size handed back never counts it.
// * Every output pointer may be null; that output is then left out. A required pointer that is null gives the
//   status that the function names.
// * Status numbers are those of RegistryStatus. A call that fails may have set its outputs up to the one that failed,
//   and no later one unless it says so. It frees all that it allocated itself.
// * Handles are snapshots: a handle does not see changes made through another handle. Once its key is deleted, or
//   renamed through another handle, a handle is only to be closed: its cell may be another key's by then.
// * One hive with all its handles is used by one thread at a time; the engine holds no locks.
// * Counts in a handle are cut to what the lists in the file can hold, so no caller loops over what cannot exist.
//   A key whose counts had to be cut cannot be changed where they were. REnumKeyInfoA alone, which opens no handle,
//   hands out a subkey's count as its record has it.
// * A key lies at most 512 levels below the root; deeper ones are not shown and not made.
// * Memory comes from malloc, realloc and free. The engine never prints and never throws.

enum RegistryStatus : int32_t {
    R_SUCCESS = 0,
    R_FILE_NOT_FOUND = 2,         // no value of that name
    R_PATH_NOT_FOUND = 3,         // a component of the path is not there, or cannot be removed from where it stands
    R_INVALID_HANDLE = 6,         // null, no key, or not the kind of handle that the call needs
    R_NOT_ENOUGH_MEMORY = 8,      // an allocation failed
    R_INVALID_PARAMETER = 87,     // null or empty path or name, or one that cannot be stored
    R_BUFFER_OVERFLOW = 111,      // the name is longer than the buffer
    R_INVALID_NAME = 123,         // the name is stored in UTF-16 and was asked for in 8 bits
    R_KEY_HAS_CHILDREN = 145,     // a key with subkeys is not deleted
    R_MORE_DATA = 234,            // the data is larger than the buffer
    R_NO_MORE_ITEMS = 259,        // index at or past the end
    R_CAN_NOT_COMPLETE = 1003,    // a record could not be read or written
    R_CANTWRITE = 1013,           // the hive was opened without a write callback
    R_REGISTRY_CORRUPT = 1015,    // segments of big data do not add up to the value's size
    R_REGISTRY_IO_FAILED = 1016,  // data or a segment of it could not be read
    R_DEVICE_IN_USE = 2404,       // the hive still has open subkey handles
    R_FAILED = -1,                // a damaged record, or a step inside the engine that failed
};

// What a handle stands for (the first field of a key handle).
enum RegistryHandleFlag : uint32_t {
    R_HANDLE_UTF16_NAME = 4,  // the key's name is stored in UTF-16
    R_HANDLE_HIVE = 8,        // the root handle, which owns the hive
    R_HANDLE_LINK = 16,       // the key is a symbolic link
    R_HANDLE_KEY = 32,        // an ordinary key: neither a link nor flagged as a hive's root
};

// An open key. Made by ROpenSubKey, ROpenKey, ROpenKeyEx and RCreateKey, and released by RCloseKey; the root's is made
// by ROpenHive and ROpenHiveEx and released by RCloseHive.
struct RegistryKey;

// What the engine calls to reach the hive's bytes. `device` is handed back to every callback untouched. It and the
// functions must stay usable until RCloseHive. Positions are byte positions in the file and stay below 2 GiB.
struct RegistryIo {
    void* device;
    // Moves to `offset` counted from the start (whence 0), the present position (1, which the engine never asks for) or
    // the end (2); returns the resulting position, or -1.
    int32_t (*seek)(void* device, int32_t offset, int32_t whence);
    // Reads up to `length` bytes at the present position; returns how many were read, negative on error. After fewer
    // the rest is asked for; 0 is the file's end.
    int32_t (*read)(void* device, void* buffer, int32_t length);
    // Writes `length` bytes at the present position; returns how many were written, negative on error. Fewer than
    // `length` are a failure. When the call returns, the bytes must be in the file as other processes see it. Null: the
    // hive is read-only.
    int32_t (*write)(void* device, const void* buffer, int32_t length);
};

// The time of a key's last change, in the two halves in which the file holds it (100 ns units since 1601).
struct RegistryTime {
    uint32_t low;
    uint32_t high;
};

extern "C" {

// ---- character hooks: null until the program sets them; exported by the executable ----------------------------
// Upper-cases one 8-bit character. Null: ASCII a to z only.
extern char (*toupper_ptr)(char);
// Converts one character of a name that is about to be stored or looked up for a change. Null: unchanged.
extern char (*c2ansi_ptr)(char);
// Converts one character of a value name that REnumValueA hands out. Null: unchanged.
extern char (*c2local_ptr)(char);
// One UTF-16 unit to 8 bits (class names, text data of "A" calls). Null: its low byte.
extern char (*wc2mb_ptr)(uint16_t);
// One 8-bit character to UTF-16 (names of "W" calls, data of RSetValueExA). Null: the unit of the same number.
extern uint16_t (*mb2wc_ptr)(char);

// ---- hives ----------------------------------------------------------------------------------------------------
// Opens the hive behind `io` (copied), whose stream must stand at position 0. Returns the root key's handle, or null
// when io, its read or its seek callback is null, when the bytes are no hive that can be relied on, when memory ran
// out, or when the hive is larger than 2 GiB.
RegistryKey* ROpenHive(const RegistryIo* io);
// The same with the handle flags given (ROpenHive passes R_HANDLE_HIVE).
RegistryKey* ROpenHiveEx(const RegistryIo* io, uint32_t handle_flags);

// Releases a handle. null: -1. A root handle goes to RCloseHive. An incomplete handle, which a failed ROpenKeyEx left
// behind, and that of a key inside the hive which is flagged as a hive's root are freed and give 6. Otherwise 0.
int32_t RCloseKey(RegistryKey* key);
// Closes the hive and frees its root handle. null or no root handle: 6; 2404 while subkey handles are open (nothing
// is freed); otherwise 0. Nothing is written.
int32_t RCloseHive(RegistryKey* root);

// ---- opening keys ---------------------------------------------------------------------------------------------
// Opens the index-th subkey in the order of the key's index. *out is null unless the result is 0.
// 259: no such index, or its entry is -1 or could not be read. -1: no key given, or an entry that leads to no key
// record or to a damaged one. 8: no memory. 87: out null.
int32_t ROpenSubKey(RegistryKey* key, uint32_t index, RegistryKey** out);
// ROpenKeyEx without the position. Null key: -1.
int32_t ROpenKey(RegistryKey* key, const char* path, RegistryKey** out);
// Opens the key at `path` below `key`. Leading backslashes are skipped; components beyond 259 characters are cut
// there. *out_index receives the last component's position in its parent. 6: not a key. 87: null or empty path, or out
// null. 8: no memory. 3: not found, or the lists on the way could not be read. -1: a damaged record. From the moment of
// allocation *out holds the new handle: after a failure it is an incomplete one, to be released with RCloseKey. After 6
// and 87, and after an 8 that is about the handle itself, *out is null.
int32_t ROpenKeyEx(RegistryKey* key, const char* path, RegistryKey** out, uint32_t* out_index);

// ---- enumerating and querying -----------------------------------------------------------------------------------
// The index-th subkey: its 8-bit name, how many subkeys it has, its class in 8 bits, its time.
//   name_size in         buffer                        name_size out      status
//   0, or no buffer      left alone                    length + 1         0
//   above the length     the name and a zero           the length         0
//   the length           the name                      as it was          0
//   below the length     the beginning of the name     as it was          111, class and time given all the same
// For a name stored in UTF-16 the same goes for its bytes as they stand, but what is copied gives 123, and neither
// class nor time. Class: room larger than it: terminated, class_size becomes its characters; otherwise as many
// characters as fit, class_size as it was, never 111. Without a buffer or room half the stored length + 1, 0 without a
// class; with them and no class, both are left as they were. -1: not a key, or a damaged record. 259: index past the
// end. 8: no memory.
int32_t REnumKeyInfoA(RegistryKey* key, uint32_t index, char* name, uint32_t* name_size, uint32_t* out_subkeys,
                      char* class_name, uint32_t* class_size, RegistryTime* out_last_write);
// The same without the subkey count.
int32_t REnumKeyExA(RegistryKey* key, uint32_t index, char* name, uint32_t* name_size, char* class_name,
                    uint32_t* class_size, RegistryTime* out_last_write);

// The index-th value in the order of the value list, text in 8 bits. Never reports a short buffer: what does not fit
// is left out, and the size handed back is the whole one (names: characters as stored; data of types 1, 2, 6 and 7
// that is handed out from a cell of its own: characters; all other, and any without a buffer: bytes). 259: past the
// end. -1: not a key, or a damaged record. 8: no memory. 1003: data that is not in one cell of its own.
int32_t REnumValueA(RegistryKey* key, uint32_t index, char* name, uint32_t* name_size, uint32_t* out_type, void* data,
                    uint32_t* data_size);
// The index-th value, name in UTF-16 (size in bytes, needs two bytes more than the name), data as stored. 259: past
// the end. -1: not a key, or a damaged record. 111: the name buffer is too small (size becomes the need, nothing else
// is handed out). 234: the data buffer is too small (size becomes the need). 1003, 1015, 1016: the data cannot be
// read. Without a data buffer data_size becomes the stored size.
int32_t REnumValueW(RegistryKey* key, uint32_t index, uint16_t* name, uint32_t* name_size, uint32_t* out_type,
                    void* data, uint32_t* data_size);
// The position of the value of that name, case ignored; a null or empty name means the unnamed (default) value. -1:
// none, or not sure. A name stored in UTF-16 is compared as text, never as bytes. A stored 8-bit name counts up to its
// first zero byte, unless another value has, or a record that cannot be read may have, just the name asked for.
int32_t RFindValueA(RegistryKey* key, const char* name);
// A value by name. 6: not a key. 2: there surely is no such value. -1: none was found, but a record that cannot be
// read may be it. Otherwise as REnumValueA / REnumValueW without a name.
int32_t RQueryValueExA(RegistryKey* key, const char* name, uint32_t* out_type, void* data, uint32_t* data_size);
int32_t RQueryValueExW(RegistryKey* key, const char* name, uint32_t* out_type, void* data, uint32_t* data_size);

// The key itself. Unlike its Windows namesake the first text pair is the key's own name, the second its class. Only a
// handle with flag 32 has a name; others give an empty one and size 0. A: size is characters. Larger than the name:
// terminated, size becomes the length; equal: not terminated; smaller: cut, 111. A name in UTF-16 is copied as stored,
// 123. All else is given with 111 and 123 as well. No buffer or no room: size becomes the length. The class is handed
// out as stored, as many bytes as fit, never 111: with room to spare it is ended by one zero byte in A, by up to two in
// W, and class_size becomes its bytes; otherwise class_size is left as it was. Without a buffer or room class_size
// becomes its bytes in A, two more in W. Longest names are characters, the longest class and the class itself bytes,
// the largest data bytes. security_size: the descriptor's length less 20. 6: not a key. 1003: the security record
// cannot be read.
int32_t RQueryInfoKeyA(RegistryKey* key, char* name, uint32_t* name_size, void* class_name, uint32_t* class_size,
                       uint32_t* out_subkeys, uint32_t* out_longest_subkey, uint32_t* out_longest_class,
                       uint32_t* out_values, uint32_t* out_longest_value, uint32_t* out_largest_data,
                       uint32_t* out_security_size, RegistryTime* out_last_write);
// W: sizes are bytes. A need larger than the given size: 111, nothing handed out and every size left as it was. More
// than one byte to spare: terminated. No buffer or no room: size becomes 2 * (length + 1), but length + 1 for a name
// stored in UTF-16.
int32_t RQueryInfoKeyW(RegistryKey* key, uint16_t* name, uint32_t* name_size, void* class_name, uint32_t* class_size,
                       uint32_t* out_subkeys, uint32_t* out_longest_subkey, uint32_t* out_longest_class,
                       uint32_t* out_values, uint32_t* out_longest_value, uint32_t* out_largest_data,
                       uint32_t* out_security_size, RegistryTime* out_last_write);

// ---- changing -----------------------------------------------------------------------------------------------------
// Opens the key at `path`, or makes every missing component of it. *out_disposition: 1 opened, 0 made. 87: null or
// empty path, or one that cannot be made; out null. -1: null key. 6: an incomplete handle. 1013: read-only. 8: no
// memory. 1003: the record cannot be read. *out is null unless the result is 0; a disposition of 0 stands beside 8 and
// 1003 too, where the key was made all the same.
int32_t RCreateKey(RegistryKey* key, const char* path, RegistryKey** out, uint32_t* out_disposition);
// Stores a value, replacing type and data of one with that name (case ignored) or adding it at the list's end.
// null or empty name: the default value. 1013: read-only. 8: no memory. 6: not a key. -1: not stored.
// W stores the bytes as given; A widens text of types 1, 2 and 6, and of type 7 with two zero bytes behind it.
int32_t RSetValueExW(RegistryKey* key, const char* name, uint32_t type, const void* data, uint32_t size);
int32_t RSetValueExA(RegistryKey* key, const char* name, uint32_t type, const void* data, uint32_t size);
// Removes the value of that name. 1013: read-only. 6: not a key. 1003: no such value, a record that cannot be read may
// be it, or a failed write. 8: no memory. -1: damaged.
int32_t RDeleteValue(RegistryKey* key, const char* name);
// Renames the index-th subkey; it stays the same key. 1013: read-only. 6: not a key. 87: null or empty name, one with
// a backslash, or one that is too long. 3: the subkey cannot be opened. -1: a sibling has that name in any case, the
// key is listed elsewhere too, or a step failed. 1003: a record could not be read or written. 8: no memory. Unless 0,
// the key has its old name, but after a 1003 where a write and its taking back both failed.
int32_t RRenameKey(RegistryKey* key, uint32_t index, const char* new_name);
// Deletes the key at `path`, which must have no subkeys. 1013: read-only. 6: a handle without flag 32. 3: not found,
// listed below an index root, or listed elsewhere too; also where the path ends in a backslash or in a component of
// more than 259 characters. 145: it has subkeys. 8: no memory. -1: a step failed. A null or empty path gives 3.
int32_t RDeleteKey(RegistryKey* key, const char* path);
// What RDeleteKey would say to the index-th subkey and to each key below it, leaves first; writes nothing. 0: the
// whole subtree can be deleted key by key. 123: a name in it is stored in UTF-16, which no path can say. -1: no such
// index, or a damaged record.
int32_t RCheckDeleteTree(RegistryKey* key, uint32_t index);
// Where the key's cell lies, in bytes from the first bin: the same for every handle of one key, so that a key which a
// damaged hive lists below itself can be told. UINT32_MAX: not a key. A rename gives the key another cell.
uint32_t RKeyOffset(const RegistryKey* key);

}  // extern "C"
