// -insert_pp_buffers: a buffer behind each top-level input port.
#include <string>
#include <unordered_set>
#include <vector>

#include "Nlw_HostSteps.h"
#include "model/Nlw_NlBuilder.h"
#include "port/Port.h"

namespace {

// name, or name with the first free counter appended, among used; the
// result is added to used.
std::string Unique(std::unordered_set<std::string>& used, const std::string& name) {
    std::string candidate = name;
    for (int k = 1; used.count(candidate); ++k) candidate = name + "_" + std::to_string(k);
    used.insert(candidate);
    return candidate;
}

// The stem of a buffer's names: the port, a bus member "<bus>_<index>".
std::string BufferName(const Nlw_NlPin& port) {
    if (port.GetBus() == nullptr) return port.GetWritableName();
    std::string name = port.GetWritableName();
    const size_t open = name.rfind('[');
    std::string index = name.substr(open + 1, name.size() - open - 2);
    if (!index.empty() && index[0] == '-') index[0] = 'n';
    return std::string(port.GetBus()->GetWritableName()) + "_" + index;
}

}  // namespace

size_t Nlw_InsertPathPulseBuffers(Nlw_NlView& view) {
    Nlw_NlBlock* root = view.GetRootMacro();
    if (root == nullptr) return 0;
    Nlw_NlBuilder b(&view);
    Nlw_NlType* buffer = view.FindType("V_BUF");
    if (buffer == nullptr) {
        buffer = b.AddLibraryType("V_BUF", true, false);
        b.AddTypePin(buffer, "I", NLW_DIR_INPUT);
        b.AddTypePin(buffer, "O", NLW_DIR_OUTPUT);
    }
    std::unordered_set<std::string> used;
    for (const Nlw_NlSignal* s : root->GetSignals()) used.insert(s->GetWritableName());
    for (const Nlw_NlBlock* c : root->GetChildren()) used.insert(c->GetInstanceName());

    size_t inserted = 0;
    std::vector<Nlw_NlPin*> moving;
    for (size_t i = 0; i < root->GetPinCount(); ++i) {
        Nlw_NlPin* port = root->GetPin(i);
        Nlw_NlSignal* net = port->GetChildSignal();
        if (port->GetDirection() != NLW_DIR_INPUT || net == nullptr) continue;
        // The global ports drive the chipwide module, not logic to buffer.
        if (net == view.GetSetReset() || net == view.GetTristate()) continue;
        moving.clear();
        for (Nlw_NlPin* p : net->GetPins())
            if (p != port) moving.push_back(p);
        if (moving.empty()) continue;

        const std::string name = BufferName(*port);
        // The buffered net "<stem>_pp" and the buffer "<stem>_ppbuf".
        Nlw_NlSignal* fed = b.AddSignal(root, Unique(used, name + "_pp").c_str());
        for (Nlw_NlPin* p : moving) {
            if (p->IsParentPin(net))
                b.ConnectChild(p, fed);
            else
                b.Connect(p, fed);
        }
        Nlw_NlBlock* leaf = b.CreateLeaf(root, buffer, Unique(used, name + "_ppbuf").c_str());
        b.Connect(leaf->FindPin("I"), net);
        b.Connect(leaf->FindPin("O"), fed);
        ++inserted;
    }
    if (inserted > 0)
        Port_MsgManData::createObject("NetListWriters")
            .issueInfo("Inserted %zu path pulse buffers (V_BUF) on the top-level inputs.\n",
                       inserted);
    return inserted;
}
