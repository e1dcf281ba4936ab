// -gp and -tp: the global set/reset and tristate nets as top-level ports.
#include "Nlw_HostSteps.h"
#include "model/Nlw_NlBuilder.h"
#include "port/Port.h"

bool Nlw_AddGlobalPort(Nlw_NlView& view, const char* portName, bool setReset) {
    Nlw_NlBlock* root = view.GetRootMacro();
    const char* option = setReset ? "-gp" : "-tp";
    if (root == nullptr || portName == nullptr || *portName == '\0') return true;
    Port_MsgManData msg = Port_MsgManData::createObject("NetListWriters");
    if (root->FindPin(portName) != nullptr) {
        msg.issueError("Option '%s': the top module already has a port named '%s'.\n", option,
                       portName);
        return false;
    }
    Nlw_NlBuilder b(&view);
    Nlw_NlSignal* net = setReset ? view.GetSetReset() : view.GetTristate();
    // A marked net that something in the design drives keeps its driver;
    // the port then drives the chipwide module alone.
    if (net != nullptr && (net->GetParent() != root || net->FindDriverPin() != nullptr)) {
        msg.issueWarning(
            "Option '%s': the net '%s' marked as the global %s is driven inside the design and "
            "stays so; the port '%s' drives the chipwide module only.\n",
            option, net->GetWritableName(), setReset ? "set/reset" : "tristate", portName);
        net = nullptr;
    }
    Nlw_NlPin* port = b.AddPort(root, portName, NLW_DIR_INPUT);
    if (net == nullptr) {
        net = b.AddSignal(root, portName);
        if (setReset)
            b.SetSetReset(net);
        else
            b.SetTristate(net);
    }
    b.ConnectChild(port, net);
    b.SetRefPin(net, port);
    // Value 2: the global is driven through the top-level port the signal
    // refers to, so the test fixture drives that port.
    net->AddProperty(Vdm_Property::NewInt(setReset ? "NLW_SETRESET_CONN" : "NLW_TRISTATE_CONN", 2));
    Nlw_NlNetwork* network = b.GetOrCreateNetwork(net);
    if (network->GetPropertyByName("VL_FLOATVAL") == nullptr)
        network->AddProperty(Vdm_Property::NewInt("VL_FLOATVAL", 0));
    net->AddProperty(Vdm_Property::NewString("NLW_CHIPWIDE_NET", setReset ? "GSR" : "GTS"));
    return true;
}
