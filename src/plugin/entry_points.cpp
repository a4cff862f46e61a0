// The exported pass entry points: the common frame around one pass of the
// grammar over one message.
#include "dpx_camel.h"
#include "engine/cursor.h"
#include "engine/emit.h"
#include "engine/scratch.h"
#include "keyfields/key_marks.h"
#include "tcap/units.h"

#define CAMEL_EXPORT extern "C" __attribute__((visibility("default")))

namespace camel {
namespace {

// Makes room for the frame PushLayerFrame is about to write: the current
// frame, or the next one when the message does not start the state's
// buffer (the frame index then moves on).
int growLayerFrames(DecodeState *st) {
    const uint32_t index = st->frameIndex + (st->bitCursor != 1 ? 1u : 0u);
    void *frames = st->layerFrames;
    if (!EnsureCapacityDoubling(&frames, index, &st->frameCapacity, sizeof(LayerFrame))) {
        st->layerFrames = nullptr;
        st->errorFlags |= DPX_ERR_FRAME_GROWTH;
        return 0;
    }
    st->layerFrames = static_cast<LayerFrame *>(frames);
    return 1;
}

// Layer frame, then the grammar from the TCAP message down.
template <Pass P>
int runGrammar(DecodeState *st, Request<P> *rq) {
    if (!growLayerFrames(st))
        return 0;
    PushLayerFrame(st);
    ElementContext top{0, 1, 0, 0};
    return decodeMessage<P>(st, &top, rq);
}

template <Pass P>
uint8_t preDecode(PreDecodeRequest *rq) {
    DecodeState *st = rq->state;
    g_scratch<P> = Scratch{};
    constexpr bool kLayered = P != Pass::MessageView;
    if constexpr (kLayered) {
        if (rq->layerIndex > rq->layerLimit)
            pu_CreateNewLayerInfo(rq);
        LayerInfoEntry &entry = rq->layerEntries[rq->layerIndex];
        entry.firstBit = st->bitCursor;
        entry.layerTag = rq->layerTag;
        entry.layerCode = rq->layerCode;
    }
    if (!runGrammar<P>(st, rq))
        return 0;
    if constexpr (kLayered) {
        rq->layerEntries[rq->layerIndex].lastBit = st->bitCursor - 1;
        ++rq->layerIndex;
    }
    rq->remainingBits = st->remainingBits;
    noteStatus<P>(st, rq);
    return 1;
}

} // namespace
} // namespace camel

CAMEL_EXPORT uint8_t dpx_PreDecodeMD(PreDecodeRequest *request) {
    return camel::preDecode<camel::Pass::Decoded>(request);
}

CAMEL_EXPORT uint8_t dpx_PreDecodeMV(PreDecodeRequest *request) {
    return camel::preDecode<camel::Pass::MessageView>(request);
}

CAMEL_EXPORT uint8_t dpx_PreDecodeTO(PreDecodeRequest *request) {
    return camel::preDecode<camel::Pass::Display>(request);
}

CAMEL_EXPORT int32_t KFE_3gpp_camel_400(KeyFieldRequest *request) {
    using camel::Pass;
    DecodeState *st = request->state;
    camel::g_scratch<Pass::KeyField> = camel::Scratch{};
    const int32_t go = camel::keyFieldPrologue(request);
    if (go < 0)
        return go;
    if (!camel::runGrammar<Pass::KeyField>(st, request))
        return 0;
    request->remainingBits = st->remainingBits;
    return 1;
}
