#ifndef OSPORT_OSPORT_H
#define OSPORT_OSPORT_H

#include <string>

// Host multibyte text <-> UTF-16. The host encoding is UTF-8 unless the host names a code page
// (any name iconv knows, such as "CP1252" or "ISO-8859-1").
namespace osport {

// False, and the host encoding unchanged, when iconv does not know the name.
bool setHostEncoding(const std::string& encoding);
std::string hostEncoding();

// Host text <-> UTF-16 in the host encoding. Each returns a NUL-terminated buffer allocated with
// new[] that the caller hands back to KovarMBRelease, or null when the text cannot be converted
// (or the input is null).
char* KovarMBTranscodeGeneric(const char16_t* text);
char16_t* KovarMBTranscodeGeneric(const char* text);
void KovarMBRelease(char* buffer);
void KovarMBRelease(char16_t* buffer);

// A converter for one named code page; null from New when the code page is unknown.
struct KovarMBConverter;
KovarMBConverter* KovarMBConverterNew_A(int flags, const char* encoding);
void KovarMBConverterDelete_A(KovarMBConverter* converter);
bool KovarMBGenericToU16(KovarMBConverter* converter, const std::string& in, std::u16string& out);
bool KovarMBU16ToGeneric(KovarMBConverter* converter, const char16_t* in, std::string& out);

// The position just past the multibyte character that starts at text (host encoding); text itself
// at its terminating NUL (or when null). A byte that starts no valid character counts as one.
const char* KovarMBstrinc_A(const char* text);

} // namespace osport

#endif
