#pragma once

// Generated pages full of what makes relinking hard: every attribute form of the delimiter table,
// url(...), mixed case, duplicates, keys that prefix others, absolute, scheme-relative,
// root-relative and "../" references, anchors, mailto: links, script URLs with quotes in them.

#include <cctype>
#include <random>
#include <regex>
#include <string>
#include <vector>

class PageGenerator {
public:
    explicit PageGenerator(unsigned seed) : m_random(seed) {}

    /** A page of about bytes bytes with one reference every spacing bytes on average. */
    std::string page(size_t bytes, size_t spacing = 200) {
        std::string out = "<html><head><title>Generated. Page</title></head>\n<body>\n";
        while (out.size() < bytes) {
            const std::string n = name();
            out += std::regex_replace(kForms[pick(16)], std::regex("%"), n) + " ";
            for (const size_t end = out.size() - 1 + pick(spacing) + spacing / 2; out.size() < end;)
                out += std::string(kWords[pick(14)]) + ' ';
        }
        return out + "</body></html>\n";
    }

private:
    // clang-format off
    static constexpr const char* kForms[] = { // "%" stands for the reference
        "<a href=\"%\">link</a>", "<IMG SRC='%'>", "<img src=% alt=x>", "<img src=%>",
        "<td background=\"%\">", "<div style=\"background:url(%)\">",
        "<style>p { background: url('%') }</style>", "<a HREF=%>x</a>", "<option value='%'>",
        "<a href=\"#top\">top</a>", "<a href='mailto:someone@example.org'>mail</a>",
        "<a href=\"javascript:window.open('%')\">open</a>", "<a href=\"javascript:void(0)\">none</a>",
        "<link rel=stylesheet href='%'>", "<a href=\"\">here</a>", "<p>See (%) and \"%\".</p>"};
    static constexpr const char* kWords[] = {"Lorem", "ipsum.", "dolor", "sit", "amet,", "e.g.",
        "v1.2", "end.", "\n", "<br>", "(aside)", "it's", "~home", "a.b.c"};
    static constexpr const char* kDirs[] = {"", "img/", "../", "../../", "./", "/static/", "a/b/",
        "./img/"};
    static constexpr const char* kSuffixes[] = {".gif", ".html", ".png", ".js", ".css", ".htm",
        ".jpg", ".x2y", ".pdf", ""};
    // clang-format on

    size_t pick(size_t n) { return std::uniform_int_distribution<size_t>(0, n - 1)(m_random); }

    std::string name() {
        std::string n;
        // Earlier names come back now and then: duplicates, and keys that prefix longer ones.
        if (!m_names.empty() && pick(3) == 0) {
            n = m_names[pick(m_names.size())];
            if (pick(3) == 0)
                n += pick(2) == 0 ? "x" : ".bak";
        } else {
            n = std::string(kDirs[pick(8)]) + "f" + std::to_string(pick(100000)) +
                kSuffixes[pick(10)];
        }
        m_names.push_back(n);
        const size_t kind = pick(12);
        if (kind < 2)
            return (kind == 0 ? "http://other.example/" : "//cdn.example/") + n;
        for (size_t i = 0, mixed = pick(4) == 0; mixed && i < n.size(); ++i) {
            if (pick(2) == 0)
                n[i] = static_cast<char>(std::toupper(static_cast<unsigned char>(n[i])));
        }
        return n;
    }

    std::mt19937 m_random;
    std::vector<std::string> m_names;
};
