#pragma once

#include <cstdint>
#include <cstdio>
#include <string>

/// Where results go: plain lines for people, or one JSON object a line for machines. One thread.
///
/// The application's classes print diagnostics of their own on standard output. Silence() parts the two:
/// results keep the real standard output, diagnostics go to standard error when asked for, else nowhere.
class Output {
  public:
    enum class Form { plain, json, null_ended };

    Output();
    ~Output();
    Output(const Output&) = delete;
    Output& operator=(const Output&) = delete;

    void SetForm(Form form) { mForm = form; }
    Form GetForm() const { return mForm; }
    bool IsJson() const { return mForm == Form::json; }

    /// From now on what others print on standard output is not mixed into the results.
    void Silence(bool showDiagnostics);

    /// One line of plain text as it is, without its end of line.
    void Line(const std::string& text);
    /// One path: a line, a JSON object with "path" (see JsonObject::Bytes), or ended by a zero byte.
    void Path(const std::string& path);

    /// False when results could not be written, to a full disk or a closed pipe.
    bool Finish();

  private:
    std::FILE* mResults;
    Form mForm = Form::plain;
};

/// One JSON object, built field by field (RFC 8259).
class JsonObject {
  public:
    JsonObject& Text(const char* name, const std::string& utf8);
    JsonObject& Number(const char* name, std::int64_t value);
    JsonObject& Real(const char* name, double value);
    JsonObject& Flag(const char* name, bool value);
    /// Bytes that are most often text: as text, with invalid UTF-8 replaced; then NAME_hex holds the exact
    /// bytes.
    JsonObject& Bytes(const char* name, const std::string& bytes);
    JsonObject& Hex(const char* name, const std::string& bytes);

    std::string Take();

  private:
    void Name(const char* name);

    std::string mText = "{";
};

/// The text without control characters, which are shown as \n, \t or \xHH; invalid UTF-8 as \xHH.
std::string Printable(const std::string& bytes);
/// Columns of a terminal that a printable text takes.
std::size_t DisplayWidth(const std::string& utf8);
/// The text followed by blanks up to `width` columns.
std::string Padded(const std::string& utf8, std::size_t width);
