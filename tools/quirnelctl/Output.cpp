#include "Output.h"

#include "Utf8.h"
#include <array>
#include <cmath>
#include <fcntl.h>
#include <unistd.h>

Output::Output() : mResults(stdout) {}

Output::~Output() {
    if (mResults != stdout)
        std::fclose(mResults);
}

void Output::Silence(bool showDiagnostics) {
    std::fflush(stdout);
    const int results = fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, 3);
    if (results < 0)
        return;
    const int diagnostics = showDiagnostics ? dup(STDERR_FILENO) : open("/dev/null", O_WRONLY | O_CLOEXEC);
    if (diagnostics >= 0) {
        dup2(diagnostics, STDOUT_FILENO);
        close(diagnostics);
    }
    if (std::FILE* file = fdopen(results, "w"))
        mResults = file;
    else
        close(results);
}

void Output::Line(const std::string& text) {
    std::fwrite(text.data(), 1, text.size(), mResults);
    std::fputc('\n', mResults);
}

void Output::Path(const std::string& path) {
    switch (mForm) {
    case Form::json:
        Line(JsonObject().Bytes("path", path).Take());
        break;
    case Form::null_ended:
        std::fwrite(path.data(), 1, path.size(), mResults);
        std::fputc('\0', mResults);
        break;
    case Form::plain:
        Line(path);
        break;
    }
}

bool Output::Finish() {
    return std::fflush(mResults) == 0 && std::ferror(mResults) == 0;
}

void JsonObject::Name(const char* name) {
    if (mText.size() > 1)
        mText += ',';
    mText += '"';
    mText += name;
    mText += "\":";
}

JsonObject& JsonObject::Text(const char* name, const std::string& utf8) {
    Name(name);
    mText += '"';
    for (const char byte : utf8) {
        if (byte == '"' || byte == '\\') {
            mText += '\\';
            mText += byte;
        } else if (static_cast<unsigned char>(byte) < 0x20) {
            std::array<char, 8> escaped{};
            std::snprintf(escaped.data(), escaped.size(), "\\u%04x", static_cast<unsigned>(byte));
            mText += escaped.data();
        } else {
            mText += byte;
        }
    }
    mText += '"';
    return *this;
}

JsonObject& JsonObject::Number(const char* name, std::int64_t value) {
    Name(name);
    mText += std::to_string(value);
    return *this;
}

JsonObject& JsonObject::Real(const char* name, double value) {
    Name(name);
    if (!std::isfinite(value)) {
        mText += "null";
        return *this;
    }
    std::array<char, 40> digits{};
    std::snprintf(digits.data(), digits.size(), "%.17g", value);
    mText += digits.data();
    return *this;
}

JsonObject& JsonObject::Flag(const char* name, bool value) {
    Name(name);
    mText += value ? "true" : "false";
    return *this;
}

JsonObject& JsonObject::Bytes(const char* name, const std::string& bytes) {
    bool valid = true;
    std::string text;
    ForEachCharacter(bytes, [&](std::string_view character, bool is_valid) {
        text += is_valid ? character : std::string_view("\xEF\xBF\xBD");
        valid = valid && is_valid;
    });
    Text(name, text);
    if (!valid)
        Hex((std::string(name) + "_hex").c_str(), bytes);
    return *this;
}

JsonObject& JsonObject::Hex(const char* name, const std::string& bytes) {
    static constexpr std::array<char, 17> kDigits = {"0123456789abcdef"};
    Name(name);
    mText += '"';
    for (const char byte : bytes) {
        mText += kDigits[static_cast<unsigned char>(byte) >> 4];
        mText += kDigits[static_cast<unsigned char>(byte) & 15];
    }
    mText += '"';
    return *this;
}

std::string JsonObject::Take() {
    mText += '}';
    return std::move(mText);
}

std::string Printable(const std::string& bytes) {
    std::string text;
    ForEachCharacter(bytes, [&](std::string_view character, bool valid) {
        const auto first = static_cast<unsigned char>(character.front());
        if (character == "\n") {
            text += "\\n";
        } else if (character == "\t") {
            text += "\\t";
        } else if (!valid || first < 0x20 || first == 0x7F) {
            std::array<char, 8> escaped{};
            std::snprintf(escaped.data(), escaped.size(), "\\x%02x", static_cast<unsigned>(first));
            text += escaped.data();
        } else {
            text += character;
        }
    });
    return text;
}

std::size_t DisplayWidth(const std::string& utf8) {
    std::size_t width = 0;
    ForEachCharacter(utf8, [&](std::string_view character, bool) {
        const auto first = static_cast<unsigned char>(character.front());
        const auto second = character.size() > 1 ? static_cast<unsigned char>(character[1]) : 0u;
        const bool combining = first == 0xCC || (first == 0xCD && second < 0xB0);
        const bool wide = first >= 0xF0 || (first >= 0xE3 && first <= 0xED);
        width += combining ? 0 : (wide ? 2 : 1);
    });
    return width;
}

std::string Padded(const std::string& utf8, std::size_t width) {
    const std::size_t used = DisplayWidth(utf8);
    return used < width ? utf8 + std::string(width - used, ' ') : utf8;
}
