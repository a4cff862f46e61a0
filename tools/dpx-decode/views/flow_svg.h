// --flow FILE.svg: a sequence diagram of the selected dialogues.  Each end
// (point code and SSN) is a lane, each message an arrow labelled with its
// type and operations; time runs down the page one row per message, a long
// silence is drawn as a marked gap instead of empty space, and every row
// carries its time and frame.  Arrows are coloured by dialogue.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>
#include <vector>

#include "dialogues/tracker.h"

namespace dpxdecode::views {

class FlowPicture {
public:
    explicit FlowPicture(size_t maxMessages = 5000) : maxMessages_(maxMessages) {}

    // Takes the dialogue's messages (up to the limit; the rest are counted).
    void add(const dialogues::Dialogue &d);
    void write(std::ostream &os) const;

    size_t omitted() const { return omitted_; }

private:
    struct Arrow {
        int64_t timeNs;
        uint64_t index;
        bool hasTime;
        uint64_t frame;
        uint64_t dialogue;
        std::string from, to; // lane names
        std::string label, detail;
    };
    size_t maxMessages_;
    size_t omitted_ = 0;
    std::vector<Arrow> arrows_;
};

} // namespace dpxdecode::views
