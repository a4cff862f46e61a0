#include "views/flow_svg.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <ostream>

#include "views/dialogue_view.h"

namespace dpxdecode::views {
namespace {

using dialogues::DialogueMessage;
using dialogues::MessageFacts;

constexpr int kTimeColumn = 180; // left column: time of day and frame
constexpr int kLaneWidth = 330;
constexpr int kHeader = 70;
constexpr int kRow = 30;
constexpr int kGap = 26;                            // height of a compressed silence
constexpr int64_t kGapNs = 1000000000;              // silences longer than this are compressed
constexpr double kCharWidth = 6.4;                  // average glyph width at the label size
constexpr const char *kColours[] = {"#1f5fa8", "#b4401a", "#2c7a2c", "#7a2c7a",
                                    "#8a6d00", "#007a7a", "#a8283c", "#4a4a4a"};

std::string escape(const std::string &s) {
    std::string out;
    for (char c : s) {
        switch (c) {
        case '&': out += "&amp;"; break;
        case '<': out += "&lt;"; break;
        case '>': out += "&gt;"; break;
        case '"': out += "&quot;"; break;
        default:
            // Control characters are not allowed in XML 1.0 text.
            if (static_cast<unsigned char>(c) >= 0x20 || c == '\t')
                out += c;
        }
    }
    return out;
}

// At most `chars` characters (UTF-8 sequences kept whole), "..." when cut.
std::string fit(const std::string &s, size_t chars) {
    std::vector<size_t> starts; // where each character begins
    for (size_t i = 0; i < s.size(); ++i)
        if ((static_cast<unsigned char>(s[i]) & 0xC0) != 0x80)
            starts.push_back(i);
    if (starts.size() <= chars)
        return s;
    const size_t keep = chars > 3 ? chars - 3 : 0;
    return s.substr(0, starts[keep]) + "...";
}

std::string timeOfDay(int64_t ns) {
    const int64_t s = ns / 1000000000;
    const int64_t us = (ns % 1000000000) / 1000;
    const int64_t day = ((s % 86400) + 86400) % 86400;
    char buf[40];
    std::snprintf(buf, sizeof buf, "%02d:%02d:%02d.%06d", int(day / 3600), int(day / 60 % 60), int(day % 60),
                  int(us));
    return buf;
}

std::string seconds(int64_t ns) {
    char buf[40];
    std::snprintf(buf, sizeof buf, "%.3f s", double(ns) * 1e-9);
    return buf;
}

// Lane of one side of a message: its point code and SSN, or, where the
// input carries none, the side's role in the dialogue.
std::string lane(const MessageFacts &f, bool sender, bool forward) {
    const dialogues::End &e = sender ? f.from : f.to;
    if (f.hasOrigin && (e.hasPc || e.hasSsn))
        return endName(e);
    return (sender == forward) ? "initiator" : "responder";
}

} // namespace

void FlowPicture::add(const dialogues::Dialogue &d) {
    for (const DialogueMessage &m : d.messages) {
        if (arrows_.size() >= maxMessages_) {
            ++omitted_;
            continue;
        }
        const MessageFacts &f = m.facts;
        Arrow a{f.timeNs(), f.index, f.hasOrigin, f.frame, d.id, lane(f, true, m.forward), lane(f, false, m.forward),
                messageTypeName(f.type), {}};
        std::string ops;
        for (const dialogues::Component &c : f.components)
            ops += (ops.empty() ? "" : ", ") + componentLabel(c);
        if (!ops.empty())
            a.label += ": " + ops;
        a.detail = "dialogue " + std::to_string(d.id) + ", " +
                   (f.hasOrigin ? "frame " + std::to_string(f.frame) : "message " + std::to_string(f.index)) +
                   (f.otid.empty() ? "" : ", otid " + f.otid) + (f.dtid.empty() ? "" : ", dtid " + f.dtid);
        arrows_.push_back(std::move(a));
    }
    omitted_ += d.droppedMessages;
}

void FlowPicture::write(std::ostream &os) const {
    std::vector<const Arrow *> rows;
    for (const Arrow &a : arrows_)
        rows.push_back(&a);
    std::stable_sort(rows.begin(), rows.end(), [](const Arrow *a, const Arrow *b) {
        return a->timeNs != b->timeNs ? a->timeNs < b->timeNs : a->index < b->index;
    });
    std::vector<std::string> lanes;
    const auto laneIndex = [&](const std::string &name) {
        const auto it = std::find(lanes.begin(), lanes.end(), name);
        if (it != lanes.end())
            return size_t(it - lanes.begin());
        lanes.push_back(name);
        return lanes.size() - 1;
    };
    for (const Arrow *a : rows) {
        laneIndex(a->from);
        laneIndex(a->to);
    }
    if (lanes.empty())
        lanes.push_back("-");

    // Row positions: one step per message, a fixed band for a long silence.
    std::vector<int> ys;
    std::vector<std::pair<int, int64_t>> gaps; // y of the band, length of the silence
    int y = kHeader + kRow;
    for (size_t i = 0; i < rows.size(); ++i) {
        if (i > 0 && rows[i]->hasTime && rows[i]->timeNs - rows[i - 1]->timeNs > kGapNs) {
            gaps.emplace_back(y - kRow / 2 + kGap / 2, rows[i]->timeNs - rows[i - 1]->timeNs);
            y += kGap;
        }
        ys.push_back(y);
        y += kRow;
    }
    const int width = kTimeColumn + kLaneWidth * int(lanes.size()) + 20;
    const int height = y + 30;
    const auto laneX = [&](size_t i) { return kTimeColumn + kLaneWidth * int(i) + kLaneWidth / 2; };

    os << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
       << "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"" << width << "\" height=\"" << height
       << "\" viewBox=\"0 0 " << width << ' ' << height << "\" font-family=\"DejaVu Sans, Arial, sans-serif\">\n"
       << "<defs>\n";
    for (size_t c = 0; c < std::size(kColours); ++c)
        os << "<marker id=\"head" << c << "\" viewBox=\"0 0 10 10\" refX=\"10\" refY=\"5\" markerWidth=\"8\" "
           << "markerHeight=\"8\" orient=\"auto\"><path d=\"M0,0 L10,5 L0,10 z\" fill=\"" << kColours[c]
           << "\"/></marker>\n";
    os << "</defs>\n"
       << "<rect width=\"100%\" height=\"100%\" fill=\"white\"/>\n"
       << "<text x=\"10\" y=\"22\" font-size=\"14\" font-weight=\"bold\">call flow: " << rows.size()
       << " messages</text>\n"
       << "<text x=\"10\" y=\"" << kHeader - 12 << "\" font-size=\"11\" fill=\"#555\">time (UTC), frame</text>\n";
    for (size_t i = 0; i < lanes.size(); ++i) {
        const int x = laneX(i);
        os << "<rect x=\"" << x - kLaneWidth / 2 + 15 << "\" y=\"34\" width=\"" << kLaneWidth - 30
           << "\" height=\"26\" rx=\"4\" fill=\"#eef2f7\" stroke=\"#6b7b8f\"/>\n"
           << "<text x=\"" << x << "\" y=\"52\" font-size=\"12\" text-anchor=\"middle\">" << escape(lanes[i])
           << "</text>\n"
           << "<line x1=\"" << x << "\" y1=\"60\" x2=\"" << x << "\" y2=\"" << height - 20
           << "\" stroke=\"#9aa5b1\" stroke-dasharray=\"4 4\"/>\n";
    }
    for (const auto &[gy, ns] : gaps)
        os << "<line x1=\"0\" y1=\"" << gy << "\" x2=\"" << width << "\" y2=\"" << gy
           << "\" stroke=\"#c0c0c0\" stroke-dasharray=\"2 6\"/>\n"
           << "<text x=\"10\" y=\"" << gy + 4 << "\" font-size=\"10\" fill=\"#777\">" << seconds(ns)
           << " later</text>\n";
    for (size_t i = 0; i < rows.size(); ++i) {
        const Arrow &a = *rows[i];
        const int ry = ys[i];
        const size_t c = a.dialogue % std::size(kColours);
        const std::string colour = kColours[c], head = "url(#head" + std::to_string(c) + ")";
        const std::string when = a.hasTime ? timeOfDay(a.timeNs) + "  #" + std::to_string(a.frame)
                                           : "message " + std::to_string(a.index);
        os << "<g><title>" << escape(a.label + " (" + a.detail + ")") << "</title>\n"
           << "<text x=\"10\" y=\"" << ry + 4 << "\" font-size=\"11\" fill=\"#333\">" << escape(when) << "</text>\n";
        const int x1 = laneX(laneIndex(a.from)), x2 = laneX(laneIndex(a.to));
        if (x1 == x2) {
            os << "<path d=\"M" << x1 << ',' << ry - 6 << " h30 v12 h-30\" fill=\"none\" stroke=\"" << colour
               << "\" stroke-width=\"1.5\" marker-end=\"" << head << "\"/>\n"
               << "<text x=\"" << x1 + 36 << "\" y=\"" << ry + 4 << "\" font-size=\"11\" fill=\"" << colour << "\">"
               << escape(fit(a.label, size_t((kLaneWidth / 2 - 40) / kCharWidth))) << "</text>\n";
        } else {
            const size_t room = size_t(std::abs(x2 - x1) / kCharWidth) - 2;
            os << "<line x1=\"" << x1 << "\" y1=\"" << ry << "\" x2=\"" << x2 << "\" y2=\"" << ry << "\" stroke=\""
               << colour << "\" stroke-width=\"1.5\" marker-end=\"" << head << "\"/>\n"
               << "<text x=\"" << (x1 + x2) / 2 << "\" y=\"" << ry - 5 << "\" font-size=\"11\" text-anchor=\"middle\" "
               << "fill=\"" << colour << "\">" << escape(fit(a.label, room)) << "</text>\n";
        }
        os << "</g>\n";
    }
    if (omitted_ != 0)
        os << "<text x=\"10\" y=\"" << height - 8 << "\" font-size=\"12\" fill=\"#a8283c\">" << omitted_
           << " more messages not drawn</text>\n";
    os << "</svg>\n";
}

} // namespace dpxdecode::views
