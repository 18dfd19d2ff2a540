#include "exec_line.h"

namespace host {

std::optional<std::vector<std::string>> split_exec_line(std::string_view line) {
    std::vector<std::string> words;
    std::string word;
    bool within_word = false;
    bool quoted = false;
    for (std::size_t at = 0; at < line.size(); ++at) {
        const char letter = line[at];
        if (quoted) {
            if (letter == '"') {
                quoted = false;
            } else if (letter == '\\' && at + 1 < line.size() &&
                       std::string_view("\"`$\\").find(line[at + 1]) != std::string_view::npos) {
                word += line[++at];
            } else {
                word += letter;
            }
        } else if (letter == '"') {
            quoted = true;
            within_word = true;
        } else if (letter == ' ' || letter == '\t' || letter == '\n') {
            if (within_word)
                words.push_back(word);
            word.clear();
            within_word = false;
        } else {
            word += letter;
            within_word = true;
        }
    }
    if (quoted)
        return std::nullopt;
    if (within_word)
        words.push_back(word);
    return words.empty() ? std::nullopt : std::optional(std::move(words));
}

} // namespace host
