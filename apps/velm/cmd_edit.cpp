// velm edit: a sequence of edits run in order on a sound, saved at the end.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "apps/velm/progress.hpp"
#include "apps/velm/tool.hpp"
#include "core/velmtimeconv.h"
#include "edit/velmedit.h"
#include "edit/velmselection.h"

namespace {

const char kUsage[] =
    "usage: velm edit IN OUT [--format TEXT] OPERATION...\n"
    "operations, run in order:\n"
    "  --select FROM:TO       select FROM .. TO seconds (replacing the selection)\n"
    "  --add-select FROM:TO   add FROM .. TO seconds to the selection\n"
    "  --select-all           select everything\n"
    "  --copy | --cut         keep the selection (cut also removes it)\n"
    "  --paste                put what was kept at the cursor or over the first selection\n"
    "  --clear | --trim       remove the selection | keep only the selection\n"
    "  --silence | --reverse  over the selection, or everything when nothing is selected\n"
    "  --effect SCRIPT        run an effect script over the selection, e.g. \"amplify[db=-6]\"\n"
    "  --remove-dc            take the DC offset away\n"
    "  --append FILE          add FILE at the end\n";

struct Operation {
    std::string name;
    std::string value;
};

struct EditArgs {
    const char *in = nullptr;
    const char *out = nullptr;
    const char *format = "AUTO";
    std::vector<Operation> operations;
};

const char *const kAlone[] = {"--select-all", "--copy", "--cut", "--paste", "--clear",
                              "--trim",       "--silence", "--reverse", "--remove-dc"};
const char *const kWithValue[] = {"--select", "--add-select", "--effect", "--append"};

velmtool::Took take(EditArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    if (option[0] != '-') return velmtool::word_into(args->in ? &args->out : &args->in, option);
    for (const char *name : kAlone)
        if (std::strcmp(option, name) == 0) {
            args->operations.push_back({option, ""});
            return Took::Alone;
        }
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "--format") == 0) {
        args->format = value;
        return velmtool::value_if(*value != '\0');
    }
    for (const char *name : kWithValue)
        if (std::strcmp(option, name) == 0) {
            double from, to;
            const bool range = std::strstr(name, "select") != nullptr;
            if (range && !velmtool::parse_range(value, &from, &to)) return Took::BadValue;
            args->operations.push_back({option, value});
            return velmtool::value_if(*value != '\0');
        }
    return Took::Nothing;
}

// Runs one operation; false with a message on failure.
bool run(VELMAUDIO doc, const Operation &op, AUDIOSIGNAL **kept)
{
    const char *name = op.name.c_str();
    auto replace_kept = [kept](AUDIOSIGNAL *signal) {
        if (!signal) return false;
        AUDIOSIGNAL_Destroy(*kept);
        *kept = signal;
        return true;
    };
    if (op.name == "--select" || op.name == "--add-select") {
        double from = 0, to = 0;
        velmtool::parse_range(op.value.c_str(), &from, &to);
        int64_t begin, end;
        if (!velmtool::sample_range(doc, from, to, &begin, &end)) return false;
        return op.name == "--select" ? VELMAUDIO_SelectAudio(doc, begin, end) : VELMAUDIO_AddSelection(doc, begin, end);
    }
    if (op.name == "--select-all") return VELMAUDIO_SelectAll(doc);
    if (op.name == "--copy") return replace_kept(VELMAUDIO_Copy(doc));
    if (op.name == "--cut") return replace_kept(VELMAUDIO_Cut(doc, nullptr));
    if (op.name == "--paste") return *kept && VELMAUDIO_Paste(doc, *kept, nullptr);
    if (op.name == "--clear") return VELMAUDIO_Clear(doc, nullptr);
    if (op.name == "--trim") return VELMAUDIO_Trim(doc, nullptr);
    if (op.name == "--silence") return VELMAUDIO_Silence(doc, nullptr);
    if (op.name == "--reverse") return VELMAUDIO_Reverse(doc, nullptr);
    if (op.name == "--effect") return VELMAUDIO_TransformSelection(doc, op.value.c_str(), nullptr);
    if (op.name == "--remove-dc") return VELMAUDIO_RemoveDC(doc, nullptr);
    if (op.name == "--append")
        return velmtool::with_progress([&] { return VELMAUDIO_AppendFromFile(doc, op.value.c_str(), "AUTO", nullptr); });
    std::fprintf(stderr, "velm: unknown operation '%s'\n", name);
    return false;
}

} // namespace

namespace velmtool {

int run_edit(int argc, char **argv)
{
    EditArgs args;
    const char *bad = nullptr;
    const auto option = [&args](const char *text, const char *value) { return take(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad) || !args.in || !args.out) return decline(argc, argv, bad, kUsage);
    VELMAUDIO doc = open_input(args.in);
    if (!doc) return 1;
    AUDIOSIGNAL *kept = nullptr;
    bool ok = true;
    for (size_t i = 0; ok && i < args.operations.size(); ++i) {
        const Operation &op = args.operations[i];
        if (!run(doc, op, &kept)) {
            std::fprintf(stderr, "velm: step %zu (%s%s%s) failed; '%s' was not written\n", i + 1, op.name.c_str(),
                         op.value.empty() ? "" : " ", op.value.c_str(), args.out);
            ok = false;
        }
    }
    if (ok && !velmtool::with_progress([&] { return VELMAUDIO_SaveAs(doc, args.out, args.format); })) {
        std::fprintf(stderr, "velm: cannot write '%s' as %s: %s\n", args.out, args.format,
                     velmtool::why(args.out, true, AUDIOSIGNAL_GetLastError()).c_str());
        ok = false;
    }
    AUDIOSIGNAL_Destroy(kept);
    VELMAUDIO_Close(doc);
    return ok ? 0 : 1;
}

} // namespace velmtool
