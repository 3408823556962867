#ifndef GRX_GRXMEMBERS_H
#define GRX_GRXMEMBERS_H

// The typed names of the object model, each a thin inline call into the generic core of
// GrxBaseElement. A class lists its element name, children, attributes and references with these.

#include <grx/GrxBaseElement.h>

// A concrete wrapper class of element `Name`.
#define GRX_ELEMENT(Base, Name)                                                                              \
public:                                                                                                      \
    using Base::Base;                                                                                        \
    static const XMLCh* getElementName() {                                                                   \
        return Name;                                                                                         \
    }

// An abstract kind shared by several element classes.
#define GRX_KIND(Base)                                                                                       \
public:                                                                                                      \
    using Base::Base;

// A list of children: getXs, addX, removeXs (the plural is always the name plus "s").
#define GRX_LIST(X, T)                                                                                       \
    std::vector<T*> get##X##s() const {                                                                      \
        return children<T>();                                                                                \
    }                                                                                                        \
    T& add##X() {                                                                                            \
        return add<T>();                                                                                     \
    }                                                                                                        \
    void remove##X##s() {                                                                                    \
        removeAll<T>();                                                                                      \
    }

// One child: getX (first such child, or null), addX, removeXs.
#define GRX_ONE(X, T)                                                                                        \
    T* get##X() const {                                                                                      \
        return first<T>();                                                                                   \
    }                                                                                                        \
    T& add##X() {                                                                                            \
        return add<T>();                                                                                     \
    }                                                                                                        \
    void remove##X##s() {                                                                                    \
        removeAll<T>();                                                                                      \
    }

#define GRX_PRESENCE(X, A)                                                                                   \
    bool is##X##Present() const {                                                                            \
        return isAttributePresent(A);                                                                        \
    }                                                                                                        \
    void remove##X() {                                                                                       \
        removeAttribute(A);                                                                                  \
    }

#define GRX_TEXT(X, A)                                                                                       \
    const XMLCh* get##X() const {                                                                            \
        return GetAttribute(A);                                                                              \
    }                                                                                                        \
    void set##X(const XMLCh* v) {                                                                            \
        SetAttribute(A, v);                                                                                  \
    }                                                                                                        \
    void set##X(const ChartString& v) {                                                                      \
        SetAttribute(A, v.xc_str());                                                                         \
    }                                                                                                        \
    GRX_PRESENCE(X, A)

#define GRX_BOOL(X, A, ABSENT)                                                                               \
    bool get##X() const {                                                                                    \
        return getBool(A, ABSENT);                                                                           \
    }                                                                                                        \
    void set##X(bool v) {                                                                                    \
        setBool(A, v);                                                                                       \
    }                                                                                                        \
    GRX_PRESENCE(X, A)

#define GRX_INT(X, A, ABSENT)                                                                                \
    int get##X() const {                                                                                     \
        return getInt(A, ABSENT);                                                                            \
    }                                                                                                        \
    void set##X(int v) {                                                                                     \
        setInt(A, v);                                                                                        \
    }                                                                                                        \
    GRX_PRESENCE(X, A)

#define GRX_DOUBLE(X, A, ABSENT)                                                                             \
    double get##X() const {                                                                                  \
        return getDouble(A, ABSENT);                                                                         \
    }                                                                                                        \
    void set##X(double v) {                                                                                  \
        setDouble(A, v);                                                                                     \
    }                                                                                                        \
    GRX_PRESENCE(X, A)

#define GRX_ENUM(X, A, TABLE, ABSENT)                                                                        \
    int get##X() const {                                                                                     \
        return getEnum(A, TABLE, ABSENT);                                                                    \
    }                                                                                                        \
    void set##X(int v) {                                                                                     \
        setEnum(A, TABLE, v);                                                                                \
    }                                                                                                        \
    GRX_PRESENCE(X, A)

// A reference by id to another object of class T.
#define GRX_REF(X, A, T)                                                                                     \
    T* get##X() const {                                                                                      \
        return ref<T>(A);                                                                                    \
    }                                                                                                        \
    void set##X(T& target) {                                                                                 \
        setReference(A, asBase(target));                                                                     \
    }                                                                                                        \
    GRX_PRESENCE(X, A)

#endif
