#include "rkscriptsurface.h"

#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "rkimportrunner.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"
#include "undo/rkundostackhold.h"

#include <QEventLoop>
#include <QPointer>
#include <QScriptContext>
#include <QScriptEngine>
#include <QScriptable>
#include <QTimer>

#include <climits>
#include <cmath>

namespace
{

// Adaptors belong to the engine's garbage collector. Only what they declare themselves is
// visible: a script cannot delete an adaptor or reach QObject's members through it.
QScriptValue wrap(QScriptEngine* engine, QObject* adaptor)
{
    return engine->newQObject(adaptor, QScriptEngine::ScriptOwnership,
                              QScriptEngine::ExcludeSuperClassContents |
                                  QScriptEngine::ExcludeDeleteLater |
                                  QScriptEngine::ExcludeChildObjects);
}

RkNode* findSceneNode(const QString& nameOrLabel)
{
    if (!rkScene)
        return nullptr;
    if (RkNode* node = rkScene->findNode(nameOrLabel))
        return node;
    for (RkNode* node : rkScene->getNodes()) {
        if (node->getLabel() == nameOrLabel)
            return node;
    }
    return nullptr;
}

class RkScriptProperty : public QObject
{
    Q_OBJECT
    Q_PROPERTY(QVariant name READ name)
    Q_PROPERTY(QVariant label READ label)
    Q_PROPERTY(QVariant value READ value WRITE setValue)
    Q_PROPERTY(QVariant min READ min)
    Q_PROPERTY(QVariant max READ max)
    Q_PROPERTY(QVariant hidden READ hidden)
public:
    explicit RkScriptProperty(RkProperty* property) : m_property(property) {}

    QVariant name() const { return m_property ? QVariant(m_property->getName()) : QVariant(); }
    QVariant label() const { return m_property ? QVariant(m_property->getLabel()) : QVariant(); }
    QVariant hidden() const { return m_property ? QVariant(m_property->isHidden()) : QVariant(); }

    QVariant value() const
    {
        if (auto* f = qobject_cast<RkFloatProperty*>(m_property))
            return double(f->getValue());
        return m_property ? m_property->getValueVariant() : QVariant();
    }

    QVariant min() const
    {
        if (auto* f = qobject_cast<RkFloatProperty*>(m_property))
            return double(f->getMin());
        if (auto* i = qobject_cast<RkIntProperty*>(m_property))
            return i->getMin();
        return QVariant();
    }

    QVariant max() const
    {
        if (auto* f = qobject_cast<RkFloatProperty*>(m_property))
            return double(f->getMax());
        if (auto* i = qobject_cast<RkIntProperty*>(m_property))
            return i->getMax();
        return QVariant();
    }

    // The setter a user's edit goes through, so a clamped property keeps its limits and a value
    // the property refuses leaves no undo entry.
    void setValue(const QVariant& value)
    {
        if (!m_property)
            return;
        RkUndoStackHold hold;
        bool ok = false;
        const double number = value.toDouble(&ok);
        if (auto* f = qobject_cast<RkFloatProperty*>(m_property)) {
            if (ok)
                f->adjustValue(float(number));
        } else if (auto* i = qobject_cast<RkIntProperty*>(m_property)) {
            if (ok && std::isfinite(number))
                i->adjustValue(int(qBound(double(INT_MIN), std::round(number), double(INT_MAX))));
        } else if (auto* b = qobject_cast<RkBoolProperty*>(m_property)) {
            b->setValue(value.toBool());
        }
        // The label is read after the change: a property may be gone by now.
        hold.accept(m_property ? m_property->getLabel() : QString());
    }

private:
    QPointer<RkProperty> m_property;
};

class RkScriptNode : public QObject, protected QScriptable
{
    Q_OBJECT
    Q_PROPERTY(QVariant name READ name)
    Q_PROPERTY(QVariant label READ label)
public:
    explicit RkScriptNode(RkNode* node) : m_node(node) {}

    RkNode* node() const { return m_node; }
    QVariant name() const { return m_node ? QVariant(m_node->getName()) : QVariant(); }
    QVariant label() const { return m_node ? QVariant(m_node->getLabel()) : QVariant(); }

