#pragma once

#include <QCoreApplication>
#include <QObject>
#include <QString>

// Resolves a stored object pointer to the class it must have. Null stays null; an object of
// another class throws a QString, so that a scene file naming the wrong class fails loudly at the
// place that resolves it instead of being used as the wrong type.
class RkAssertCast
{
    Q_DECLARE_TR_FUNCTIONS(RkAssertCast)
public:
    static QString failureMessage();

    template <typename T> static T* cast(QObject* object)
    {
        if (!object)
            return nullptr;
        if (QObject* cast = T::staticMetaObject.cast(object))
            return static_cast<T*>(cast);
        throw failureMessage();
    }
};

template <typename T> T* rkAssertCast(QObject* object)
{
    return RkAssertCast::cast<T>(object);
}
