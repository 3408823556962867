#include <osport/osport.h>

#include <cerrno>
#include <cstring>
#include <iconv.h>
#include <memory>
#include <mutex>
#include <new>

namespace osport {

namespace {

#if defined(__BYTE_ORDER__) && __BYTE_ORDER__ == __ORDER_BIG_ENDIAN__
constexpr const char* kUtf16 = "UTF-16BE";
#else
constexpr const char* kUtf16 = "UTF-16LE"; // no byte-order mark, native order
#endif

const iconv_t kNoConverter = reinterpret_cast<iconv_t>(-1);

std::mutex g_hostMutex;
std::string g_hostEncoding = "UTF-8";

// One iconv descriptor; iconv keeps shift state, so every conversion starts from a reset.
class Iconv {
public:
    Iconv(const char* to, const char* from) : cd_(iconv_open(to, from)) {}
    ~Iconv() {
        if (valid())
            iconv_close(cd_);
    }
    Iconv(const Iconv&) = delete;
    Iconv& operator=(const Iconv&) = delete;

    bool valid() const { return cd_ != kNoConverter; }

    // Converts all of [in, in + size); false on an invalid or incomplete sequence, or a character
    // the target cannot represent.
    bool convert(const char* in, std::size_t size, std::string& out) {
        out.clear();
        if (!valid())
            return false;
        iconv(cd_, nullptr, nullptr, nullptr, nullptr);
        try {
            out.resize(size * 2 + 16);
            char* src = const_cast<char*>(in);
            std::size_t srcLeft = size;
            std::size_t produced = 0;
            bool flushing = false;
            for (;;) {
                char* dst = &out[produced];
                std::size_t dstLeft = out.size() - produced;
                const std::size_t rc = flushing ? iconv(cd_, nullptr, nullptr, &dst, &dstLeft)
                                                : iconv(cd_, &src, &srcLeft, &dst, &dstLeft);
                produced = out.size() - dstLeft;
                if (rc != static_cast<std::size_t>(-1)) {
                    if (flushing)
                        break;
                    flushing = true; // a stateful target may still owe a shift sequence
                    continue;
                }
                if (errno != E2BIG) {
                    out.clear();
                    return false;
                }
                out.resize(out.size() * 2);
            }
            out.resize(produced);
            return true;
        } catch (const std::bad_alloc&) {
            out.clear();
            return false;
        }
    }