    // By name first, then by label; null when the node has no such property.
    Q_INVOKABLE QScriptValue findProperty(const QString& nameOrLabel) const
    {
        if (!m_node)
            return QScriptValue();
        RkProperty* found = m_node->findProperty(nameOrLabel);
        if (!found) {
            for (RkProperty* property : m_node->getProperties()) {
                if (property->getLabel() == nameOrLabel) {
                    found = property;
                    break;
                }
            }
        }
        return found ? wrap(engine(), new RkScriptProperty(found)) : engine()->nullValue();
    }

private:
    QPointer<RkNode> m_node;
};

QScriptValue wrapNode(QScriptEngine* engine, RkNode* node)
{
    return node ? wrap(engine, new RkScriptNode(node)) : engine->nullValue();
}

class RkScriptScene : public QObject, protected QScriptable
{
    Q_OBJECT
    // The reason the last load or save failed; empty after one that worked.
    Q_PROPERTY(QString lastError READ lastError)
public:
    QString lastError() const { return m_lastError; }

    Q_INVOKABLE int getNumNodes() const { return rkScene ? rkScene->getNumNodes() : 0; }

    Q_INVOKABLE QScriptValue getNode(int index) const
    {
        const bool inRange = rkScene && index >= 0 && index < rkScene->getNumNodes();
        return wrapNode(engine(), inRange ? rkScene->getNode(index) : nullptr);
    }

    Q_INVOKABLE QScriptValue findNode(const QString& nameOrLabel) const
    {
        return wrapNode(engine(), findSceneNode(nameOrLabel));
    }

    // Takes a node or its name or label; false when there is no such node.
    Q_INVOKABLE bool selectNode(const QScriptValue& nameOrNode, bool add = false)
    {
        RkNode* node = nullptr;
        if (auto* adaptor = qobject_cast<RkScriptNode*>(nameOrNode.toQObject()))
            node = adaptor->node();
        else if (nameOrNode.isString())
            node = findSceneNode(nameOrNode.toString());
        if (!node || !rkScene || !rkScene->contains(node))
            return false;
        rkScene->selectNode(node, add);
        return true;
    }

    Q_INVOKABLE void clearSelection()
    {
        if (rkScene)
            rkScene->clearSelection();
    }

    Q_INVOKABLE QScriptValue getPrimarySelection() const
    {
        return wrapNode(engine(), rkScene ? rkScene->getPrimarySelection() : nullptr);
    }

    Q_INVOKABLE bool load(const QString& path)
    {
        m_lastError.clear();
        return rkScene && rkScene->load(path, &m_lastError);
    }

    // Imports a model file as a new node, selected and framed.
    Q_INVOKABLE bool importFile(const QString& path)
    {
        m_lastError.clear();
        return rkScene && RkImportRunner::importIntoScene(path, nullptr, &m_lastError);
    }
    Q_INVOKABLE bool save(const QString& path)
    {
        m_lastError.clear();
        return rkScene && rkScene->save(path, &m_lastError);
    }

private:
    QString m_lastError;
};

class RkScriptUndoStack : public QObject
{
    Q_OBJECT
public:
    Q_INVOKABLE void undo()
    {
        if (rkUndoStack)
            rkUndoStack->undo();
    }
    Q_INVOKABLE void redo()
    {
        if (rkUndoStack)
            rkUndoStack->redo();
    }
    Q_INVOKABLE QString getUndoCaption() const
    {
        return rkUndoStack ? rkUndoStack->getUndoCaption() : QString();
    }
    Q_INVOKABLE int count() const { return rkUndoStack ? rkUndoStack->count() : 0; }
};

// wait(ms): the quitting timer is queued behind timers started before it, so a pane's zero timer
// has run when wait(0) returns.
QScriptValue scriptWait(QScriptContext* context, QScriptEngine* engine)
{
    QEventLoop loop;
    QTimer timer;
    timer.setSingleShot(true);
    QObject::connect(&timer, &QTimer::timeout, &loop, &QEventLoop::quit);
    timer.start(qMax(0, context->argument(0).toInt32()));
    loop.exec();
    return engine->undefinedValue();
}

} // namespace

void rkInstallScriptSurface(QScriptEngine* engine)
{
    QScriptValue global = engine->globalObject();
    global.setProperty(QStringLiteral("scene"), wrap(engine, new RkScriptScene));
    global.setProperty(QStringLiteral("undoStack"), wrap(engine, new RkScriptUndoStack));
    global.setProperty(QStringLiteral("wait"), engine->newFunction(scriptWait, 1));
}

#include "rkscriptsurface.moc"
