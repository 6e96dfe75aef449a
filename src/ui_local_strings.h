// The reader of local strings files: lines of a key, a blank or a tab, and a text in quotes, in
// 16-bit units behind a byte-order mark or in bytes without one. The service fills its table with
// it at start-up.
// Internal to the library.
#pragma once
#include "ui_string.h"

class IFileReader;

namespace qorui {

typedef qor_map<string, CString> local_strings_t;

// Reads the stream's text, then clears the table and fills it from the lines; broken lines are
// reported with the file's name and passed over. Takes the stream and closes it.
void read_local_strings(IFileReader *_p_stream, char const *_file_name, local_strings_t &_table);

// The service's local string of a key, else the key's own text. With _critical, a missing service
// is the engine binding's critical error.
CString local_string_or_key(char const *_p_key, bool _critical);

} // namespace qorui
