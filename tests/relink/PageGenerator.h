#pragma once

// Generated HTML pages full of the references that make relinking hard: every attribute form
// of the delimiter table, url(...) in style sheets, mixed letter case, duplicates, keys that are
// prefixes of others, absolute, scheme-relative, root-relative and "../" references, anchors,
// mailto: links and script URLs with quotes and parentheses in them.

#include <random>
#include <string>
#include <vector>

class PageGenerator {
public:
    explicit PageGenerator(unsigned seed) : m_random(seed) {}

    /** A page of about bytes bytes with one reference every spacing bytes on average. */
    std::string page(size_t bytes, size_t spacing = 200) {
        std::string out = "<html><head><title>Generated. Page</title></head>\n<body>\n";
        while (out.size() < bytes) {
            out += reference();
            out += filler(spacing);
        }
        out += "</body></html>\n";
        return out;
    }

private:
    size_t pick(size_t n) { return std::uniform_int_distribution<size_t>(0, n - 1)(m_random); }

    std::string mixCase(std::string s) {
        if (pick(4) == 0) {
            for (char& c : s) {
                if (pick(2) == 0)
                    c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
            }
        }
        return s;
    }

    std::string name() {
        static const char* const dirs[] = {"",   "img/",     "../",  "../../",
                                           "./", "/static/", "a/b/", "./img/"};
        static const char* const suffixes[] = {".gif", ".html", ".png", ".js",  ".css",
                                               ".htm", ".jpg",  ".x2y", ".pdf", ""};
        std::string n;
        // Reuse an earlier name now and then: duplicates, and keys that prefix longer ones.
        if (!m_names.empty() && pick(3) == 0) {
            n = m_names[pick(m_names.size())];
            if (pick(3) == 0)
                n += pick(2) == 0 ? "x" : ".bak";
        } else {
            n = std::string(dirs[pick(8)]) + "f" + std::to_string(pick(100000)) +
                suffixes[pick(10)];
        }
        m_names.push_back(n);
        switch (pick(12)) {
        case 0:
            return "http://other.example/" + n;
        case 1:
            return "//cdn.example/" + n;
        default:
            return mixCase(n);
        }
    }

    std::string reference() {
        const std::string n = name();
        switch (pick(16)) {
        case 0:
            return "<a href=\"" + n + "\">link</a>";
        case 1:
            return "<IMG SRC='" + n + "'>";
        case 2:
            return "<img src=" + n + " alt=x>";
        case 3:
            return "<img src=" + n + ">";
        case 4:
            return "<td background=\"" + n + "\">";
        case 5:
            return "<div style=\"background:url(" + n + ")\">";
        case 6:
            return "<style>p { background: url('" + n + "') }</style>";
        case 7:
            return "<a HREF=" + n + ">x</a>";
        case 8:
            return "<option value='" + n + "'>";
        case 9:
            return "<a href=\"#top\">top</a>";
        case 10:
            return "<a href='mailto:someone@example.org'>mail</a>";
        case 11:
            return "<a href=\"javascript:window.open('" + n + "')\">open</a>";
        case 12:
            return "<a href=\"javascript:void(0)\">none</a>";
        case 13:
            return "<link rel=stylesheet href='" + n + "'>";
        case 14:
            return "<a href=\"\">here</a>";
        default:
            return "<p>See (" + n + ") and \"" + n + "\".</p>";
        }
    }

    std::string filler(size_t spacing) {
        static const char* const words[] = {"Lorem",   "ipsum.", "dolor", "sit",  "amet,",
                                            "e.g.",    "v1.2",   "end.",  "\n",   "<br>",
                                            "(aside)", "it's",   "~home", "a.b.c"};
        std::string out = " ";
        const size_t target = pick(spacing) + spacing / 2;
        while (out.size() < target) {
            out += words[pick(14)];
            out += ' ';
        }
        return out;
    }

    std::mt19937 m_random;
    std::vector<std::string> m_names;
};
