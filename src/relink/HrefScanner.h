#pragma once

#include <functional>
#include <string>
#include <string_view>

/**
 * The two scans that find the references of a page, each in one pass over the text (up to its
 * first NUL byte, where every scan of the page stops).
 *
 * The suffix scan looks at every "." and takes what stands around it, up to the nearest quote,
 * parenthesis, angle bracket or line end, for a file reference when its suffix looks like one.
 * The delimiter scan takes attribute values between an opening and a closing pattern, removing
 * each match from its working copy before looking for the next one, so that the order of the
 * patterns decides which one claims a value. Both hand each reference to a callback, in order.
 *
 * The page view must outlive the scanner.
 */
class HrefScanner {
public:
    using Found = std::function<void(std::string_view)>;

    explicit HrefScanner(std::string_view page);

    /** Every candidate "prefix.suffix" in page order, duplicates included, cut to 255 bytes. */
    void collectSuffixed(const Found& found) const;

    /**
     * Every value between open and close (both matched without regard to case), as the repeated
     * extract-and-remove of the first match from the start of the working copy finds them; each
     * value cut to 255 bytes. work is the copy, carried from one call to the next.
     */
    static void extractBetween(std::string& work, std::string_view open, std::string_view close,
                               const Found& found);

    /** The text the scans look at. */
    std::string_view text() const { return m_text; }

private:
    std::string_view m_text;
};

/** A suffix that makes a dotted word a file reference: known to the suffix map, or short and
 * lettered. */
bool IsResourceSuffix(std::string_view suffix);

/** Whether every byte may stand in a URL without escaping (letters, digits, safe, extra, reserved,
 * punctuation). */
bool IsURLSafe(unsigned char c);
