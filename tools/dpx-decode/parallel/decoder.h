// One message from its bytes to its output: the passes, the facts the
// filters and the dialogue layer read, the selection, and the message's
// text in whatever view was asked for.  The same code runs in dpx-decode
// itself and in each worker process; what depends on the messages before
// (dialogues, statistics, the relative time base) is left to the ordered
// side, which receives the message's text and its facts.
#pragma once

#include <cstdint>
#include <optional>
#include <ostream>
#include <streambuf>
#include <string>

#include "dialogues/message_facts.h"
#include "dialogues/tracker.h"
#include "filter/match.h"
#include "input/input.h"
#include "module.h"
#include "views/output.h"
#include "views/summary.h"

namespace dpxdecode::parallel {

// What is decoded and shown for every message (from the command line).
struct DecodeSettings {
    PassSelection run;        // passes to run
    bool showMd = false;      // the decoded fields are shown (not only read)
    bool showKeys = false;    // the key fields are shown
    bool passOutput = false;  // the passes' output is written
    bool summary = false;     // --summary
    bool stats = false;       // --stats: the summary is counted
    bool ek = false;          // --format ek
    bool json = false;        // --format json
    bool follow = false;      // dialogues, response times or the flow picture
    bool spans = false;
    FieldsMode fields = FieldsMode::Values;
    TimeFormat time = TimeFormat::Utc;
    const MessageFilter *filter = nullptr;

    // Whether a message with this origin, once selected, has a capture time
    // formatted in its text (what sets the base of relative times).
    bool formatsTime(const CaptureOrigin *origin) const {
        return origin != nullptr && time == TimeFormat::Relative && (summary || passOutput);
    }
};

// Appends whatever is written to a string (kept, with its capacity, from
// message to message).
class StringBuf final : public std::streambuf {
public:
    explicit StringBuf(std::string &to) : to_(to) {}

protected:
    std::streamsize xsputn(const char *s, std::streamsize n) override {
        to_.append(s, size_t(n));
        return n;
    }
    int_type overflow(int_type c) override {
        if (!traits_type::eq_int_type(c, traits_type::eof()))
            to_ += traits_type::to_char_type(c);
        return traits_type::not_eof(c);
    }

private:
    std::string &to_;
};

class MessageDecoder {
public:
    MessageDecoder(const Module &module, const DecodeSettings &settings);
    MessageDecoder(const MessageDecoder &) = delete;
    MessageDecoder &operator=(const MessageDecoder &) = delete;

    // False when the decoding state could not be allocated.
    bool ok() const { return session_.ok(); }

    // Decodes message `index`.  False, with nothing produced, when the
    // message would show a relative time while the base is not known and
    // `mayBaseTime` is false (only the ordered side may set it).
    bool decode(const InputMessage &msg, uint64_t index, bool mayBaseTime);

    // The last message's results.
    const std::string &text() const { return text_; }
    bool selected() const { return selected_; }
    const dialogues::MessageFacts *facts() const { return settings_.follow ? &facts_ : nullptr; }
    const MessageSummary *summary() const { return settings_.stats && selected_ ? &summary_ : nullptr; }

    // Relative times count from this time from now on.
    void setTimeBase(int64_t seconds, uint32_t nanoseconds);
    bool timeBased() const { return timeBased_; }
    int64_t baseSeconds() const { return baseSeconds_; }
    uint32_t baseNanoseconds() const { return baseNanoseconds_; }

private:
    const std::string &messageHex(const InputMessage &msg);

    const DecodeSettings &settings_;
    Session session_;
    TimeFormatter time_;
    TextOptions textOptions_;
    MessageResult result_;
    std::optional<MdOut> hiddenMd_;
    std::optional<KeysOut> hiddenKeys_;
    MessageSummary summary_;
    dialogues::MessageFacts facts_;
    bool selected_ = false;
    std::string text_;
    StringBuf buf_{text_};
    std::ostream out_{&buf_};
    std::string scratch_;
    std::string hex_; // the message in hex, kept with its capacity
    bool timeBased_ = false;
    int64_t baseSeconds_ = 0;
    uint32_t baseNanoseconds_ = 0;
};

// The side that sees the messages in capture order: joins them into
// dialogues, counts them and writes their text.
struct OrderedSinks {
    std::ostream &out;
    dialogues::DialogueTracker *tracker = nullptr; // when following calls
    Statistics *statistics = nullptr;              // with --stats
    bool filtered = false;                         // --match was given

    void take(const dialogues::MessageFacts *facts, bool selected, const MessageSummary *summary,
              std::string_view text) const;
};

} // namespace dpxdecode::parallel