    // The length of the one character at the start of [in, in + size): 0 when it is incomplete,
    // -1 when it is invalid.
    int characterLength(const char* in, std::size_t size) {
        iconv(cd_, nullptr, nullptr, nullptr, nullptr);
        char16_t units[8];
        char* src = const_cast<char*>(in);
        std::size_t srcLeft = size;
        char* dst = reinterpret_cast<char*>(units);
        std::size_t dstLeft = sizeof units;
        const std::size_t rc = iconv(cd_, &src, &srcLeft, &dst, &dstLeft);
        if (rc == static_cast<std::size_t>(-1) && errno == EINVAL)
            return 0;
        if (rc == static_cast<std::size_t>(-1) && errno != E2BIG)
            return -1;
        return static_cast<int>(size - srcLeft);
    }

private:
    iconv_t cd_;
};

bool isUtf8(const std::string& encoding) {
    std::string upper;
    for (char c : encoding) {
        if (c != '-' && c != '_')
            upper += static_cast<char>(c >= 'a' && c <= 'z' ? c - 'a' + 'A' : c);
    }
    return upper == "UTF8";
}

// Each thread keeps descriptors for the current host encoding, so the frequent free functions do
// not open iconv on every call; a changed host encoding reopens them.
struct HostConverters {
    std::string encoding;
    std::unique_ptr<Iconv> toU16;
    std::unique_ptr<Iconv> fromU16;
};

HostConverters& hostConverters() {
    thread_local HostConverters cached;
    const std::string current = hostEncoding();
    if (!cached.toU16 || cached.encoding != current) {
        cached.encoding = current;
        cached.toU16 = std::make_unique<Iconv>(kUtf16, current.c_str());
        cached.fromU16 = std::make_unique<Iconv>(current.c_str(), kUtf16);
    }
    return cached;
}

std::size_t u16Length(const char16_t* text) {
    std::size_t n = 0;
    while (text[n] != 0)
        ++n;
    return n;
}

bool toU16(Iconv& cd, const char* in, std::size_t size, std::u16string& out) {
    std::string bytes;
    out.clear();
    if (!cd.convert(in, size, bytes) || bytes.size() % 2 != 0)
        return false;
    try {
        out.resize(bytes.size() / 2);
    } catch (const std::bad_alloc&) {
        return false;
    }
    std::memcpy(&out[0], bytes.data(), bytes.size());
    return true;
}

bool fromU16(Iconv& cd, const char16_t* in, std::size_t units, std::string& out) {
    return cd.convert(reinterpret_cast<const char*>(in), units * sizeof(char16_t), out);
}

template <typename Char> Char* copyToArray(const std::basic_string<Char>& text) {
    Char* buffer = new (std::nothrow) Char[text.size() + 1];
    if (buffer == nullptr)
        return nullptr;
    std::memcpy(buffer, text.data(), text.size() * sizeof(Char));
    buffer[text.size()] = 0;
    return buffer;
}

} // namespace

struct KovarMBConverter {
    KovarMBConverter(const char* encoding) : toU16(kUtf16, encoding), fromU16(encoding, kUtf16) {}
    Iconv toU16;
    Iconv fromU16;
};

bool setHostEncoding(const std::string& encoding) {
    if (encoding.empty() || !Iconv(kUtf16, encoding.c_str()).valid() ||
        !Iconv(encoding.c_str(), kUtf16).valid())
        return false;
    std::lock_guard<std::mutex> lock(g_hostMutex);
    g_hostEncoding = encoding;
    return true;
}

std::string hostEncoding() {
    std::lock_guard<std::mutex> lock(g_hostMutex);
    return g_hostEncoding;
}

char* KovarMBTranscodeGeneric(const char16_t* text) {
    if (text == nullptr)
        return nullptr;
    std::string out;
    if (!fromU16(*hostConverters().fromU16, text, u16Length(text), out))
        return nullptr;
    return copyToArray(out);
}

char16_t* KovarMBTranscodeGeneric(const char* text) {
    if (text == nullptr)
        return nullptr;
    std::u16string out;
    if (!toU16(*hostConverters().toU16, text, std::strlen(text), out))
        return nullptr;
    return copyToArray(out);
}

void KovarMBRelease(char* buffer) {
    delete[] buffer;
}
void KovarMBRelease(char16_t* buffer) {
    delete[] buffer;
}

KovarMBConverter* KovarMBConverterNew_A(int /*flags*/, const char* encoding) {
    if (encoding == nullptr || *encoding == '\0')
        return nullptr;
    auto* converter = new (std::nothrow) KovarMBConverter(encoding);
    if (converter != nullptr && (!converter->toU16.valid() || !converter->fromU16.valid())) {
        delete converter;
        return nullptr;
    }
    return converter;
}

void KovarMBConverterDelete_A(KovarMBConverter* converter) {
    delete converter;
}

bool KovarMBGenericToU16(KovarMBConverter* converter, const std::string& in, std::u16string& out) {
    if (converter == nullptr) {
        out.clear();
        return false;
    }
    return toU16(converter->toU16, in.data(), in.size(), out);
}

bool KovarMBU16ToGeneric(KovarMBConverter* converter, const char16_t* in, std::string& out) {
    if (converter == nullptr || in == nullptr) {
        out.clear();
        return false;
    }
    return fromU16(converter->fromU16, in, u16Length(in), out);
}

const char* KovarMBstrinc_A(const char* text) {
    if (text == nullptr || *text == '\0')
        return text;
    const auto lead = static_cast<unsigned char>(*text);
    HostConverters& host = hostConverters();
    if (isUtf8(host.encoding)) {
        // A malformed sequence counts as one byte, so a scan always moves forward.
        const int length = lead < 0xC2 ? 1 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : lead < 0xF5 ? 4 : 1;
        for (int i = 1; i < length; ++i) {
            if ((static_cast<unsigned char>(text[i]) & 0xC0) != 0x80)
                return text + 1;
        }
        return text + length;
    }
    if (lead < 0x80 || !host.toU16->valid())
        return text + 1;
    // Other code pages: the shortest prefix that converts is the character; iconv tells an
    // incomplete sequence from an invalid one. The scan never looks past the terminating NUL.
    constexpr std::size_t kMaxCharacter = 8;
    std::size_t available = 1;
    while (available < kMaxCharacter && text[available] != '\0')
        ++available;
    for (std::size_t n = 1; n <= available; ++n) {
        const int length = host.toU16->characterLength(text, n);
        if (length > 0)
            return text + length;
        if (length < 0)
            break;
    }
    return text + 1;
}

} // namespace osport
