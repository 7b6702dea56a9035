#include "addrtext.h"

#include "lib/exception.h"

using HostCtl::Network::Ipv6_addr;

namespace QorCtl {
namespace Network {
namespace AddrText {

namespace {

int HexValue(char c)
{
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}

bool IsDigit(char c) { return c >= '0' && c <= '9'; }

bool IsAlnum(char c)
{
    return IsDigit(c) || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}

// Decimal number of at most maxDigits digits, without leading zeros, in
// text[begin, end).
bool ParseDecimal(std::string const &text, size_t begin, size_t end,
                  size_t maxDigits, uint32 &out)
{
    size_t n = end - begin;
    if (begin >= end || n > maxDigits) return false;
    if (n > 1 && text[begin] == '0') return false;
    uint32 value = 0;
    for (size_t i = begin; i < end; ++i) {
        if (!IsDigit(text[i])) return false;
        value = value * 10 + (text[i] - '0');
    }
    out = value;
    return true;
}

// Dotted quad in text[begin, end).
bool ParseIpv4Range(std::string const &text, size_t begin, size_t end, uint32 &out)
{
    uint32 value = 0;
    size_t pos = begin;
    for (int part = 0; part < 4; ++part) {
        size_t stop = pos;
        while (stop < end && text[stop] != '.') ++stop;
        uint32 octet;
        if (!ParseDecimal(text, pos, stop, 3, octet) || octet > 255) return false;
        value = (value << 8) | octet;
        if (part < 3) {
            if (stop >= end) return false;  // too few parts
            pos = stop + 1;
        } else if (stop != end) {
            return false;  // a fifth part
        }
    }
    out = value;
    return true;
}

void Hex(std::string &out, unsigned value)
{
    static const char digits[] = "0123456789abcdef";
    char buf[4];
    int n = 0;
    do {
        buf[n++] = digits[value & 0xf];
        value >>= 4;
    } while (value && n < 4);
    while (n) out += buf[--n];
}

} // namespace

bool ParseIpv4(std::string const &text, uint32 &out)
{
    if (text.size() > 15) return false;
    return ParseIpv4Range(text, 0, text.size(), out);
}

std::string FormatIpv4(uint32 address)
{
    std::string s;
    for (int shift = 24; shift >= 0; shift -= 8) {
        s += std::to_string((address >> shift) & 0xff);
        if (shift) s += '.';
    }
    return s;
}

bool ParseIpv6(std::string const &text, Ipv6_addr &out)
{
    // The longest form is six full groups and a dotted quad: 45 characters.
    size_t n = text.size();
    if (n < 2 || n > 45) return false;
    uint16 words[8] = {0, 0, 0, 0, 0, 0, 0, 0};
    int count = 0;
    int gap = -1;  // index in words where "::" stands
    size_t i = 0;
    if (text[0] == ':') {
        if (text[1] != ':') return false;
        gap = 0;
        i = 2;
    }
    while (i < n) {
        size_t j = i;
        while (j < n && HexValue(text[j]) >= 0) ++j;
        if (j < n && text[j] == '.') {
            // Dotted quad tail: the last 32 bits.
            uint32 v4;
            if (count > 6 || !ParseIpv4Range(text, i, n, v4)) return false;
            words[count++] = uint16(v4 >> 16);
            words[count++] = uint16(v4 & 0xffff);
            i = n;
            break;
        }
        if (j == i || j - i > 4 || count == 8) return false;
        unsigned value = 0;
        for (size_t k = i; k < j; ++k) value = value * 16 + HexValue(text[k]);
        words[count++] = uint16(value);
        i = j;
        if (i == n) break;
        if (text[i] != ':') return false;
        ++i;
        if (i < n && text[i] == ':') {
            if (gap >= 0) return false;  // a second "::"
            gap = count;
            ++i;
        } else if (i == n) {
            return false;  // a single trailing ':'
        }
    }
    if (gap >= 0) {
        if (count > 7) return false;  // "::" must stand for at least one group
        int moved = count - gap;
        for (int k = 0; k < moved; ++k) {
            words[7 - k] = words[count - 1 - k];
            words[count - 1 - k] = 0;
        }
        for (int k = gap; k < 8 - moved; ++k) words[k] = 0;
    } else if (count != 8) {
        return false;
    }
    for (int k = 0; k < 4; ++k) out.addr[k] = (uint32(words[2 * k]) << 16) | words[2 * k + 1];
    return true;
}

std::string FormatIpv6(Ipv6_addr const &address)
{
    unsigned words[8];
    for (int k = 0; k < 4; ++k) {
        words[2 * k] = address.addr[k] >> 16;
        words[2 * k + 1] = address.addr[k] & 0xffff;
    }
    // IPv4-mapped addresses keep their dotted tail.
    if (!words[0] && !words[1] && !words[2] && !words[3] && !words[4] && words[5] == 0xffff)
        return "::ffff:" + FormatIpv4(address.addr[3]);
    int bestStart = -1, bestLen = 1;  // only runs of two or more groups
    for (int k = 0; k < 8;) {
        if (words[k]) { ++k; continue; }
        int start = k;
        while (k < 8 && !words[k]) ++k;
        if (k - start > bestLen) { bestStart = start; bestLen = k - start; }
    }
    std::string s;
    for (int k = 0; k < 8; ++k) {
        if (k == bestStart) {
            s += "::";
            k += bestLen - 1;
            continue;
        }
        if (!s.empty() && s.back() != ':') s += ':';
        Hex(s, words[k]);
    }
    return s;
}

bool ParsePrefix(std::string const &text, uint32 max, uint32 &out)
{
    uint32 value;
    if (!ParseDecimal(text, 0, text.size(), 3, value) || value > max) return false;
    out = value;
    return true;
}

int PrefixOfMask(uint32 mask)
{
    uint32 host = ~mask;
    if (host & (host + 1)) return -1;  // host bits are not all at the bottom
    int prefix = 0;
    while (prefix < 32 && (mask & (0x80000000U >> prefix))) ++prefix;
    return prefix;
}

int PrefixOfMask(Ipv6_addr const &mask)
{
    int prefix = 0;
    int k = 0;
    while (k < 4 && mask.addr[k] == 0xffffffffU) { prefix += 32; ++k; }
    if (k == 4) return prefix;
    int part = PrefixOfMask(mask.addr[k]);
    if (part < 0) return -1;
    for (int rest = k + 1; rest < 4; ++rest)
        if (mask.addr[rest]) return -1;
    return prefix + part;
}

uint32 MaskOfPrefix(uint32 prefix)
{
    return prefix == 0 ? 0 : prefix >= 32 ? 0xffffffffU : ~(0xffffffffU >> prefix);
}

Ipv6_addr Ipv6MaskOfPrefix(uint32 prefix)
{
    Ipv6_addr mask;
    for (uint32 k = 0; k < 4; ++k) {
        uint32 bits = prefix > 32 * k ? prefix - 32 * k : 0;
        mask.addr[k] = MaskOfPrefix(bits > 32 ? 32 : bits);
    }
    return mask;
}

bool ParseMac(std::string const &text, uint8 out[6])
{
    uint8 octets[6];
    size_t n = text.size();
    bool dotted = n == 14 && text[4] == '.' && text[9] == '.';
    if (dotted || (n == 12 && text.find_first_of(":-") == std::string::npos)) {
        // "aabbccddeeff" or "aabb.ccdd.eeff"
        int nibble = 0;
        for (size_t i = 0; i < n; ++i) {
            if (dotted && (i == 4 || i == 9)) continue;
            int v = HexValue(text[i]);
            if (v < 0) return false;
            if (nibble % 2 == 0) octets[nibble / 2] = uint8(v << 4);
            else octets[nibble / 2] |= uint8(v);
            ++nibble;
        }
    } else {
        // Six groups of one or two hex digits separated by ':' or '-'.
        if (n < 11 || n > 17) return false;
        char sep = 0;
        size_t i = 0;
        for (int k = 0; k < 6; ++k) {
            size_t j = i;
            unsigned value = 0;
            while (j < n && j - i < 3 && HexValue(text[j]) >= 0) value = value * 16 + HexValue(text[j++]);
            if (j == i || j - i > 2) return false;
            octets[k] = uint8(value);
            if (k < 5) {
                if (j >= n || (text[j] != ':' && text[j] != '-')) return false;
                if (sep && text[j] != sep) return false;
                sep = text[j];
                i = j + 1;
            } else if (j != n) {
                return false;
            }
        }
    }
    for (int k = 0; k < 6; ++k) out[k] = octets[k];
    return true;
}

bool IsHostName(std::string const &text)
{
    size_t n = text.size();
    if (n && text[n - 1] == '.') --n;
    if (n == 0 || n > 253) return false;
    size_t start = 0;
    bool lastAllDigits = false;
    while (start <= n) {
        size_t end = start;
        bool allDigits = true;
        while (end < n && text[end] != '.') {
            char c = text[end];
            if (!IsAlnum(c) && c != '-') return false;
            if (!IsDigit(c)) allDigits = false;
            ++end;
        }
        size_t len = end - start;
        if (len == 0 || len > 63) return false;
        if (text[start] == '-' || text[end - 1] == '-') return false;
        lastAllDigits = allDigits;
        start = end + 1;
    }
    return !lastAllDigits;
}

void Fail(std::string const &message)
{
    throw HostCtl::Lib::HostCtlException(message);
}

} // namespace AddrText
} // namespace Network
} // namespace QorCtl
