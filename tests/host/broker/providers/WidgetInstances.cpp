// Widgets as instances: TEST_Widget, and TEST_Gadget, which derives from it. A gadget exists
// once and is called "gadget".
#include "Widgets.h"

namespace widgets {

BrokerPointer broker;
std::mutex mutex;
std::map<std::string, Widget> store;

CMPIStatus statusOf(CMPIrc rc, const char* message) {
    return {rc, message ? CMNewString(broker, message, nullptr) : nullptr};
}

CMPIObjectPath* makePath(const std::string& nameSpace, const std::string& className,
                         const std::string& name) {
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace.c_str(), className.c_str(), nullptr);
    CMAddKey(path, "Name", name.c_str(), CMPI_chars);
    return path;
}

CMPIInstance* makeInstance(const std::string& nameSpace, const std::string& className,
                           const std::string& name, const Widget& widget, const char** properties) {
    const char* keys[] = {"Name", nullptr};
    CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace.c_str(), className.c_str(), nullptr);
    CMPIInstance* instance = CMNewInstance(broker, path, nullptr);
    CMSetPropertyFilter(instance, properties, keys);
    CMSetProperty(instance, "Name", name.c_str(), CMPI_chars);
    CMSetProperty(instance, "Color", widget.color.c_str(), CMPI_chars);
    CMSetProperty(instance, "Size", &widget.size, CMPI_uint32);
    return instance;
}

} // namespace widgets

namespace {

using namespace widgets;

std::string nameSpaceOf(const CMPIObjectPath* op) { return textOf(CMGetNameSpace(op, nullptr)); }
std::string keyOf(const CMPIObjectPath* op) { return textOf(CMGetKey(op, "Name", nullptr)); }

// Asks once more for its own instances, which nobody can answer any longer.
CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext* ctx, CMPIBoolean terminating) {
    CMPIStatus st = {};
    const CMPIObjectPath* own = CMNewObjectPath(broker, "root/test", "TEST_Widget", nullptr);
    CBEnumInstanceNames(broker, ctx, own, &st);
    CMLogMessage(broker, CMPI_SEV_INFO, "last words", textOf(st.msg).c_str(), nullptr);
    CMLogMessage(broker, CMPI_SEV_INFO, "cleanup",
                 terminating ? "Widget terminating" : "Widget idle", nullptr);
    store.clear();
    CMReturn(CMPI_RC_OK);
}

CMPIStatus enumerateNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* rslt,
                          const CMPIObjectPath* op) {
    const std::lock_guard lock(mutex);
    for (const auto& entry : store) {
        CMReturnObjectPath(rslt, makePath(nameSpaceOf(op), "TEST_Widget", entry.first));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* rslt,
                     const CMPIObjectPath* op, const char** properties) {
    const std::lock_guard lock(mutex);
    for (const auto& [name, widget] : store) {
        const CMPIStatus status = CMReturnInstance(
            rslt, makeInstance(nameSpaceOf(op), "TEST_Widget", name, widget, properties));
        if (status.rc == CMPI_RC_ERR_INVALID_HANDLE) {
            CMReturn(CMPI_RC_ERR_FAILED); // the client has gone away
        }
        if (widget.color == "broken") {
            return statusOf(CMPI_RC_ERR_FAILED, "a broken widget\nin the store");
        }
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus get(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* rslt,
               const CMPIObjectPath* op, const char** properties) {
    const std::lock_guard lock(mutex);
    const auto found = store.find(keyOf(op));
    if (found != store.end()) {
        CMReturnInstance(rslt, makeInstance(nameSpaceOf(op), "TEST_Widget", found->first,
                                            found->second, properties));
    }
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

void take(Widget& widget, const CMPIInstance* inst) {
    CMPIStatus st = {};
    const CMPIData color = CMGetProperty(inst, "Color", &st);
    if (st.rc == CMPI_RC_OK) {
        widget.color = textOf(color);
    }
    const CMPIData size = CMGetProperty(inst, "Size", &st);
    if (st.rc == CMPI_RC_OK) {
        widget.size = size.value.uint32;
    }
}

CMPIStatus create(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* rslt,
                  const CMPIObjectPath* op, const CMPIInstance* inst) {
    const std::lock_guard lock(mutex);
    const std::string name = textOf(CMGetProperty(inst, "Name", nullptr));
    if (store.count(name) != 0) {
        return statusOf(CMPI_RC_ERR_ALREADY_EXISTS, nullptr);
    }
    take(store[name], inst);
    CMReturnObjectPath(rslt, makePath(nameSpaceOf(op), "TEST_Widget", name));
    CMReturnDone(rslt);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus modify(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* op,
                  const CMPIInstance* inst, const char**) {
    const std::lock_guard lock(mutex);
    const auto found = store.find(keyOf(op));
    if (found == store.end()) {
        return statusOf(CMPI_RC_ERR_NOT_FOUND, "no such widget");
    }
    take(found->second, inst);
    CMReturn(CMPI_RC_OK);
}

CMPIStatus remove(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                  const CMPIObjectPath* op) {
    const std::lock_guard lock(mutex);
    return {store.erase(keyOf(op)) == 1 ? CMPI_RC_OK : CMPI_RC_ERR_NOT_FOUND, nullptr};
}

CMPIStatus query(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* rslt,
                 const CMPIObjectPath* op, const char* text, const char* language) {
    if (!language || std::string(language) != "WQL") {
        CMReturn(CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED);
    }
    if (!text || std::string(text) != "SELECT * FROM TEST_Widget") {
        CMReturn(CMPI_RC_ERR_INVALID_QUERY);
    }
    return enumerate(nullptr, nullptr, rslt, op, nullptr);
}

const CMPIInstanceMIFT widgetTable = {CMPIVersion200, 1,         "Widget", cleanup,
                                      enumerateNames, enumerate, get,      create,
                                      modify,         remove,    query};

CMPIStatus gadgetCleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
    CMReturn(CMPI_RC_NEVER_UNLOAD);
}

CMPIStatus gadgetNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* rslt,
                       const CMPIObjectPath* op) {
    CMReturnObjectPath(rslt,
                       makePath(nameSpaceOf(op), textOf(CMGetClassName(op, nullptr)), "gadget"));
    CMReturn(CMPI_RC_OK); // forgets that it is done
}

CMPIStatus gadgetNothing(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*,
                         const CMPIObjectPath*, const char**) {
    CMReturn(CMPI_RC_ERR_NOT_FOUND); // an old way to say that there are none
}

// Many slots are left empty.
const CMPIInstanceMIFT gadgetTable = {CMPIVersion200, 1,       "Gadget", gadgetCleanup, gadgetNames,
                                      gadgetNothing,  nullptr, nullptr,  nullptr,       nullptr,
                                      nullptr};

} // namespace

CMPI_EXTERN_C CMPIInstanceMI* Widget_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext* ctx,
                                                       CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &widgetTable};
    broker = mb;
    store = {{"one", {"red", 1}}, {"two", {"blue", 2}}};
    const std::string where = "init " + textOf(CMGetContextEntry(ctx, CMPIInitNameSpace, nullptr));
    CMLogMessage(mb, CMPI_SEV_INFO, "create", where.c_str(), nullptr);
    return &mi;
}

CMPI_EXTERN_C CMPIInstanceMI* Gadget_Create_InstanceMI(const CMPIBroker* mb, const CMPIContext*,
                                                       CMPIStatus*) {
    static CMPIInstanceMI mi = {nullptr, &gadgetTable};
    broker = mb;
    return &mi;
}
