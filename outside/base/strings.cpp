/* Text forms of double vectors "[a,b]" and matrices "[[a,b],[c,d]]". */
#include "outside/base/blbase.h"

#include <charconv>
#include <cstring>
#include <string>

namespace {

// Shortest text that reads back as the same double, whatever the locale.
// Stops once the text outgrows limit: it cannot fit the caller's buffer then.
void AppendRow(std::string &out, const double *values, int count, size_t limit)
{
    out += '[';
    for (int i = 0; i < count && out.size() < limit; ++i) {
        char number[32];
        const auto result = std::to_chars(number, number + sizeof number, values[i]);
        if (i) out += ',';
        out.append(number, result.ptr);
    }
    out += ']';
}

int Deliver(const std::string &text, char *buffer, int size)
{
    if (text.size() >= static_cast<size_t>(size)) {
        buffer[0] = '\0';
        return -1;
    }
    std::memcpy(buffer, text.c_str(), text.size() + 1);
    return static_cast<int>(text.size());
}

class Reader {
public:
    explicit Reader(const char *text) : p_(text) {}

    bool Take(char c)
    {
        Spaces();
        if (*p_ != c) return false;
        ++p_;
        return true;
    }
    bool AtEnd()
    {
        Spaces();
        return *p_ == '\0';
    }
    bool Number(double &value)
    {
        Spaces();
        if (*p_ == '+') ++p_;
        const char *end = p_ + std::strcspn(p_, ",] \t\r\n");
        const auto result = std::from_chars(p_, end, value);
        if (result.ec != std::errc() || result.ptr != end) return false;
        p_ = end;
        return true;
    }

private:
    void Spaces()
    {
        while (*p_ == ' ' || *p_ == '\t' || *p_ == '\r' || *p_ == '\n') ++p_;
    }
    const char *p_;
};

// Reads "[x,y,...]" into values from *stored on (count only while values is
// null); the number read, or -1 when malformed or beyond capacity.
int ReadRow(Reader &in, double *values, int capacity, int &stored)
{
    if (!in.Take('[')) return -1;
    if (in.Take(']')) return 0;
    int count = 0;
    do {
        double value;
        if (!in.Number(value)) return -1;
        if (values) {
            if (stored >= capacity) return -1;
            values[stored] = value;
        }
        ++stored;
        ++count;
    } while (in.Take(','));
    return in.Take(']') ? count : -1;
}

} // namespace

int BLSTRING_SetDoubleVectorToString(const double *values, int count, char *buffer, int size)
{
    if (!buffer || size <= 0 || count < 0 || (count > 0 && !values)) return -1;
    std::string text;
    AppendRow(text, values, count, static_cast<size_t>(size));
    return Deliver(text, buffer, size);
}

int BLSTRING_SetDoubleMatrixToString(const double *values, int rows, int columns, char *buffer, int size)
{
    if (!buffer || size <= 0 || rows < 0 || columns < 0 || (rows > 0 && columns > 0 && !values))
        return -1;
    if (rows == 0 || columns == 0) return Deliver("[]", buffer, size);
    std::string text = "[";
    for (int r = 0; r < rows && text.size() < static_cast<size_t>(size); ++r) {
        if (r) text += ',';
        AppendRow(text, values + static_cast<size_t>(r) * static_cast<size_t>(columns), columns,
                  static_cast<size_t>(size));
    }
    text += ']';
    return Deliver(text, buffer, size);
}

int BLSTRING_GetDoubleVectorFromString(const char *text, double *values, int capacity)
{
    if (!text) return -1;
    Reader in(text);
    int stored = 0;
    const int count = ReadRow(in, values, capacity, stored);
    return count >= 0 && in.AtEnd() ? count : -1;
}

int BLSTRING_GetDoubleMatrixFromString(const char *text, double *values, int capacity, int *rows, int *columns)
{
    if (!text) return -1;
    Reader in(text);
    int stored = 0, row_count = 0, width = 0;
    if (!in.Take('[')) return -1;
    if (!in.Take(']')) {
        do {
            const int count = ReadRow(in, values, capacity, stored);
            if (count < 0 || (row_count > 0 && count != width)) return -1;
            width = count;
            ++row_count;
        } while (in.Take(','));
        if (!in.Take(']')) return -1;
    }
    if (!in.AtEnd()) return -1;
    if (rows) *rows = row_count;
    if (columns) *columns = width;
    return stored;
}
