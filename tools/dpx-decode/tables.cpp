// Reading and printing the module's description tables.
#include "tables.h"

#include <nlohmann/json.hpp>

#include <cstring>
#include <ostream>
#include <vector>

namespace dpxdecode {
namespace {

std::vector<std::string> g_labels; // by field id

template <typename T>
const T *served(uint32_t (*get)(int32_t, const void **), int32_t index) {
    const void *out = nullptr;
    return get != nullptr && get(index, &out) == 0 ? static_cast<const T *>(out) : nullptr;
}

// The catalogue's entries before its terminator.
size_t catalogueSize(const CatalogueEntry *c) {
    size_t n = 0;
    while (c[n].packed != DPX_CATALOGUE_END)
        ++n;
    return n;
}

std::string hexOf(const uint8_t *bytes, size_t n) {
    static const char digits[] = "0123456789abcdef";
    std::string out;
    out.reserve(2 * n);
    for (size_t i = 0; i < n; ++i) {
        out += digits[bytes[i] >> 4];
        out += digits[bytes[i] & 15];
    }
    return out;
}

nlohmann::ordered_json text(const char *s) { return s != nullptr ? nlohmann::ordered_json(s) : nlohmann::ordered_json(nullptr); }

// The 25 members of the protocol description record, texts as strings and
// numbers as numbers.
nlohmann::ordered_json description(const ProtocolDescription &d) {
    return nlohmann::ordered_json::array({text(d.organisation), text(d.shortName), text(d.longName),
                                  text(d.release), text(d.network), text(d.remark), text(d.text7),
                                  text(d.fileName), text(d.text9), text(d.generator),
                                  text(d.generatorCopy), text(d.selectorValue),
                                  text(d.selectorKind), text(d.standard), text(d.text15),
                                  text(d.text16), d.number17, d.number18, d.number19,
                                  text(d.shortNameCopy), text(d.fileNameCopy), d.number22,
                                  d.number23, d.number24, d.number25});
}

std::string prototype(const uint8_t *block) {
    PrototypeHeader h;
    std::memcpy(&h, block, sizeof h);
    return hexOf(block, h.blockSize);
}

} // namespace

bool loadCatalogue(const Module &module) {
    const auto *c = served<CatalogueEntry>(module.getTable, DPX_TABLE_CATALOGUE);
    if (c == nullptr)
        return false;
    const size_t n = catalogueSize(c);
    g_labels.clear();
    for (size_t i = 0; i < n; ++i) {
        if (c[i].fieldId >= g_labels.size())
            g_labels.resize(c[i].fieldId + 1);
        g_labels[c[i].fieldId] = c[i].label != nullptr ? c[i].label : "";
    }
    return true;
}

const std::string &catalogueLabel(uint32_t id) {
    static const std::string none;
    return id < g_labels.size() ? g_labels[id] : none;
}

bool writeTables(std::ostream &os, const Module &module) {
    const auto *version = served<char>(module.getTable, DPX_TABLE_VERSION);
    const auto *header = served<uint32_t>(module.getPtr, DPX_TABLE_DESCRIPTION);
    const auto *record = served<ProtocolDescription>(module.getTable, DPX_TABLE_DESCRIPTION);
    const auto *catalogue = served<CatalogueEntry>(module.getTable, DPX_TABLE_CATALOGUE);
    const auto *values = served<ValueEntry>(module.getTable, DPX_TABLE_VALUES);
    const auto *codes = served<uint32_t>(module.getTable, DPX_TABLE_CODES);
    const auto *strings = served<const char *>(module.getTable, DPX_TABLE_STRINGS);
    const auto *attributes = served<uint8_t>(module.getTable, DPX_TABLE_ATTRIBUTES);
    const auto *blockA = served<uint8_t>(module.getPtr, DPX_TABLE_PROTOTYPE_A);
    const auto *blockB = served<uint8_t>(module.getPtr, DPX_TABLE_PROTOTYPE_B);
    if (version == nullptr || header == nullptr || record == nullptr || catalogue == nullptr ||
        values == nullptr || codes == nullptr || strings == nullptr || attributes == nullptr ||
        blockA == nullptr || blockB == nullptr)
        return false;

    nlohmann::ordered_json out;
    out["version"] = version;
    out["header"] = {header[0], header[1], header[2], header[3]};
    out["description"] = description(*record);

    // The string table ends with its final text; the code list is as long
    // as the value table's references reach.
    size_t stringCount = 0;
    while (std::strcmp(strings[stringCount], DPX_FINAL_STRING) != 0)
        ++stringCount;
    ++stringCount;
    size_t valueCount = 0, codeCount = 0;
    const ValueEntry zero{};
    for (; std::memcmp(&values[valueCount], &zero, sizeof zero) != 0; ++valueCount)
        codeCount = std::max<size_t>(codeCount, values[valueCount].codeIndex + 1);

    nlohmann::ordered_json &entries = out["catalogue"] = nlohmann::ordered_json::array();
    for (size_t i = 0, n = catalogueSize(catalogue); i < n; ++i) {
        const CatalogueEntry &e = catalogue[i];
        entries.push_back({{"id", e.fieldId},
                           {"label", text(e.label)},
                           {"class", DPX_CATALOGUE_CLASS(e.packed)},
                           {"variant", DPX_CATALOGUE_VARIANT(e.packed)},
                           {"keyFlag", DPX_CATALOGUE_KEY_FLAG(e.packed)},
                           {"group", DPX_CATALOGUE_GROUP(e.packed)},
                           {"key", e.keyNumber},
                           {"valueCount", e.valueCount},
                           {"firstValue", e.firstValue == 0xFFFFFFFFu ? nlohmann::ordered_json(nullptr)
                                                                      : nlohmann::ordered_json(e.firstValue)},
                           {"width", e.width == 0xFFFFFFFFu ? nlohmann::ordered_json(nullptr)
                                                            : nlohmann::ordered_json(e.width & 0xFFFFu)},
                           {"format", e.formatIndex < stringCount ? text(strings[e.formatIndex])
                                                                  : nlohmann::ordered_json(nullptr)},
                           {"attributes", e.attributeOffset}});
    }
    nlohmann::ordered_json &valueList = out["values"] = nlohmann::ordered_json::array();
    for (size_t v = 0; v < valueCount; ++v) {
        const ValueEntry &e = values[v];
        valueList.push_back({{"kind", e.kind},
                             {"codeIndex", e.codeIndex},
                             {"stringIndex", e.stringIndex},
                             {"code", codes[e.codeIndex]},
                             {"text", e.stringIndex < stringCount ? text(strings[e.stringIndex])
                                                                  : nlohmann::ordered_json(nullptr)}});
    }
    out["codes"] = std::vector<uint32_t>(codes, codes + codeCount);
    nlohmann::ordered_json &stringList = out["strings"] = nlohmann::ordered_json::array();
    for (size_t s = 0; s < stringCount; ++s)
        stringList.push_back(text(strings[s]));
    out["attributes"] = hexOf(attributes, DPX_ATTRIBUTE_TABLE_SIZE);
    out["prototypeA"] = prototype(blockA);
    out["prototypeB"] = prototype(blockB);
    os << out.dump(-1, ' ', false, nlohmann::ordered_json::error_handler_t::replace) << '\n';
    return true;
}

} // namespace dpxdecode
