// The library's text: 16-bit code units with conversions from and to the 8-bit strings of Lua,
// the engine and the logs. Narrow text is UTF-8. A character outside the 16-bit range becomes a
// surrogate pair of two units and comes back whole from get_str_c; invalid UTF-8 and unpaired
// surrogates become U+FFFD, the replacement character. Colour tags are ordinary characters.
#pragma once
#include "qor_memory.h"

namespace qorui {

// Text of 16-bit code units, converted from and to UTF-8.
class CString : public CPooled<CString, 1024>, public wstring {
public:
    // The capacity in units of the one conversion buffer of str2wcs.
    enum { n_max_len = 512 };

    // A negative size means the whole source.
    CString() {}
    // From UTF-8: the first _size bytes, converted through str2wcs and so cut at 511 units. A null
    // pointer reports and gives the empty string.
    // @{
    CString(char const *_p_str, int _size = -1);
    CString(string const &_str, int _size = -1);
    // @}
    // The first _size units of the source; a size beyond the source reports and takes all of it.
    // A null pointer reports and gives the empty string.
    // @{
    CString(unsigned short const *_p_str, int _size = -1);
    CString(wstring const &_str, int _size = -1);
    CString(CString const &_str, int _size = -1);
    // @}
    // Nothing beyond the string's own storage.
    virtual ~CString() {}

    // Copies the text and its UTF-8 form.
    CString &operator=(CString const &_str);

    // Converts at most _size units (511 for a negative size) into one static buffer that the next
    // call overwrites; longer text is cut at 511 units.
    // @{
    static unsigned short const *str2wcs(char const *_p_str, int _size = -1);
    static void str2wcs(char const *_p_str, wstring &_out, int _size = -1);
    // @}

    // The UTF-8 form, valid until the next conversion of this object. For names, keys and log
    // text: the string must be shorter than 256 units.
    // @{
    string const &get_str_c() const;
    char const *get_c() const { return get_str_c().c_str(); }
    // @}
    // The UTF-8 form of a text of any length, valid until the next conversion of this object: what
    // a saved layout holds.
    string const &get_narrow() const;

    // One unit before _pos; a negative _pos appends.
    CString &insert(unsigned short _ch, int _pos);
    using wstring::insert;

    // Drops everything between angle brackets, the brackets included, by a signed depth counter:
    // a stray '>' drops the text behind it until a '<' brings the depth back to 0.
    void remove_tags();

private:
    mutable string m_str_c;
};

// Length of a zero-terminated string of 16-bit units.
size_t wcslen(unsigned short const *_p_str);

} // namespace qorui
