// Thin wrappers over the function tables of the object manager.
//
// Every call goes through its slot, and every status is preset: some brokers leave it untouched. A
// wrapper answers null, or a bad status, for a null object. What a call returns belongs to the
// broker until the MI function ends, unless release gives it back earlier: all that is made here
// while a request is answered is given back as soon as it was handed over, so that a large answer
// holds no more than a small one. What an object contains (the value of a property or a key, an
// element) goes with it, and is never given back alone: some brokers would free it twice.
#ifndef CIMPLE_CMPI_CALL_H
#define CIMPLE_CMPI_CALL_H

#include "cimple/string.h"
#include "cmpi/cmpi.h"

namespace cimple::cmpi {

inline constexpr CMPIStatus GOOD_STATUS = {CMPI_RC_OK, nullptr};
inline constexpr CMPIStatus FAILED_STATUS = {CMPI_RC_ERR_FAILED, nullptr};

// A value is usable when none of the bits null, not found and bad is set.
inline constexpr CMPIValueState UNUSABLE = CMPI_nullValue | CMPI_notFound | CMPI_badValue;

inline bool good(CMPIStatus status) {
    return status.rc == CMPI_RC_OK;
}

// Gives an object back before the end of the MI function. Never for parameters of one.
template <class Object>
void release(Object* object) {
    if (object)
        object->ft->release(object);
}

// An object of ours that is given back at the end of the scope.
template <class Object>
class Scoped {
public:
    explicit Scoped(Object* object = nullptr) noexcept : _object(object) {}
    ~Scoped() { release(_object); }
    Scoped(const Scoped&) = delete;
    Scoped& operator=(const Scoped&) = delete;

    Object* get() const noexcept { return _object; }
    Object*& out() noexcept { return _object; } // for a function that makes the object
    explicit operator bool() const noexcept { return _object != nullptr; }
    Object* keep() noexcept { // hands the object to the caller
        Object* object = _object;
        _object = nullptr;
        return object;
    }

private:
    Object* _object;
};

// The status of an up-call. Its text passes to the caller, and is given back with it.
class Status {
public:
    Status() noexcept : _status(GOOD_STATUS) {}
    explicit Status(CMPIStatus status) noexcept : _status(status) {}
    ~Status() { release(_status.msg); }
    Status(const Status&) = delete;
    Status& operator=(const Status&) = delete;

