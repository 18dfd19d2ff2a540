#include "Commands.h"
#include "Programs.h"
#include "app/QuirnelApp.h"
#include <Errors.h>
#include <Messenger.h>
#include <Roster.h>
#include <charconv>
#include <cstdint>
#include <optional>

namespace {

constexpr bigtime_t kPatience = 10'000'000;

/// A message code: a decimal number, or four letters, in single quotes or bare.
std::optional<std::uint32_t> CodeOf(std::string text) {
    std::uint32_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error == std::errc() && end == text.data() + text.size())
        return number;
    if (text.size() == 6 && text.front() == '\'' && text.back() == '\'')
        text = text.substr(1, 4);
    if (text.size() != 4)
        return std::nullopt;
    std::uint32_t code = 0;
    for (const char letter : text)
        code = code << 8 | static_cast<unsigned char>(letter);
    return code;
}

} // namespace

int SendCode(const Request& request, Output& output) {
    if (request.arguments.size() != 1)
        return Fail("send takes one message code, such as 103 or 'ABCD'");
    const std::optional<std::uint32_t> code = CodeOf(request.arguments.front());
    if (!code)
        return Fail("no message code: " + Printable(request.arguments.front()) +
                    "; give a decimal number or four letters");
    const std::string signature = request.signature.empty() ? kQuirnelSignature : request.signature;
    bool launched = false;
    if (!be_roster->IsRunning(signature.c_str())) {
        if (!request.launch)
            return Fail(Printable(signature) + " is not running");
        if (const std::string problem = StartProgram(signature, LaunchedErrors::shown, launched);
            !problem.empty())
            return Fail(problem);
    }
    BMessage message(*code);
    const BMessenger application(signature.c_str());
    // Nobody here waits for an answer.
    const status_t status = application.SendMessage(&message, BMessenger(), kPatience);
    if (status != B_OK)
        return Fail(ProblemOf(signature, status));
    if (output.IsJson()) {
        output.Line(JsonObject()
                        .Bytes("to", signature)
                        .Number("team", application.Team())
                        .Number("what", *code)
                        .Flag("launched", launched)
                        .Take());
    }
    return 0;
}
