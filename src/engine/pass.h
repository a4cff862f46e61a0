// The four passes over one message and the request record each one takes.
#pragma once

#include "dpx_camel.h"

namespace camel {

// Every grammar unit exists once per pass; the passes differ only in what a
// finished field turns into (see emit.h).
enum class Pass {
    Decoded,     // labelled text lines with spans (dpx_PreDecodeMD)
    Display,     // value texts under display ids (dpx_PreDecodeTO)
    MessageView, // validation only (dpx_PreDecodeMV)
    KeyField,    // key fields into the key buffer (KFE_3gpp_camel_400)
};

template <Pass P>
struct RequestOf {
    using type = PreDecodeRequest;
};
template <>
struct RequestOf<Pass::KeyField> {
    using type = KeyFieldRequest;
};
template <Pass P>
using Request = typename RequestOf<P>::type;

// Stamps out the four instances of a grammar unit defined in a .cpp file.
#define CAMEL_INSTANTIATE_UNIT(unit, ...)                                                     \
    template int unit<::camel::Pass::Decoded>(__VA_ARGS__, Request<::camel::Pass::Decoded> *);         \
    template int unit<::camel::Pass::Display>(__VA_ARGS__, Request<::camel::Pass::Display> *);         \
    template int unit<::camel::Pass::MessageView>(__VA_ARGS__, Request<::camel::Pass::MessageView> *); \
    template int unit<::camel::Pass::KeyField>(__VA_ARGS__, Request<::camel::Pass::KeyField> *)

} // namespace camel
