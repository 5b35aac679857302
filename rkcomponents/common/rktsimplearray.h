#pragma once

#include "memory/rkmemory.h"
#include "rksourcewarning.h"

#include <cstring>
#include <type_traits>

// A growable array of plain values (integers, pointers) kept in host memory. It grows by a fixed
// block, never shrinks, and answers a fault of use with a warning and a safe fallback; only
// indexing an empty array throws, since there is no element to fall back on.
template <typename T> class RkTSimpleArray
{
    static_assert(std::is_trivially_copyable<T>::value, "elements are moved bytewise");

public:
    explicit RkTSimpleArray(int growBlock)
    {
        if (growBlock <= 0) {
            RK_SOURCE_WARNING(QStringLiteral(
                "Invalid block grow size specified in RkTSimpleArray::RkTSimpleArray()"));
            growBlock = 1;
        }
        m_growBlock = growBlock;
    }
    ~RkTSimpleArray() { rkFree(m_data); }

    RkTSimpleArray(const RkTSimpleArray&) = delete;
    RkTSimpleArray& operator=(const RkTSimpleArray&) = delete;

    int count() const { return m_count; }
    int capacity() const { return m_capacity; }
    int growBlock() const { return m_growBlock; }
    const T* data() const { return m_data; }

    int indexOf(const T& value) const
    {
        for (int i = 0; i < m_count; ++i) {
            if (m_data[i] == value)
                return i;
        }
        return -1;
    }

    bool append(const T& value)
    {
        if (m_count == m_capacity && !grow(m_growBlock, true))
            return false;
        m_data[m_count++] = value;
        return true;
    }

    // Adds n elements of storage; without keep the old contents are dropped and the array is
    // empty.
    bool grow(int n, bool keep)
    {
        T* data = static_cast<T*>(rkMalloc(sizeof(T) * std::size_t(m_capacity + n)));
        if (!data)
            return false;
        if (keep && m_data)
            std::memcpy(static_cast<void*>(data), m_data, sizeof(T) * std::size_t(m_count));
        rkFree(m_data);
        m_data = data;
        m_capacity += n;
        if (!keep)
            m_count = 0;
        return true;
    }

    void removeByIndex(int index, int n = 1)
    {
        if (n < 0) {
            RK_SOURCE_WARNING(
                QStringLiteral("Negative count specified in RkTSimpleArray::removeByIndex()"));
            return;
        }
        if (index < 0 || index >= m_count) {
            RK_SOURCE_WARNING(
                QStringLiteral("Index out of range in RkTSimpleArray::removeByIndex()"));
            return;
        }
        if (index + n > m_count) {
            RK_SOURCE_WARNING(QStringLiteral(
                "Too many items specified for remove in RkTSimpleArray::removeByIndex()"));
            n = m_count - index;
        }
        if (n <= 0)
            return;
        std::memmove(static_cast<void*>(m_data + index), m_data + index + n,
                     sizeof(T) * std::size_t(m_count - index - n));
        m_count -= n;
    }

    bool removeValue(const T& value)
    {
        const int index = indexOf(value);
        if (index < 0)
            return false;
        removeByIndex(index, 1);
        return true;
    }

    void clear() { m_count = 0; }

    T& operator[](int index)
    {
        if (index >= 0 && index < m_count)
            return m_data[index];
        static const char* const message = "Illegal array index in RkTSimpleArray::operator[]";
        if (m_count == 0)
            throw message;
        RK_SOURCE_WARNING(QString::fromLatin1(message));
        return m_data[0];
    }
    const T& operator[](int index) const { return const_cast<RkTSimpleArray&>(*this)[index]; }

private:
    int m_count = 0;
    int m_capacity = 0;
    int m_growBlock = 1;
    T* m_data = nullptr;
};