    CMPIStatus* out() noexcept { return &_status; }
    int rc() const noexcept { return _status.rc; }
    explicit operator bool() const noexcept { return good(_status); }

private:
    CMPIStatus _status;
};

// Gives back an object in a value that was handed over; other values are none.
inline void release(const CMPIValue& value, CMPIType type) {
    if (type & CMPI_ARRAY)
        release(value.array);
    else if (type == CMPI_string)
        release(value.string);
    else if (type == CMPI_dateTime)
        release(value.dateTime);
    else if (type == CMPI_ref)
        release(value.ref);
    else if (type == CMPI_instance)
        release(value.inst);
}

// ---- Strings ----

// The text of a string object, with its life; null on failure.
inline const char* chars(const CMPIString* string) {
    if (!string || !string->ft)
        return nullptr;
    CMPIStatus status = GOOD_STATUS;
    const char* text = string->ft->getCharPtr(string, &status);
    return good(status) ? text : nullptr;
}

// The text of a string object that is given back, "" on failure. Throws std::bad_alloc.
inline String take_text(CMPIString* string, CMPIStatus status) {
    const Scoped<CMPIString> owner(string);
    const char* text = good(status) ? chars(string) : nullptr;
    return text ? String(text) : String();
}

inline CMPIString* new_string(const CMPIBroker* broker, const char* text) {
    CMPIStatus status = GOOD_STATUS;
    CMPIString* string = broker->eft->newString(broker, text, &status);
    return good(status) ? string : nullptr;
}

// ---- Dates ----

inline CMPIDateTime* new_datetime(const CMPIBroker* broker, const char* cim_text) {
    CMPIStatus status = GOOD_STATUS;
    CMPIDateTime* datetime = broker->eft->newDateTimeFromChars(broker, cim_text, &status);
    return good(status) ? datetime : nullptr;
}

inline CMPIString* string_format(const CMPIDateTime* datetime) {
    if (!datetime)
        return nullptr;
    CMPIStatus status = GOOD_STATUS;
    CMPIString* string = datetime->ft->getStringFormat(datetime, &status);
    return good(status) ? string : nullptr;
}

// ---- Arrays ----

inline CMPIArray* new_array(const CMPIBroker* broker, CMPICount size, CMPIType element_type) {
    CMPIStatus status = GOOD_STATUS;
    CMPIArray* array = broker->eft->newArray(broker, size, element_type, &status);
    return good(status) ? array : nullptr;
}

inline bool set_element(CMPIArray* array, CMPICount index, const CMPIValue& value, CMPIType type) {
    return good(array->ft->setElementAt(array, index, &value, type));
}

inline bool array_size(const CMPIArray* array, CMPICount& size) {
    if (!array)
        return false;
    CMPIStatus status = GOOD_STATUS;
    size = array->ft->getSize(array, &status);
    return good(status);
}

inline bool get_element(const CMPIArray* array, CMPICount index, CMPIData& data) {
    CMPIStatus status = GOOD_STATUS;
    data = array->ft->getElementAt(array, index, &status);
    return good(status);
}

// ---- Object paths ----

inline CMPIObjectPath* new_path(const CMPIBroker* broker, const char* name_space,
                                const char* class_name) {
    CMPIStatus status = GOOD_STATUS;
    CMPIObjectPath* path = broker->eft->newObjectPath(broker, name_space, class_name, &status);
    return good(status) ? path : nullptr;
}

// The class of a path, "" if it cannot be told.
inline String class_name(const CMPIObjectPath* path) {
    if (!path)
        return {};
    CMPIStatus status = GOOD_STATUS;
    CMPIString* name = path->ft->getClassName(path, &status);
    return take_text(name, status);
}

// The namespace of a path, "" if it has none.
inline String name_space(const CMPIObjectPath* path) {
    if (!path)
        return {};
    CMPIStatus status = GOOD_STATUS;
    CMPIString* name = path->ft->getNameSpace(path, &status);
    return take_text(name, status);
}

// ---- Instances ----

inline CMPIInstance* new_instance(const CMPIBroker* broker, const CMPIObjectPath* path) {
    CMPIStatus status = GOOD_STATUS;
    CMPIInstance* instance = broker->eft->newInstance(broker, path, &status);
    return good(status) ? instance : nullptr;
}

inline CMPIObjectPath* object_path(const CMPIInstance* instance) {
    CMPIStatus status = GOOD_STATUS;
    CMPIObjectPath* path = instance->ft->getObjectPath(instance, &status);
    return good(status) ? path : nullptr;
}

// ---- Arguments ----

inline CMPIArgs* new_args(const CMPIBroker* broker) {
    CMPIStatus status = GOOD_STATUS;
    CMPIArgs* args = broker->eft->newArgs(broker, &status);
    return good(status) ? args : nullptr;
}

// ---- Results ----

inline void return_path(const CMPIResult* result, const CMPIObjectPath* path) {
    if (result)
        result->ft->returnObjectPath(result, path);
}

inline void return_instance(const CMPIResult* result, const CMPIInstance* instance) {
    if (result)
        result->ft->returnInstance(result, instance);
}

inline void return_data(const CMPIResult* result, const CMPIValue& value, CMPIType type) {
    if (result)
        result->ft->returnData(result, &value, type);
}

inline void return_done(const CMPIResult* result) {
    if (result)
        result->ft->returnDone(result);
}

// ---- Enumerations ----

inline bool has_next(const CMPIEnumeration* enumeration) {
    CMPIStatus status = GOOD_STATUS;
    return enumeration->ft->hasNext(enumeration, &status) && good(status);
}

inline CMPIData get_next(const CMPIEnumeration* enumeration, CMPIStatus& status) {
    status = GOOD_STATUS;
    return enumeration->ft->getNext(enumeration, &status);
}

} // namespace cimple::cmpi

#endif // CIMPLE_CMPI_CALL_H
