#include "decoder.h"

#include "input/hex_line.h"
#include "views/ek_output.h"

namespace dpxdecode::parallel {

MessageDecoder::MessageDecoder(const Module &module, const DecodeSettings &settings)
    : settings_(settings), session_(module), time_(settings.time, module.dateConv),
      textOptions_{settings.spans, settings.fields, &time_} {}

void MessageDecoder::setTimeBase(int64_t seconds, uint32_t nanoseconds) {
    // The formatter counts from the first time it formats.
    scratch_.clear();
    time_.append(scratch_, seconds, nanoseconds);
    timeBased_ = true;
    baseSeconds_ = seconds;
    baseNanoseconds_ = nanoseconds;
}

bool MessageDecoder::decode(const InputMessage &msg, uint64_t index, bool mayBaseTime) {
    const DecodeSettings &s = settings_;
    text_.clear();
    session_.run(msg.bytes.data(), msg.bytes.size(), s.run, result_);
    selected_ = true;
    const bool filtered = s.filter != nullptr && !s.filter->empty();
    if (s.follow || filtered) {
        dialogues::extractFacts(index, msg.bytes.data(), msg.bytes.size(), result_, msg.capture, facts_);
        selected_ = s.filter == nullptr || s.filter->matches(facts_, result_.md ? &*result_.md : nullptr);
    }
    if (!selected_)
        return true;
    if (!timeBased_ && s.formatsTime(msg.capture)) {
        if (!mayBaseTime)
            return false;
        setTimeBase(msg.capture->seconds, msg.capture->nanoseconds);
    }
    if (s.summary || s.stats || s.ek) {
        summarize(*result_.md, summary_);
        if (s.ek)
            writeEk(out_, msg, index, messageHex(msg), result_, summary_, time_);
        if (s.summary)
            writeSummary(out_, index, msg.capture, summary_, time_, s.json);
    }
    if (s.passOutput) {
        // The decoded fields made only for the summary or the statistics
        // are set aside while the message is written.
        if (!s.showMd)
            hiddenMd_.swap(result_.md);
        if (!s.showKeys)
            hiddenKeys_.swap(result_.keys);
        const std::string &hex = messageHex(msg);
        if (s.json)
            writeJson(out_, index, hex, result_, msg.capture);
        else
            writeText(out_, index, hex, result_, textOptions_, msg.capture);
        if (!s.showMd)
            hiddenMd_.swap(result_.md);
        if (!s.showKeys)
            hiddenKeys_.swap(result_.keys);
    }
    return true;
}

const std::string &MessageDecoder::messageHex(const InputMessage &msg) {
    hex_.clear();
    appendHex(hex_, msg.bytes.data(), msg.bytes.size());
    return hex_;
}

void OrderedSinks::take(const dialogues::MessageFacts *facts, bool selected, const MessageSummary *summary,
                        std::string_view text) const {
    // A message closes dialogues before it is written, as it arrives.
    if (tracker != nullptr && facts != nullptr)
        tracker->add(*facts, selected && filtered);
    if (statistics != nullptr && summary != nullptr)
        statistics->add(*summary);
    out.write(text.data(), std::streamsize(text.size()));
}

} // namespace dpxdecode::parallel
